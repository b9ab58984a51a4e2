#ifndef ZBLOG_UTC_TIME_H
#define ZBLOG_UTC_TIME_H

#include <ctime>

#include "LineBuffer.h"

namespace ZBLog {

/// Appends an instant as UTC, "2024-02-29T23:59:59.123Z". Computed from the count of seconds alone:
/// the C library's conversions would touch the time zone of the process, which is not ours.
void putUtc(LineBuffer& line, const timespec& instant) noexcept;

}  // namespace ZBLog

#endif
