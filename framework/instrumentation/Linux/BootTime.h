#ifndef VA_LINUX_BOOT_TIME_H
#define VA_LINUX_BOOT_TIME_H

#include <cstdint>
#include <optional>
#include <string_view>

#include "HostFiles.h"
#include "Kept.h"
#include "Kernel.h"

namespace VA::Linux {

/// The `btime` line of proc/stat: when the host was booted, in seconds since the epoch, UTC.
/// Nothing where there is no such line, or where it is not whole.
std::optional<std::int64_t> parseBootTime(std::string_view procStat);

/// When the host was booted: what proc/stat tells, else what the clocks do. Any number of threads
/// may ask.
///
/// To make proc/stat, the kernel adds up the interrupts of all processors. It is not read again as
/// long as it is the same file of the kernel's and the clocks tell, beyond doubt, the second that
/// it told: they do until the time of day is set.
class BootTime {
  public:
    std::optional<std::int64_t> read(const HostFiles& files, const Kernel& kernel);

  private:
    struct Known {
        FileState procStat;
        std::int64_t seconds;
    };

    Slot<Known> slot_;
};

}  // namespace VA::Linux

#endif
