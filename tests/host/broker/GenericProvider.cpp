// A library that serves every provider name through one factory; the factory under a name of its
// own must not be taken instead.
#include <cmpi/cmpift.h>

#include <string>

namespace {

CMPIInstanceMIFT table{};

}  // namespace

extern "C" {
CMPI_EXPORT char requestedName[64] = "";
}

CMPI_EXTERN_C CMPIInstanceMI* _Generic_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                         const char* name, CMPIStatus*) {
    static CMPIInstanceMI mi = {nullptr, &table};
    table.ftVersion = CMPICurrentVersion;
    table.miVersion = CMPICurrentVersion;
    table.miName = requestedName;
    std::string(name).copy(requestedName, sizeof requestedName - 1);
    return &mi;
}

CMPI_EXTERN_C CMPIInstanceMI* Named_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                      CMPIStatus*) {
    return nullptr;
}
