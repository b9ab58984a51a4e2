#ifndef OSSTATUS_FACADE_PROVIDER_H
#define OSSTATUS_FACADE_PROVIDER_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

/// The factories of the provider behind the facade, as an object manager would call them: each
/// returns its one record, with the broker that it was given last in use.
extern "C" {

CMPIInstanceMI* OperatingSystemProvider_Create_InstanceMI(const CMPIBroker* broker,
                                                          const CMPIContext* context,
                                                          CMPIStatus* status);
CMPIAssociationMI* OperatingSystemProvider_Create_AssociationMI(const CMPIBroker* broker,
                                                                const CMPIContext* context,
                                                                CMPIStatus* status);
}

namespace VA::OSStatusFacade {

/// What the factories leave for the requests.
struct Provider {
    const CMPIBroker* broker = nullptr;
    CMPIInstanceMI* instances = nullptr;
    CMPIAssociationMI* associations = nullptr;
};

}  // namespace VA::OSStatusFacade

#endif
