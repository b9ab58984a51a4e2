#include "CMPIInstalledOS.h"

#include "ComputerSystemAssociationOperations.h"

namespace VA::OSStatusProvider {

static const std::string loggerCMPIInstalledOS("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog unitLog("CMPIInstalledOS.cpp", loggerCMPIInstalledOS);

const UnitLog& InstalledOSDesign::records() {
    return unitLog;
}

void InstalledOSDesign::setOwnProperties(Mapping& mapping, CMPIInstance* instance) {
    bool primary;
    if (mapping.isPrimaryOS(primary))
        VA::ProviderUtilities::setProperty(instance, "PrimaryOS", primary);
}

template class ComputerSystemAssociation<InstalledOSDesign>;

}  // namespace VA::OSStatusProvider
