#ifndef HOST_BROKER_DATE_TIME_TEXT_H
#define HOST_BROKER_DATE_TIME_TEXT_H

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

/// CIM datetimes: 25 characters of text and microseconds.
namespace cmpihost {

struct DateTimeBinary {
    bool interval = false;
    /// Microseconds since 1970 UTC or of the interval; none: an instant before 1970.
    std::optional<std::uint64_t> microseconds;
};

/// Reads "yyyymmddhhmmss.mmmmmmsutc" (s is + or -, utc minutes) or "ddddddddhhmmss.mmmmmm:000".
/// Asterisks may stand for a whole field and then count as its lowest value. None: the text is no
/// datetime.
std::optional<DateTimeBinary> parseDateTime(std::string_view text) noexcept;

/// The text of an instant (in UTC) or an interval. None: it has no such text (after the year 9999,
/// more than 99999999 days).
std::optional<std::string> formatDateTime(std::uint64_t microseconds, bool interval);

}  // namespace cmpihost

#endif
