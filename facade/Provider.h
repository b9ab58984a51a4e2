#ifndef OSSTATUS_FACADE_PROVIDER_H
#define OSSTATUS_FACADE_PROVIDER_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <atomic>

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

/// What the factories leave for the requests. An object manager may call a factory again, for
/// another class, while threads serve requests.
struct Provider {
    std::atomic<const CMPIBroker*> broker = nullptr;
    std::atomic<CMPIInstanceMI*> instances = nullptr;
    std::atomic<CMPIAssociationMI*> associations = nullptr;
};

}  // namespace VA::OSStatusFacade

#endif
