#ifndef VA_LINUX_CIVIL_DATE_H
#define VA_LINUX_CIVIL_DATE_H

#include <cstdint>
#include <optional>
#include <string>

namespace VA::Linux {

/// `seconds` since the epoch as "YYYY-MM-DD-HH:MM:SS" in the Gregorian calendar; nothing for an
/// instant outside the years 0 to 9999.
///
/// Plain arithmetic: the date functions of the C library may set up the process's time zone on
/// their first use, and with it the `timezone` that other code reads.
std::optional<std::string> civilDateText(std::int64_t seconds);

/// The text of the instant `utcSeconds` as the element model is to receive it: moved by whole
/// minutes, (`secondsWest` / 60) of them, towards the future where positive.
std::optional<std::string> zonedDateText(std::int64_t utcSeconds, long secondsWest);

}  // namespace VA::Linux

#endif
