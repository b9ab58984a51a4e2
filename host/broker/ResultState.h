// What a ResultCollector has taken. Internal.
#pragma once

#include "host/broker/Value.h"

#include <memory>
#include <vector>

namespace cmpihost {

/// Makes the calls of one kind fail from the n-th on.
struct ReturnFault {
    unsigned from = 0;
    CMPIrc rc = CMPI_RC_OK;
    unsigned calls = 0;

    /// Counts a call and says how it answers.
    CMPIrc onCall() noexcept {
        ++calls;
        return from != 0 && calls >= from ? rc : CMPI_RC_OK;
    }
};

struct ResultState {
    ReturnFault instanceFault{};
    ReturnFault pathFault{};
    ReturnFault doneFault{};
    std::vector<std::shared_ptr<InstanceValue>> instances{};
    std::vector<std::shared_ptr<ObjectPathValue>> paths{};
    std::vector<std::shared_ptr<InstanceValue>> refusedInstances{};
    std::vector<std::shared_ptr<ObjectPathValue>> refusedPaths{};
    std::vector<Value> data{};
};

}  // namespace cmpihost
