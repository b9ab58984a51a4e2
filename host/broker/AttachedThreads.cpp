// The part of CMPIBrokerFT that lets threads of a provider use the broker: each gets a scope of its
// own, which holds what the thread makes.
#include "host/broker/Conversion.h"

namespace cmpihost {

namespace {

/// A clone, since the thread may still use it when the request that prepared it has ended.
CMPIContext* prepareAttachThread(BrokerCore& core, const CallName& call,
                                 const CMPIContext* context) {
    return core.makeClone<CMPIContext>(fromHandle(context, call).body);
}

CMPIStatus attachThread(BrokerCore& core, const CallName& call, const CMPIContext* context) {
    fromHandle(context, call);
    // detachThread deletes it, on this thread.
    std::make_unique<ObjectScope>(core, ObjectScope::Kind::AttachedThread).release();
    return statusOf(CMPI_RC_OK);
}

CMPIStatus detachThread(BrokerCore& core, const CallName& call, const CMPIContext* context) {
    const Object<CMPIContext>& object = fromHandle(context, call);
    ObjectScope* const innermost = ObjectScope::innermost();
    if (innermost == nullptr || &innermost->core() != &core ||
        innermost->kind() != ObjectScope::Kind::AttachedThread) {
        core.report("detachThread on a thread that is not attached");
        return statusOf(CMPI_RC_ERR_FAILED);
    }
    // The scope ends in any case: a wrong context does not make the thread attached again.
    const std::unique_ptr<ObjectScope> scope(innermost);
    if (object.arena() != nullptr) {
        core.report("detachThread with a context that is none of prepareAttachThread");
        return statusOf(CMPI_RC_ERR_INVALID_HANDLE);
    }
    core.releaseObject(object);
    return statusOf(CMPI_RC_OK);
}

}  // namespace

void bindAttachment(CMPIBrokerFT& table) {
    using FT = CMPIBrokerFT;
    bind<&FT::prepareAttachThread, &prepareAttachThread>(table, "prepareAttachThread");
    bind<&FT::attachThread, &attachThread>(table, "attachThread");
    bind<&FT::detachThread, &detachThread>(table, "detachThread");
}

}  // namespace cmpihost
