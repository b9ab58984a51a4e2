#ifndef FRAMEWORK_INSTRUMENTATION_LINUX_HOST_H
#define FRAMEWORK_INSTRUMENTATION_LINUX_HOST_H

#include <memory>

#include "HostSource.h"
#include "Linux/Files.h"
#include "Linux/Kernel.h"
#include "Linux/Systemd.h"

namespace VA {

namespace Linux {

/// What a Linux host is read through. None is null.
struct HostParts {
    std::shared_ptr<const HostFiles> files;
    std::shared_ptr<const Kernel> kernel;
    std::shared_ptr<SystemManager> systemManager;
};

}  // namespace Linux

/// A Linux host: one operating system node. A walk takes one snapshot of it, reads each source at
/// most once, and only when a value from it is asked for. Starts no process, asks no network,
/// throws nothing but std::bad_alloc.
class LinuxHost final : public HostSource {
  public:
    explicit LinuxHost(Linux::HostParts parts);
    ~LinuxHost() override;

    std::unique_ptr<NodeCursor> openCursor() override;

  private:
    struct State;
    const std::unique_ptr<State> state_;
};

}  // namespace VA

#endif
