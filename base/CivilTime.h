#ifndef BASE_CIVIL_TIME_H
#define BASE_CIVIL_TIME_H

#include <cstdint>

/// Seconds since 1970-01-01 00:00:00 to civil fields and back, in the proleptic Gregorian calendar,
/// which has a year 0, and without leap seconds. Nothing here allocates or knows of time zones. Any
/// thread may call.
namespace base {

/// A date and a time of day.
struct CivilTime {
    std::int64_t year;
    int month;  ///< 1 to 12
    int day;    ///< 1 to 31
    int hour, minute, second;
};

/// The civil time of any count of seconds, negative ones before 1970.
CivilTime civilFromSeconds(std::int64_t seconds) noexcept;

/// The reverse, for years within a billion of 0. Only `month` has to be in its range: a day past
/// its month's last one, or a second 60, counts on into what follows.
std::int64_t secondsFromCivil(const CivilTime& time) noexcept;

/// 28 to 31, for a month from 1 to 12.
int daysInMonth(std::int64_t year, int month) noexcept;

}  // namespace base

#endif
