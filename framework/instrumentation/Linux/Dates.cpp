// No file says when a host was installed, and images, restored backups and wrong clocks leave wrong
// dates behind: what cannot be true is passed over.
#include "Dates.h"

#include <cstdio>
#include <limits>
#include <memory>

#include "Parsing.h"
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

std::optional<std::int64_t> parseBootTime(std::string_view procStat) {
    constexpr std::string_view key = "btime ";
    std::optional<std::uint64_t> seconds;
    forEachLine(procStat, [&](std::string_view line, bool ended) {
        if (seconds || line.substr(0, key.size()) != key) return;
        // More lines follow this one in every kernel: without its newline it was cut short.
        if (ended) seconds = parseDecimal(line.substr(key.size()));
    });
    constexpr auto latest = std::numeric_limits<std::int64_t>::max();
    if (!seconds || *seconds == 0 || *seconds > std::uint64_t{latest}) return std::nullopt;
    return static_cast<std::int64_t>(*seconds);
}

std::optional<std::int64_t> BootTime::read(const HostFiles& files, const Kernel& kernel) {
    const std::string path = "proc/stat";
    const auto clocks = kernel.bootTime();
    if (const auto known = slot_.get(); known && clocks.exact && clocks.seconds == known->seconds &&
                                        files.state(path) == known->procStat) {
        return known->seconds;
    }
    const auto file = files.read(path);
    const auto recorded = file ? parseBootTime(file->text) : std::nullopt;
    if (!recorded) return clocks.seconds;
    // The size of a file of the kernel's own is 0; those of others may change as they like.
    if (clocks.exact && clocks.seconds == recorded && file->state.size == 0) {
        slot_.put(std::make_shared<const Known>(Known{file->state, *recorded}));
    }
    return recorded;
}

bool isPlausibleInstallDate(std::int64_t instant, std::optional<std::int64_t> boot,
                            std::int64_t now) {
    constexpr std::int64_t startOf1992 = 694224000;  // images are often dated to the epoch
    return instant >= startOf1992 && (!boot || instant <= *boot) && instant <= now;
}

std::optional<std::int64_t> findInstallDate(const HostFiles& files, const Kernel& kernel,
                                            std::optional<std::int64_t> boot) {
    const auto now = kernel.now();
    const auto root = files.state("");
    if (root && root->birth && isPlausibleInstallDate(*root->birth, boot, now)) return root->birth;
    for (const char* path : {"var/log/installer", "etc/machine-id"}) {
        const auto file = files.state(path);
        if (!file) continue;
        const auto changed = file->changed.seconds;
        if (isPlausibleInstallDate(changed, boot, now)) return changed;
    }
    return std::nullopt;
}

}  // namespace VA::Linux
