#ifndef VA_LINUX_MEMORY_INFO_H
#define VA_LINUX_MEMORY_INFO_H

#include <cstdint>
#include <optional>
#include <string_view>

namespace VA::Linux {

/// What proc/meminfo says, in kilobytes of 1024 bytes, at most 4294967295 each.
struct MemoryInfo {
    std::uint32_t totalKiB = 0;
    std::optional<std::uint32_t> availableKiB;  ///< without swap
    std::optional<std::uint32_t> swapTotalKiB;  ///< 0 on a host without swap
    std::optional<std::uint32_t> swapFreeKiB;   ///< 0 on a host without swap
};

/// Nothing for a text that does not tell the total memory: that is no meminfo.
///
/// Available memory is MemAvailable or, where a kernel has none, the sum of MemFree, Buffers and
/// Cached. A host without a SwapTotal line has no swap; a line that is malformed leaves its value
/// out. Of two lines with one name the first counts.
std::optional<MemoryInfo> parseMemoryInfo(std::string_view meminfo);

}  // namespace VA::Linux

#endif
