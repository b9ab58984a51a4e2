#include "host/broker/DateTimeText.h"

#include <algorithm>
#include <array>
#include <cstdio>

namespace cmpihost {

namespace {

constexpr std::int64_t microsPerSecond = 1000000;
constexpr std::int64_t secondsPerDay = 86400;
constexpr std::size_t textLength = 25;

bool isLeap(std::int64_t year) {
    return (year % 4 == 0 && year % 100 != 0) || year % 400 == 0;
}

std::int64_t daysInMonth(std::int64_t year, std::int64_t month) {
    constexpr std::array<std::int64_t, 12> days = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
    return month == 2 && isLeap(year) ? 29 : days[static_cast<std::size_t>(month - 1)];
}

/// Days from the start of the year 1 to the start of `year`.
std::int64_t daysBeforeYear(std::int64_t year) {
    const std::int64_t past = year - 1;
    return past * 365 + past / 4 - past / 100 + past / 400;
}

std::int64_t daysSince1970(std::int64_t year, std::int64_t month, std::int64_t day) {
    std::int64_t days = daysBeforeYear(year) - daysBeforeYear(1970);
    for (std::int64_t m = 1; m < month; ++m) days += daysInMonth(year, m);
    return days + day - 1;
}

/// One run of digits with its limits.
struct Field {
    std::size_t start;
    std::size_t length;
    std::int64_t lowest;
    std::int64_t highest;
};

std::optional<std::int64_t> number(std::string_view text, const Field& field) {
    const std::string_view digits = text.substr(field.start, field.length);
    if (std::all_of(digits.begin(), digits.end(), [](char c) { return c == '*'; })) {
        return field.lowest;
    }
    std::int64_t value = 0;
    for (const char digit : digits) {
        if (digit < '0' || digit > '9') return std::nullopt;
        value = value * 10 + (digit - '0');
    }
    if (value < field.lowest || value > field.highest) return std::nullopt;
    return value;
}

template <std::size_t N>
std::optional<std::array<std::int64_t, N>> numbers(std::string_view text,
                                                   const std::array<Field, N>& fields) {
    std::array<std::int64_t, N> values{};
    for (std::size_t i = 0; i < N; ++i) {
        const auto value = number(text, fields[i]);
        if (!value) return std::nullopt;
        values[i] = *value;
    }
    return values;
}

constexpr Field hourField = {8, 2, 0, 23};
constexpr Field minuteField = {10, 2, 0, 59};
constexpr Field secondField = {12, 2, 0, 59};
constexpr Field microsField = {15, 6, 0, 999999};

std::int64_t secondsOfDay(std::int64_t hour, std::int64_t minute, std::int64_t second) {
    return (hour * 60 + minute) * 60 + second;
}

std::optional<DateTimeBinary> parseInstant(std::string_view text) {
    const std::array<Field, 8> fields = {{{0, 4, 1, 9999},
                                          {4, 2, 1, 12},
                                          {6, 2, 1, 31},
                                          hourField,
                                          minuteField,
                                          secondField,
                                          microsField,
                                          {22, 3, 0, 999}}};
    const auto values = numbers(text, fields);
    if (!values) return std::nullopt;
    const auto [year, month, day, hour, minute, second, micros, offset] = *values;
    if (day > daysInMonth(year, month)) return std::nullopt;

    const std::int64_t zone = (text[21] == '-' ? -offset : offset) * 60;
    const std::int64_t seconds =
        daysSince1970(year, month, day) * secondsPerDay + secondsOfDay(hour, minute, second) - zone;
    DateTimeBinary result;
    if (seconds >= 0) {
        result.microseconds = static_cast<std::uint64_t>(seconds * microsPerSecond + micros);
    }
    return result;
}

std::optional<DateTimeBinary> parseInterval(std::string_view text) {
    const std::array<Field, 6> fields = {
        {{0, 8, 0, 99999999}, hourField, minuteField, secondField, microsField, {22, 3, 0, 0}}};
    const auto values = numbers(text, fields);
    if (!values) return std::nullopt;
    const auto [days, hour, minute, second, micros, zero] = *values;
    const std::int64_t seconds = days * secondsPerDay + secondsOfDay(hour, minute, second) + zero;
    return DateTimeBinary{true, static_cast<std::uint64_t>(seconds * microsPerSecond + micros)};
}

struct Date {
    std::int64_t year;
    std::int64_t month;
    std::int64_t day;
};

Date dateOf(std::int64_t daysAfter1970) {
    const std::int64_t days = daysAfter1970 + daysBeforeYear(1970);
    // At most the true year, and not far before it.
    std::int64_t year = days / 366 + 1;
    while (daysBeforeYear(year + 1) <= days) ++year;
    std::int64_t rest = days - daysBeforeYear(year);
    std::int64_t month = 1;
    while (rest >= daysInMonth(year, month)) {
        rest -= daysInMonth(year, month);
        ++month;
    }
    return {year, month, rest + 1};
}

}  // namespace

std::optional<DateTimeBinary> parseDateTime(std::string_view text) noexcept {
    if (text.size() != textLength || text[14] != '.') return std::nullopt;
    switch (text[21]) {
        case '+':
        case '-':
            return parseInstant(text);
        case ':':
            return parseInterval(text);
        default:
            return std::nullopt;
    }
}

std::optional<std::string> formatDateTime(std::uint64_t microseconds, bool interval) {
    const auto total = static_cast<std::int64_t>(microseconds / microsPerSecond);
    const auto micros = static_cast<int>(microseconds % microsPerSecond);
    const std::int64_t days = total / secondsPerDay;
    const auto hour = static_cast<int>(total / 3600 % 24);
    const auto minute = static_cast<int>(total / 60 % 60);
    const auto second = static_cast<int>(total % 60);

    std::array<char, 64> text{};
    if (interval) {
        if (days > 99999999) return std::nullopt;
        std::snprintf(text.data(), text.size(), "%08d%02d%02d%02d.%06d:000", static_cast<int>(days),
                      hour, minute, second, micros);
        return text.data();
    }
    const Date date = dateOf(days);
    if (date.year > 9999) return std::nullopt;
    std::snprintf(text.data(), text.size(), "%04d%02d%02d%02d%02d%02d.%06d+000",
                  static_cast<int>(date.year), static_cast<int>(date.month),
                  static_cast<int>(date.day), hour, minute, second, micros);
    return text.data();
}

}  // namespace cmpihost
