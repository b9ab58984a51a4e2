#include "UtcTime.h"

#include <algorithm>

namespace ZBLog {

namespace {

constexpr long long secondsPerDay = 86400;

struct Date {
    long long year;
    int month, day;
};

long long floorDivide(long long value, long long divisor) {
    return value / divisor - (value % divisor < 0 ? 1 : 0);
}

/// The date of a day, counted from 1970-01-01.
/// Years are taken to begin in March, so that a leap day is the last day of its year, of its four
/// years and of its 400 years, and each count of days divides without an exception.
Date dateOf(long long day) {
    constexpr long long firstOfMarch2000 = 11017;
    constexpr long long per400Years = 146097, perCentury = 36524, per4Years = 1461, perYear = 365;

    const long long cycle = floorDivide(day - firstOfMarch2000, per400Years);
    long long rest = day - firstOfMarch2000 - cycle * per400Years;
    const long long century = std::min(rest / perCentury, 3LL);
    rest -= century * perCentury;
    const long long fours = rest / per4Years;
    rest -= fours * per4Years;
    const long long single = std::min(rest / perYear, 3LL);
    rest -= single * perYear;

    // From March on, every five months have 153 days, and their lengths alternate.
    const auto month = static_cast<int>((5 * rest + 2) / 153);
    rest -= (153 * month + 2) / 5;
    const bool afterNewYear = month >= 10;
    const long long year = 2000 + 400 * cycle + 100 * century + 4 * fours + single;
    return {year + (afterNewYear ? 1 : 0), month + (afterNewYear ? -9 : 3),
            static_cast<int>(rest) + 1};
}

}  // namespace

void putUtc(LineBuffer& line, const timespec& instant) noexcept {
    const auto seconds = static_cast<long long>(instant.tv_sec);
    const long long day = floorDivide(seconds, secondsPerDay);
    const long long second = seconds - day * secondsPerDay;

    const Date date = dateOf(day);
    line.putNumber(date.year, 4);
    line.put('-');
    line.putNumber(date.month, 2);
    line.put('-');
    line.putNumber(date.day, 2);
    line.put('T');
    line.putNumber(second / 3600, 2);
    line.put(':');
    line.putNumber(second / 60 % 60, 2);
    line.put(':');
    line.putNumber(second % 60, 2);
    line.put('.');
    line.putNumber(instant.tv_nsec / 1000000, 3);
    line.put('Z');
}

}  // namespace ZBLog
