#include "CivilDate.h"

#include <cstdio>

#include "base/CivilTime.h"

namespace VA::Linux {

namespace {

constexpr std::int64_t firstInstant = -62167219200;  // 0000-01-01-00:00:00
constexpr std::int64_t lastInstant = 253402300799;   // 9999-12-31-23:59:59

}  // namespace

std::optional<std::string> civilDateText(std::int64_t seconds) {
    if (seconds < firstInstant || seconds > lastInstant) return std::nullopt;
    const base::CivilTime time = base::civilFromSeconds(seconds);
    char text[64];
    const int length = std::snprintf(text, sizeof text, "%04d-%02d-%02d-%02d:%02d:%02d",
                                     static_cast<int>(time.year), time.month, time.day, time.hour,
                                     time.minute, time.second);
    return std::string(text, static_cast<std::size_t>(length));
}

std::optional<std::string> zonedDateText(std::int64_t utcSeconds, long secondsWest) {
    // Ahead of the sum: it must not overflow.
    if (utcSeconds < firstInstant || utcSeconds > lastInstant) return std::nullopt;
    const std::int64_t minutes = secondsWest / 60;
    return civilDateText(utcSeconds + minutes * 60);
}

}  // namespace VA::Linux
