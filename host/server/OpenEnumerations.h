#ifndef HOST_SERVER_OPEN_ENUMERATIONS_H
#define HOST_SERVER_OPEN_ENUMERATIONS_H

#include <chrono>
#include <cstddef>
#include <deque>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <variant>
#include <vector>

#include "host/broker/Value.h"

/// Enumerations that clients pull piece by piece.
namespace cmpihost::server {

/// What is left of an enumeration.
struct PulledResults {
    /// Instances with their paths, or paths alone.
    std::vector<InstanceValue> instances{};
    std::vector<ObjectPathValue> paths{};
    bool classOrigin = false;
};

/// The contexts that are open. Any threads may call.
class OpenEnumerations {
  public:
    using Clock = std::chrono::steady_clock;

    static constexpr std::size_t most = 64;
    static constexpr std::chrono::seconds defaultTimeout{30};
    static constexpr std::chrono::seconds longestTimeout{90};

  private:
};

}  // namespace cmpihost::server

#endif
