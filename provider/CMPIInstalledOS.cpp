// What KORVA_InstalledOS has of its own: names, roles, and the question for "PrimaryOS", which is
// asked for the day when it can be answered.
#include "CMPIInstalledOS.h"

#include "ClassIds.h"
#include "Linux/InstalledOS.h"
#include "ProviderUtilities.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

static const std::string loggerCMPIInstalledOS("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog log("CMPIInstalledOS.cpp", loggerCMPIInstalledOS);

const AssociationTraits CMPIInstalledOS::traits = {
    "KORVA_InstalledOS",
    installedOSId,
    "CMPIInstalledOS",
    "~CMPIInstalledOS",
    {{"GroupComponent", End::computerSystem}, {"PartComponent", End::operatingSystem}},
    [](VA::Moniker& operatingSystem) {
        return InstalledOS().getComputerSystemMoniker(operatingSystem);
    },
    [](VA::Moniker& computerSystem) {
        return InstalledOS().getOperatingSystemMoniker(computerSystem);
    },
    [](CMPIInstance* instance) {
        bool primary;
        if (InstalledOS().isPrimaryOS(primary)) {
            VA::ProviderUtilities::setProperty(instance, "PrimaryOS", primary);
        }
    },
    log,
};

}  // namespace VA::OSStatusProvider
