#include "MemoryInfo.h"

#include <algorithm>

#include "Lines.h"
#include "Numbers.h"

namespace VA::Linux {

namespace {

struct Field {
    bool present = false;
    std::optional<std::uint32_t> kiB;  // nothing where the line is malformed
};

struct Fields {
    Field total, free, available, buffers, cached, swapTotal, swapFree;
};

struct Row {
    std::string_view name;
    Field Fields::*field;
};

constexpr Row rows[] = {
    {"MemTotal", &Fields::total},         {"MemFree", &Fields::free},
    {"MemAvailable", &Fields::available}, {"Buffers", &Fields::buffers},
    {"Cached", &Fields::cached},          {"SwapTotal", &Fields::swapTotal},
    {"SwapFree", &Fields::swapFree},
};

// "   1024 kB": the unit shows that the number is whole.
std::optional<std::uint32_t> parseKiB(std::string_view text) {
    constexpr std::string_view unit = " kB";
    text.remove_prefix(std::min(text.find_first_not_of(' '), text.size()));
    if (text.size() < unit.size()) return std::nullopt;
    const auto digits = text.size() - unit.size();
    if (text.substr(digits) != unit) return std::nullopt;
    const auto value = parseDecimal(text.substr(0, digits));
    if (!value) return std::nullopt;
    return saturated(*value);
}

Fields parseFields(std::string_view meminfo) {
    Fields fields;
    forEachLine(meminfo, [&](std::string_view line, bool) {
        const auto colon = line.find(':');
        if (colon == std::string_view::npos) return;
        for (const Row& row : rows) {
            Field& field = fields.*row.field;
            if (field.present || row.name != line.substr(0, colon)) continue;
            field = {true, parseKiB(line.substr(colon + 1))};
        }
    });
    return fields;
}

std::optional<std::uint32_t> availableKiB(const Fields& fields) {
    if (fields.available.kiB) return fields.available.kiB;
    if (!fields.free.kiB || !fields.buffers.kiB || !fields.cached.kiB) return std::nullopt;
    return saturatedSum(saturatedSum(*fields.free.kiB, *fields.buffers.kiB), *fields.cached.kiB);
}

}  // namespace

std::optional<MemoryInfo> parseMemoryInfo(std::string_view meminfo) {
    const Fields fields = parseFields(meminfo);
    if (!fields.total.kiB) return std::nullopt;
    MemoryInfo info;
    info.totalKiB = *fields.total.kiB;
    info.availableKiB = availableKiB(fields);
    info.swapTotalKiB = fields.swapTotal.present ? fields.swapTotal.kiB : 0;
    info.swapFreeKiB = info.swapTotalKiB == 0u ? 0 : fields.swapFree.kiB;
    return info;
}

}  // namespace VA::Linux
