#include "CivilDate.h"

#include <cstdio>

namespace VA::Linux {

namespace {

constexpr std::int64_t secondsPerDay = 86400;
constexpr std::int64_t firstInstant = -62167219200;  // 0000-01-01-00:00:00
constexpr std::int64_t lastInstant = 253402300799;   // 9999-12-31-23:59:59

struct Day {
    unsigned int year, month, day;
};

constexpr bool isLeap(unsigned int year) {
    return year % 4 == 0 && (year % 100 != 0 || year % 400 == 0);
}

// Leap years before `year`, counting from the year 0, which is one.
constexpr unsigned int leapYearsBefore(unsigned int year) {
    return year == 0 ? 0 : (year - 1) / 4 - (year - 1) / 100 + (year - 1) / 400 + 1;
}

constexpr unsigned int daysBeforeYear(unsigned int year) {
    return year * 365 + leapYearsBefore(year);
}

// `days` since 0000-01-01.
Day civilDay(unsigned int days) {
    constexpr unsigned int monthLengths[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
    unsigned int year = days / 365;  // never too early, a few years too late at most
    while (daysBeforeYear(year) > days) --year;
    unsigned int rest = days - daysBeforeYear(year);
    unsigned int month = 0;
    for (;; ++month) {
        const unsigned int length = monthLengths[month] + (month == 1 && isLeap(year) ? 1 : 0);
        if (rest < length) return {year, month + 1, rest + 1};
        rest -= length;
    }
}

}  // namespace

std::optional<std::string> civilDateText(std::int64_t seconds) {
    if (seconds < firstInstant || seconds > lastInstant) return std::nullopt;
    const std::int64_t sinceFirst = seconds - firstInstant;
    const Day date = civilDay(static_cast<unsigned int>(sinceFirst / secondsPerDay));
    const auto second = static_cast<unsigned int>(sinceFirst % secondsPerDay);
    char text[64];
    const int length =
        std::snprintf(text, sizeof text, "%04u-%02u-%02u-%02u:%02u:%02u", date.year, date.month,
                      date.day, second / 3600, second / 60 % 60, second % 60);
    return std::string(text, static_cast<std::size_t>(length));
}

std::optional<std::string> zonedDateText(std::int64_t utcSeconds, long secondsWest) {
    // Ahead of the sum: it must not overflow.
    if (utcSeconds < firstInstant || utcSeconds > lastInstant) return std::nullopt;
    const std::int64_t minutes = secondsWest / 60;
    return civilDateText(utcSeconds + minutes * 60);
}

}  // namespace VA::Linux
