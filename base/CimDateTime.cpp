// One grammar for those who pass datetimes on and those who compute with them: where the two
// differ, they do so in what they make of the fields, not in how they read them.
#include "base/CimDateTime.h"

#include <algorithm>
#include <cstddef>
#include <iterator>

#include "base/Ascii.h"

namespace base {

namespace {

constexpr std::size_t textLength = 25, point = 14, zone = 21;

struct FieldRule {
    CimDateTime::Field CimDateTime::*field;
    std::size_t begin, length;
    int least, most;
};

constexpr FieldRule instantRules[] = {
    {&CimDateTime::year, 0, 4, 0, 9999},
    {&CimDateTime::month, 4, 2, 1, 12},
    {&CimDateTime::day, 6, 2, 1, 31},
    {&CimDateTime::hour, 8, 2, 0, 23},
    {&CimDateTime::minute, 10, 2, 0, 59},
    {&CimDateTime::second, 12, 2, 0, 60},
    {&CimDateTime::microsecond, 15, 6, 0, 999999},
    {&CimDateTime::utcOffset, 22, 3, 0, 999},
};

constexpr FieldRule intervalRules[] = {
    {&CimDateTime::days, 0, 8, 0, 99999999},       {&CimDateTime::hour, 8, 2, 0, 23},
    {&CimDateTime::minute, 10, 2, 0, 59},          {&CimDateTime::second, 12, 2, 0, 59},
    {&CimDateTime::microsecond, 15, 6, 0, 999999}, {&CimDateTime::utcOffset, 22, 3, 0, 0},
};

// Reads one field; false where it breaks its rule.
bool parseField(std::string_view text, const FieldRule& rule, CimDateTime& result) {
    const std::string_view part = text.substr(rule.begin, rule.length);
    if (std::all_of(part.begin(), part.end(), [](char c) { return c == '*'; })) return true;
    int value = 0;
    for (const char digit : part) {
        if (!isDigit(digit)) return false;
        value = value * 10 + (digit - '0');
    }
    result.*rule.field = value;
    return value >= rule.least && value <= rule.most;
}

}  // namespace

std::optional<CimDateTime> parseCimDateTime(std::string_view text) noexcept {
    if (text.size() != textLength || text[point] != '.') return std::nullopt;
    const char sign = text[zone];
    if (sign != '+' && sign != '-' && sign != ':') return std::nullopt;

    CimDateTime result;
    result.isInterval = sign == ':';
    const auto parse = [&](const FieldRule& rule) { return parseField(text, rule, result); };
    const bool valid = result.isInterval
                           ? std::all_of(std::begin(intervalRules), std::end(intervalRules), parse)
                           : std::all_of(std::begin(instantRules), std::end(instantRules), parse);
    if (!valid) return std::nullopt;
    if (sign == '-' && result.utcOffset) result.utcOffset = -*result.utcOffset;
    return result;
}

}  // namespace base
