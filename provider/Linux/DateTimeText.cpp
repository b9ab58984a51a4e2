#include "DateTimeText.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <iterator>

namespace VA::OSStatusProvider {

namespace {

// Dates come in their plain form but for defects of a host: that form needs none of the C library's
// conversions, which would take an eighth of the time of an instance.
constexpr char plainForm[] = "0000-00-00-00:00:00";

bool isDigit(char character) {
    return character >= '0' && character <= '9';
}

bool hasPlainForm(const char* text) {
    for (const char* form = plainForm; *form != 0; ++form, ++text)
        if (*form == '0' ? !isDigit(*text) : *text != *form) return false;
    return *text == 0;
}

unsigned int number(const char* text, std::size_t digits) {
    unsigned int value = 0;
    for (; digits != 0; --digits, ++text)
        value = value * 10 + static_cast<unsigned int>(*text - '0');
    return value;
}

char* putDigits(char* text, unsigned int value, std::size_t digits) {
    for (char* place = text + digits; place != text; value /= 10)
        *--place = static_cast<char>('0' + value % 10);
    return text + digits;
}

}  // namespace

DateFields scanDate(const char* text) {
    DateFields fields;
    auto& [year, month, day, hour, minute, second] = fields.of;
    if (hasPlainForm(text))
        return {{number(text, 4), number(text + 5, 2), number(text + 8, 2), number(text + 11, 2),
                 number(text + 14, 2), number(text + 17, 2)}};
    char separator = 0;
    std::sscanf(text, "%4u %1c %2u %1c %2u %1c %2u %1c %2u %1c %2u", &year, &separator, &month,
                &separator, &day, &separator, &hour, &separator, &minute, &separator, &second);
    return fields;
}

bool printDateTime(DateTimeText& text, const DateFields& fields, char sign, unsigned int minutes) {
    const auto& [year, month, day, hour, minute, second] = fields.of;
    std::memset(text, 0, sizeof text);
    // Blanks in place of a year's first digits, and all that takes more room than usual.
    if (year < 1000 || year > 9999 || minutes > 999 ||
        std::any_of(fields.of + 1, std::end(fields.of), [](unsigned int f) { return f > 99; }))
        return std::snprintf(text, sizeof text, "%4u%02u%02u%02u%02u%02u.%06u%1c%03u", year, month,
                             day, hour, minute, second, 0U, sign, minutes) != 0;
    char* next = putDigits(text, year, 4);
    for (const unsigned int field : {month, day, hour, minute, second})
        next = putDigits(next, field, 2);
    std::memcpy(next, ".000000", 7);
    next[7] = sign;
    putDigits(next + 8, minutes, 3);
    return true;
}

}  // namespace VA::OSStatusProvider
