#include "BootTime.h"

#include <limits>

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

}  // namespace VA::Linux
