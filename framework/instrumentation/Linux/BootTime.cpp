#include "BootTime.h"

#include <limits>
#include <memory>
#include <string>

#include "Lines.h"
#include "Numbers.h"

namespace VA::Linux {

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
    const auto told = file ? parseBootTime(file->text) : std::nullopt;
    if (!told) return clocks.seconds;
    // The size of a file of the kernel's own is 0; those of others may change as they like.
    if (clocks.exact && clocks.seconds == told && file->state.size == 0) {
        slot_.put(std::make_shared<const Known>(Known{file->state, *told}));
    }
    return told;
}

}  // namespace VA::Linux
