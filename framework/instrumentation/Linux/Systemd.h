#ifndef FRAMEWORK_INSTRUMENTATION_LINUX_SYSTEMD_H
#define FRAMEWORK_INSTRUMENTATION_LINUX_SYSTEMD_H

#include <chrono>
#include <functional>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>

#include "Files.h"

namespace VA::Linux {

/// The manager of the host's services. Any number of threads may ask at the same time.
class SystemManager {
  public:
    virtual ~SystemManager() = default;

    /// The state that the manager says the system is in, such as "running"; nullopt if it does
    /// not answer. Never blocks for long.
    virtual std::optional<std::string> systemState() = 0;
};

/// The node status code for a state of systemd's manager; 0 for one that has none.
unsigned int nodeStatusOf(std::string_view systemState);

/// The node status code of a host, that of its manager's state; 0 where the manager does not
/// answer, 1 (running) where no systemd runs.
unsigned int readNodeStatus(const HostFiles& files, SystemManager& manager);

struct SdBusFunctions;

/// Asks systemd's manager over the system bus, through libsystemd.
///
/// The library is loaded when it is first needed, and closed with this object; a host without it
/// gives no answer. A question is one connection, one property read and one deadline for
/// everything: a bus that accepts connections and then stays silent costs that long, never more.
class SystemdBus final : public SystemManager {
  public:
    using Lookup = std::function<void*(void* library, const char* symbol)>;

    static constexpr const char* defaultLibrary = "libsystemd.so.0";
    static constexpr std::chrono::milliseconds defaultDeadline{300};

    /// `socket` is the path of the bus's socket; `library` is a name for dlopen; `lookup` finds the
    /// functions in it, dlsym where empty.
    explicit SystemdBus(const std::string& socket, std::string library = defaultLibrary,
                        Lookup lookup = {}, std::chrono::milliseconds deadline = defaultDeadline);
    ~SystemdBus() override;
    SystemdBus(const SystemdBus&) = delete;
    SystemdBus& operator=(const SystemdBus&) = delete;

    std::optional<std::string> systemState() override;

  private:
    bool bindFunctions(SdBusFunctions& functions);
    void* openedLibrary();

    const std::string address_;
    const std::string library_;
    const Lookup lookup_;
    const std::chrono::milliseconds deadline_;
    std::mutex mutex_;
    void* handle_ = nullptr;
};

}  // namespace VA::Linux

#endif
