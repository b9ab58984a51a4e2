// Whole requests against the provider's handlers.
#include "fuzz/RequestCheck.h"

// The provider's factories, as an object manager looks them up.
extern "C" {
CMPIInstanceMI* OperatingSystemProvider_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                          CMPIStatus*);
CMPIAssociationMI* OperatingSystemProvider_Create_AssociationMI(const CMPIBroker*,
                                                                const CMPIContext*, CMPIStatus*);
}

namespace {

cmpihost::ManagementInterfaces create(const CMPIBroker* broker) {
    return {OperatingSystemProvider_Create_InstanceMI(broker, nullptr, nullptr),
            OperatingSystemProvider_Create_AssociationMI(broker, nullptr, nullptr)};
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::runRequest(data, size, create, fuzz::checkEnding);
    return 0;
}
