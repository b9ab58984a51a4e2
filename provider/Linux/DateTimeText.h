#ifndef OSSTATUS_LINUX_DATE_TIME_TEXT_H
#define OSSTATUS_LINUX_DATE_TIME_TEXT_H

#include <cstddef>

namespace VA::OSStatusProvider {

/// Year, month, day, hour, minute and second of a framework's date.
struct DateFields {
    static constexpr std::size_t count = 6;
    unsigned int of[count] = {};
};

/// The fields of a framework's date, "YYYY-MM-DD-HH:MM:SS" with any one character but white space
/// as each separator. White space may stand before each of them. Fields that the text does not
/// reach are 0.
DateFields scanDate(const char* text);

/// A text of 25 characters and the NUL.
using DateTimeText = char[26];

/// Prints a CIM datetime, cut where it does not fit: the fields, no microseconds, the sign and the
/// minutes of the zone. False if nothing could be printed.
bool printDateTime(DateTimeText& text, const DateFields& fields, char sign, unsigned int minutes);

}  // namespace VA::OSStatusProvider

#endif
