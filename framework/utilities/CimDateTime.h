#ifndef VA_CIM_DATE_TIME_H
#define VA_CIM_DATE_TIME_H

#include <string_view>

namespace VA {

/// True when `text` is a CIM datetime: a point in time, "yyyymmddhhmmss.mmmmmmsutc" with s '+' or
/// '-', or an interval, "ddddddddhhmmss.mmmmmm:000". Each field of a point in time lies in its
/// range, so "20090300…" is none; a field may be asterisks where it does not matter.
bool isCimDateTime(std::string_view text);

}  // namespace VA

#endif
