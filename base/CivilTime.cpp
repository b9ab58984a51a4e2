// The date functions of the C library may set up the process's time zone on their first use, and
// with it the `timezone` that other code reads; they take locks, too. So this is plain arithmetic.
#include "base/CivilTime.h"

#include <algorithm>

namespace base {

namespace {

constexpr std::int64_t secondsPerDay = 86400;
constexpr std::int64_t daysPer400Years = 146097, daysPerCentury = 36524;
constexpr std::int64_t daysPer4Years = 1461, daysPerYear = 365;

// Years are taken to begin in March, so that a leap day is the last day of its year, of its four
// years and of its 400 years, and each count of days divides without an exception.
constexpr std::int64_t firstOfMarch2000 = 11017;  // in days since 1970-01-01

std::int64_t floorDivide(std::int64_t value, std::int64_t divisor) {
    return value / divisor - (value % divisor < 0 ? 1 : 0);
}

// The days from the first of March to the first of the `month`-th month after it: every five months
// have 153 days, and their lengths alternate.
std::int64_t daysBeforeMonth(std::int64_t month) {
    return (153 * month + 2) / 5;
}

bool isLeap(std::int64_t year) {
    return year % 4 == 0 && (year % 100 != 0 || year % 400 == 0);
}

}  // namespace

CivilTime civilFromSeconds(std::int64_t seconds) noexcept {
    const std::int64_t days = floorDivide(seconds, secondsPerDay);
    // Of the least count of seconds, its days in seconds would already be too small for the type.
    const auto second = static_cast<int>((seconds % secondsPerDay + secondsPerDay) % secondsPerDay);

    const std::int64_t cycle = floorDivide(days - firstOfMarch2000, daysPer400Years);
    std::int64_t rest = days - firstOfMarch2000 - cycle * daysPer400Years;
    const std::int64_t century = std::min<std::int64_t>(rest / daysPerCentury, 3);
    rest -= century * daysPerCentury;
    const std::int64_t fours = rest / daysPer4Years;
    rest -= fours * daysPer4Years;
    const std::int64_t single = std::min<std::int64_t>(rest / daysPerYear, 3);
    rest -= single * daysPerYear;

    const auto month = static_cast<int>((5 * rest + 2) / 153);
    const bool afterNewYear = month >= 10;
    const std::int64_t year = 2000 + 400 * cycle + 100 * century + 4 * fours + single;
    return {year + (afterNewYear ? 1 : 0),
            month + (afterNewYear ? -9 : 3),
            static_cast<int>(rest - daysBeforeMonth(month)) + 1,
            second / 3600,
            second / 60 % 60,
            second % 60};
}

std::int64_t secondsFromCivil(const CivilTime& time) noexcept {
    const bool afterNewYear = time.month < 3;
    const std::int64_t years = time.year - 2000 - (afterNewYear ? 1 : 0);
    const std::int64_t leapDays =
        floorDivide(years, 4) - floorDivide(years, 100) + floorDivide(years, 400);
    const std::int64_t days = firstOfMarch2000 + years * daysPerYear + leapDays +
                              daysBeforeMonth(time.month + (afterNewYear ? 9 : -3)) + time.day - 1;
    return days * secondsPerDay + time.hour * 3600 + time.minute * 60 + time.second;
}

int daysInMonth(std::int64_t year, int month) noexcept {
    constexpr int lengths[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
    return lengths[month - 1] + (month == 2 && isLeap(year) ? 1 : 0);
}

}  // namespace base
