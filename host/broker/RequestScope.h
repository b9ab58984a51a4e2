// Opens and ends the scope of a thread's request. Internal.
#pragma once

#include "host/broker/BrokerCore.h"

#include <optional>

namespace cmpihost {

/// A scope on the calling thread from construction to end(). The outermost one of a broker holds
/// the objects.
class RequestScope {
  public:
    RequestScope(BrokerCore& core, bool attached);
    ~RequestScope() { end(); }
    RequestScope(const RequestScope&) = delete;
    RequestScope& operator=(const RequestScope&) = delete;

    void end() noexcept;

    BrokerCore& core() const noexcept { return core_; }
    const std::vector<std::string>& violations() const noexcept { return scope_.violations; }

    /// The scope that attachThread opened, if it is the innermost one of the thread and of that
    /// broker.
    static RequestScope* attachedTo(const BrokerCore& core) noexcept;

  private:
    BrokerCore& core_;
    std::optional<Arena> arena_;
    Scope scope_;
    bool open_ = true;
};

}  // namespace cmpihost
