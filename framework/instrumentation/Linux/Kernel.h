#ifndef VA_LINUX_KERNEL_H
#define VA_LINUX_KERNEL_H

#include <cstdint>
#include <limits>
#include <optional>
#include <string>

namespace VA::Linux {

/// What uname tells.
struct KernelNames {
    std::string system, node, release;
};

/// When the host was booted, by its clocks, in seconds since the epoch, UTC.
struct ClockedBoot {
    std::optional<std::int64_t> seconds;  ///< nothing where a clock fails
    bool exact = false;  ///< false where a second ended too near to tell, or nothing is told
};

/// What the running kernel tells without a file. Tests derive from it to replace answers.
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

}  // namespace VA::Linux

#endif
