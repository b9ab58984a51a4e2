// Ranges are kept as they are written and the narrowest that holds a number wins: an entry ".." for
// all that is not listed may stand anywhere in the list.
#include "host/mof/ValueMap.h"

#include <limits>
#include <stdexcept>

#include "host/mof/MofLexer.h"

namespace cmpihost {

namespace {

constexpr std::int64_t least = std::numeric_limits<std::int64_t>::min();
constexpr std::int64_t most = std::numeric_limits<std::int64_t>::max();

std::int64_t bound(const std::string& written, std::int64_t whenOpen) {
    if (written.empty()) return whenOpen;
    mof::Scalar value;
    std::string complaint;
    if (mof::parseNumber(written, value, complaint)) {
        if (const auto* number = std::get_if<std::int64_t>(&value)) return *number;
        const auto* number = std::get_if<std::uint64_t>(&value);
        if (number != nullptr && *number <= static_cast<std::uint64_t>(most)) {
            return static_cast<std::int64_t>(*number);
        }
    }
    throw std::runtime_error("'" + written + "' in the ValueMap is no integer");
}

bool isIntegerType(mof::Type type) {
    return type >= mof::Type::UInt8 && type <= mof::Type::SInt64;
}

}  // namespace

ValueMap::Entry ValueMap::entry(const std::string& range, const std::string& name) {
    // A bound that is missing is open: "..5", "0x8000..", "..".
    const std::size_t dots = range.find("..");
    if (dots == std::string::npos) {
        if (range.empty()) throw std::runtime_error("the ValueMap has an empty entry");
        const std::int64_t number = bound(range, 0);
        return {number, number, name};
    }
    return {bound(range.substr(0, dots), least), bound(range.substr(dots + 2), most), name};
}

/// A qualifier of a property that is no integer (strings have them too) names no numbers.
ValueMap ValueMap::of(mof::Type type, const mof::Qualifier* values,
                      const mof::Qualifier* valueMap) {
    ValueMap result;
    const std::vector<std::string> names = mof::texts(values);
    const std::vector<std::string> ranges = mof::texts(valueMap);
    const bool hasRanges = valueMap != nullptr;
    if (names.empty() || !isIntegerType(type)) return result;
    if (hasRanges && ranges.size() != names.size()) {
        throw std::runtime_error("ValueMap lists " + std::to_string(ranges.size()) +
                                 " entries and Values " + std::to_string(names.size()));
    }
    for (std::size_t index = 0; index < names.size(); ++index) {
        // Without a ValueMap the position of a name is its number.
        const std::string range = hasRanges ? ranges[index] : std::to_string(index);
        result.entries_.push_back(entry(range, names[index]));
    }
    return result;
}

const std::string* ValueMap::find(std::int64_t number) const {
    const Entry* best = nullptr;
    const auto width = [](const Entry& entry) {
        // Unsigned, since the width of ".." does not fit a signed number.
        return static_cast<std::uint64_t>(entry.highest) - static_cast<std::uint64_t>(entry.lowest);
    };
    for (const Entry& entry : entries_) {
        const bool within = entry.lowest <= number && number <= entry.highest;
        if (within && (best == nullptr || width(entry) < width(*best))) best = &entry;
    }
    return best == nullptr ? nullptr : &best->name;
}

}  // namespace cmpihost
