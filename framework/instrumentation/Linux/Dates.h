#ifndef FRAMEWORK_INSTRUMENTATION_LINUX_DATES_H
#define FRAMEWORK_INSTRUMENTATION_LINUX_DATES_H

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "Files.h"
#include "Kernel.h"

/// When a host was booted and installed, and the text that the element model takes of such a time.
namespace VA::Linux {

/// `seconds` since the epoch as "YYYY-MM-DD-HH:MM:SS" in the Gregorian calendar; nullopt for an
/// instant outside the years 0 to 9999.
std::optional<std::string> civilDateText(std::int64_t seconds);

/// The text of the instant `utcSeconds` as the element model is to receive it: moved by whole
/// minutes, (`secondsWest` / 60) of them, towards the future where positive.
std::optional<std::string> zonedDateText(std::int64_t utcSeconds, long secondsWest);

/// The `btime` line of proc/stat: when the host was booted, in seconds since the epoch, UTC.
/// Returns nullopt if there is no such line, or if it is not whole.
std::optional<std::int64_t> parseBootTime(std::string_view procStat);

/// When the host was booted: by proc/stat, else by the clocks. Any number of threads may ask.
///
/// To make proc/stat, the kernel adds up the interrupts of all processors. It is not read again as
/// long as it is the same file of the kernel's and the clocks give, beyond doubt, the same second
/// as it did: they do until the time of day is set.
class BootTime {
  public:
    std::optional<std::int64_t> read(const HostFiles& files, const Kernel& kernel);

  private:
    struct Known {
        FileState procStat;
        std::int64_t seconds;
    };

    CacheSlot<Known> slot_;
};

/// True for an instant at which this host may have been installed: after 1991, not after `boot`
/// where that is known, not after `now`. All in seconds since the epoch, UTC.
bool isPlausibleInstallDate(std::int64_t instant, std::optional<std::int64_t> boot,
                            std::int64_t now);

/// The first plausible one of: the birth of the root directory, the changes of var/log/installer
/// and of etc/machine-id. `boot` is as above.
std::optional<std::int64_t> findInstallDate(const HostFiles& files, const Kernel& kernel,
                                            std::optional<std::int64_t> boot);

}  // namespace VA::Linux

#endif
