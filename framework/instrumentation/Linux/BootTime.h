#ifndef VA_LINUX_BOOT_TIME_H
#define VA_LINUX_BOOT_TIME_H

#include <cstdint>
#include <optional>
#include <string_view>

namespace VA::Linux {

/// The `btime` line of proc/stat: when the host was booted, in seconds since the epoch, UTC.
/// Nothing where there is no such line, or where it is not whole.
std::optional<std::int64_t> parseBootTime(std::string_view procStat);

}  // namespace VA::Linux

#endif
