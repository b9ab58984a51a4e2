// Factories that misbehave, each in its own way, under provider names of their own.
#include <cmpi/cmpift.h>

#include <stdexcept>

namespace {

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return {CMPI_RC_ERR_FAILED, nullptr};
}

CMPIInstanceMIFT tableOf(int ftVersion, int miVersion) {
    CMPIInstanceMIFT table{};
    table.ftVersion = ftVersion;
    table.miVersion = miVersion;
    table.miName = "instanceBad";
    return table;
}

CMPIInstanceMIFT lowVersion = tableOf(1, 1);
CMPIInstanceMIFT highMi = tableOf(100, 200);
CMPIInstanceMIFT emptySlots = [] {
    CMPIInstanceMIFT table = tableOf(200, 200);
    table.cleanup = cleanup;
    table.miName = nullptr;
    return table;
}();

}  // namespace

CMPI_EXTERN_C CMPIInstanceMI* Null_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                     CMPIStatus*) {
    return nullptr;
}

CMPI_EXTERN_C CMPIInstanceMI* Refusing_Create_InstanceMI(const CMPIBroker* broker,
                                                         const CMPIContext*, CMPIStatus* rc) {
    static CMPIInstanceMI mi = {nullptr, &lowVersion};
    *rc = {CMPI_RC_ERR_ACCESS_DENIED, CMNewString(broker, "not today", nullptr)};
    return &mi;
}

CMPI_EXTERN_C CMPIInstanceMI* Throwing_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                         CMPIStatus*) {
    throw std::runtime_error("no such luck");
}

CMPI_EXTERN_C CMPIInstanceMI* NoTable_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                        CMPIStatus*) {
    static CMPIInstanceMI mi = {nullptr, nullptr};
    return &mi;
}

CMPI_EXTERN_C CMPIInstanceMI* LowVersion_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                           CMPIStatus*) {
    static CMPIInstanceMI mi = {nullptr, &lowVersion};
    return &mi;
}

CMPI_EXTERN_C CMPIInstanceMI* HighMi_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                       CMPIStatus*) {
    static CMPIInstanceMI mi = {nullptr, &highMi};
    return &mi;
}

CMPI_EXTERN_C CMPIInstanceMI* EmptySlots_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                           CMPIStatus*) {
    static CMPIInstanceMI mi = {nullptr, &emptySlots};
    return &mi;
}
