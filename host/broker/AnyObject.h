// Objects whose kind is only known at run time. Internal.
#pragma once

#include "host/broker/BrokerCore.h"

namespace cmpihost {

/// A CMPI object whatever its kind.
struct AnyObject {
    const Shell& shell;
    /// "CMPIInstance" and so on.
    const char* kind;
    /// A rendering for people.
    std::string text;
};

/// Null, retired and foreign pointers are violations and throw Failure.
AnyObject anyObject(const void* handle, const CallName& call);

}  // namespace cmpihost
