#ifndef VA_LINUX_SYSTEM_STATE_H
#define VA_LINUX_SYSTEM_STATE_H

#include <optional>
#include <string>
#include <string_view>

namespace VA::Linux {

/// The manager of the host's services. Any number of threads may ask at the same time.
class SystemManager {
  public:
    virtual ~SystemManager() = default;

    /// The state that the manager says the system is in, such as "running"; nothing where it does
    /// not answer. Never blocks for long.
    virtual std::optional<std::string> systemState() = 0;
};

/// The node status code for a state of systemd's manager; 0 for one that has none.
unsigned int nodeStatusOf(std::string_view systemState);

}  // namespace VA::Linux

#endif
