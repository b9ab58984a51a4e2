#ifndef VA_LINUX_SNAPSHOT_H
#define VA_LINUX_SNAPSHOT_H

#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "BootTime.h"
#include "HostFiles.h"
#include "Kept.h"
#include "Kernel.h"
#include "Lazy.h"
#include "MemoryInfo.h"
#include "OsRelease.h"
#include "SystemState.h"
#include "Users.h"

namespace VA::Linux {

/// What is known of a host from one snapshot to the next.
struct KeptValues {
    Kept<OsRelease> osRelease;
    Kept<UserSessions> userSessions;
    BootTime bootTime;
};

/// What a Linux host is read through. None is null.
struct HostParts {
    std::shared_ptr<const HostFiles> files;
    std::shared_ptr<const Kernel> kernel;
    std::shared_ptr<SystemManager> systemManager;
    std::shared_ptr<KeptValues> kept = std::make_shared<KeptValues>();
};

/// The values of one host at one time. Each source behind them is read once, when the first value
/// that needs it is asked for. What is not known is nothing. One thread uses it at a time; it must
/// not outlive the parts that it reads through.
///
/// Memory is in kilobytes of 1024 bytes; numbers too large for 32 bits are 4294967295.
class Snapshot {
  public:
    explicit Snapshot(const HostParts& parts);

    std::optional<std::string> computerName();
    std::optional<std::string> name();
    std::optional<std::string> version();

    // The dates are texts in the zone that the global `timezone` names at the moment of the call.
    std::optional<std::string> installDate();
    std::optional<std::string> lastBootUpTime();

    std::optional<unsigned int> osType();
    std::optional<unsigned int> maxProcesses();
    std::optional<unsigned int> maxProcessMemoryKiB();  ///< 0: unlimited
    std::optional<unsigned int> processes();
    std::optional<unsigned int> users();
    std::optional<unsigned int> licensedUsers();  ///< 0: unlimited
    std::optional<unsigned int> totalVirtualKiB();
    std::optional<unsigned int> freeVirtualKiB();
    std::optional<unsigned int> freePhysicalKiB();
    std::optional<unsigned int> totalPhysicalKiB();
    std::optional<unsigned int> totalSwapKiB();
    std::optional<unsigned int> freeSwapKiB();
    std::optional<bool> distributed();

    /// In the codes of Instrumentation::getNodeStatus.
    unsigned int nodeStatus();

  private:
    const OsRelease& osRelease();
    const std::optional<KernelNames>& kernelNames();
    std::optional<std::int64_t> bootInstant();
    std::optional<std::int64_t> installInstant();
    const std::optional<MemoryInfo>& memory();

    std::optional<std::int64_t> findInstallInstant();
    std::optional<unsigned int> readMaxProcesses() const;
    std::optional<unsigned int> readMaxProcessMemoryKiB() const;
    std::optional<unsigned int> countProcesses() const;
    std::optional<unsigned int> countUsers() const;
    std::optional<unsigned int> countUtmpUsers(const char* path) const;
    unsigned int askNodeStatus() const;

    const HostParts& parts_;
    Lazy<std::shared_ptr<const OsRelease>> osRelease_;
    Lazy<std::optional<KernelNames>> kernelNames_;
    Lazy<std::optional<std::int64_t>> bootInstant_;
    Lazy<std::optional<std::int64_t>> installInstant_;
    Lazy<std::optional<MemoryInfo>> memory_;
    Lazy<std::optional<unsigned int>> processes_;
    Lazy<std::optional<unsigned int>> maxProcesses_;
    Lazy<std::optional<unsigned int>> maxProcessMemoryKiB_;
    Lazy<std::optional<unsigned int>> users_;
    Lazy<unsigned int> nodeStatus_;
};

}  // namespace VA::Linux

#endif
