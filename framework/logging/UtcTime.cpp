#include "UtcTime.h"

#include "base/CivilTime.h"

namespace ZBLog {

void putUtc(LineBuffer& line, const timespec& instant) noexcept {
    const base::CivilTime time = base::civilFromSeconds(instant.tv_sec);
    line.putNumber(time.year, 4);
    line.put('-');
    line.putNumber(time.month, 2);
    line.put('-');
    line.putNumber(time.day, 2);
    line.put('T');
    line.putNumber(time.hour, 2);
    line.put(':');
    line.putNumber(time.minute, 2);
    line.put(':');
    line.putNumber(time.second, 2);
    line.put('.');
    line.putNumber(instant.tv_nsec / 1000000, 3);
    line.put('Z');
}

}  // namespace ZBLog
