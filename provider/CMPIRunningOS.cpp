// What KORVA_RunningOS has of its own: names and roles.
#include "CMPIRunningOS.h"

#include "ClassIds.h"
#include "Linux/RunningOS.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

static const std::string loggerCMPIRunningOS("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog log("CMPIRunningOS.cpp", loggerCMPIRunningOS);

const AssociationTraits CMPIRunningOS::traits = {
    "KORVA_RunningOS",
    runningOSId,
    "CMPIRunningOS",
    "~CMPIRunningOS",
    {{"Antecedent", End::operatingSystem}, {"Dependent", End::computerSystem}},
    [](VA::Moniker& operatingSystem) {
        return RunningOS().getComputerSystemMoniker(operatingSystem);
    },
    [](VA::Moniker& computerSystem) {
        return RunningOS().getOperatingSystemMoniker(computerSystem);
    },
    nullptr,  // no properties of its own
    log,
};

}  // namespace VA::OSStatusProvider
