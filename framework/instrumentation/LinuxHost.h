#ifndef VA_LINUX_HOST_H
#define VA_LINUX_HOST_H

#include <memory>
#include <string>

#include "HostSource.h"

namespace VA {

namespace Linux {
struct HostParts;
}

/// The Linux host that this code runs on: one operating system node. A walk takes one snapshot of
/// it, reads each source at most once, and only when a value that it has to tell is asked for.
/// Starts no process, asks no network, throws nothing but std::bad_alloc.
class LinuxHost final : public HostSource {
  public:
    /// `root` is the folder under which all files are looked for. What the kernel tells without a
    /// file (its names, its clocks, the limits of the process) is that of the running kernel.
    explicit LinuxHost(std::string root = "/");

    /// A host read through other means.
    explicit LinuxHost(Linux::HostParts parts);

    ~LinuxHost() override;

    std::unique_ptr<NodeCursor> openCursor() override;

  private:
    const std::unique_ptr<const Linux::HostParts> parts_;
};

}  // namespace VA

#endif
