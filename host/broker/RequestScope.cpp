#include "host/broker/RequestScope.h"

namespace cmpihost {

RequestScope::RequestScope(BrokerCore& core, bool attached) : core_(core) {
    Scope*& innermost = innermostScope();
    scope_.core = &core;
    scope_.outer = innermost;
    scope_.attached = attached ? this : nullptr;
    scope_.arena = core.threadArena();
    if (scope_.arena == nullptr) scope_.arena = &arena_.emplace();
    innermost = &scope_;
}

void RequestScope::end() noexcept {
    if (!open_) return;
    open_ = false;
    innermostScope() = scope_.outer;
    if (arena_) core_.quarantine(arena_->retireAll(core_.options().quarantine));
}

RequestScope* RequestScope::attachedTo(const BrokerCore& core) noexcept {
    const Scope* const innermost = innermostScope();
    return innermost != nullptr && innermost->core == &core ? innermost->attached : nullptr;
}

}  // namespace cmpihost
