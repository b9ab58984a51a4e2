#ifndef FRAMEWORK_INSTRUMENTATION_LINUX_KERNEL_H
#define FRAMEWORK_INSTRUMENTATION_LINUX_KERNEL_H

#include <cstdint>
#include <limits>
#include <optional>
#include <string>
#include <string_view>

/// What the kernel reports, by its calls and in proc.
namespace VA::Linux {

class HostFiles;

/// What uname gives.
struct KernelNames {
    std::string system, node, release;
};

/// When the host was booted, by its clocks, in seconds since the epoch, UTC.
struct ClockedBoot {
    std::optional<std::int64_t> seconds;  ///< nullopt if a clock fails
    bool exact = false;  ///< false where a second ended too near to say, or `seconds` is nullopt
};

/// What the running kernel reports without a file. Tests derive from it to replace answers.
class Kernel {
  public:
    static constexpr std::uint64_t unlimited = std::numeric_limits<std::uint64_t>::max();

    virtual ~Kernel() = default;

    virtual std::optional<KernelNames> names() const;

    /// Seconds since the epoch, UTC.
    virtual std::int64_t now() const;

    virtual ClockedBoot bootTime() const;

    /// True for a process of any user's that this process can name by `pid`.
    virtual bool isAlive(std::int32_t pid) const;

    /// Soft limit of a process's address space in bytes, or `unlimited`.
    virtual std::optional<std::uint64_t> addressSpaceLimit() const;
};

/// What proc/meminfo says, in kilobytes of 1024 bytes, at most 4294967295 each.
struct MemoryInfo {
    std::optional<std::uint32_t> totalKiB;
    std::optional<std::uint32_t> availableKiB;  ///< without swap
    std::optional<std::uint32_t> swapTotalKiB;  ///< 0 on a host without swap
    std::optional<std::uint32_t> swapFreeKiB;   ///< 0 on a host without swap
};

/// Returns nullopt for a text without the total memory: that is no meminfo.
///
/// Available memory is MemAvailable or, where a kernel has none, the sum of MemFree, Buffers and
/// Cached. A host without a SwapTotal line has no swap; a line that is malformed leaves its value
/// out. Of two lines with one name the first counts.
std::optional<MemoryInfo> parseMemoryInfo(std::string_view meminfo);

/// The value of a file that holds one line with a positive number, such as the limits of
/// proc/sys/kernel.
std::optional<std::uint64_t> parseNumberFile(std::string_view text);

/// The values of a host's proc, at most 4294967295; nullopt if it does not say.
std::optional<MemoryInfo> readMemoryInfo(const HostFiles& files);
std::optional<std::uint32_t> readMaxProcesses(const HostFiles& files);
std::optional<std::uint32_t> countProcesses(const HostFiles& files);

/// The limit of a process's address space in kilobytes, at most 4294967295; 0 where there is none.
std::optional<std::uint32_t> maxProcessMemoryKiB(const Kernel& kernel);

}  // namespace VA::Linux

#endif
