// Who answers a provider that asks the object manager for objects of other classes.
#pragma once

#include "host/broker/Operation.h"

namespace cmpihost {

/// What a service answers to an up-call.
struct UpcallAnswer : OperationResult {
    /// For enumerations: the k-th getNext (from 1) fails with `failRc`; 0: none.
    unsigned failAt = 0;
    CMPIrc failRc = CMPI_RC_ERR_FAILED;
};

class Broker;

/// Stands for the provider of one or more classes. Register it with Broker::route. Up-calls arrive
/// on the thread of the request; a service that several threads may reach at once must cope with
/// that.
class UpcallService {
  public:
    virtual ~UpcallService() = default;

    /// Answers one operation. An rc other than CMPI_RC_OK goes to the caller with a null object.
    virtual UpcallAnswer perform(Broker& broker, const OperationRequest& request) = 0;

  protected:
    UpcallService() = default;
    UpcallService(const UpcallService&) = default;
    UpcallService& operator=(const UpcallService&) = default;
};

}  // namespace cmpihost
