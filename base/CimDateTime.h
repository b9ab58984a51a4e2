#ifndef BASE_CIM_DATE_TIME_H
#define BASE_CIM_DATE_TIME_H

#include <optional>
#include <string_view>

namespace base {

/// The fields of a CIM datetime as its 25 characters have them: an instant,
/// "yyyymmddhhmmss.mmmmmmsutc" with s '+' or '-', or an interval, "ddddddddhhmmss.mmmmmm:000".
struct CimDateTime {
    /// nullopt if asterisks stand for the whole field: its value does not matter.
    using Field = std::optional<int>;

    bool isInterval = false;
    Field year, month, day;  ///< of an instant; nullopt in an interval
    Field days;              ///< of an interval; nullopt in an instant
    Field hour, minute, second, microsecond;
    Field utcOffset;  ///< in minutes, negative after '-'; 0 in an interval
};

/// Reads such a text; nullopt for any other. Each field is digits or asterisks, and in its range:
/// months 1 to 12, days of a month 1 to 31, hours to 23, minutes to 59, seconds to 59 and of an
/// instant to 60, which is a leap second.
///
/// The rest is the caller's decision: whether the year 0, the 31st of any month, leap seconds and
/// asterisks are welcome, those in place of an interval's ":000" included.
std::optional<CimDateTime> parseCimDateTime(std::string_view text) noexcept;

}  // namespace base

#endif
