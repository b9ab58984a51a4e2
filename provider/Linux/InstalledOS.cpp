// The mapping itself is shared with RunningOS; this one writes records of it.
#include "InstalledOS.h"

#include "KeyMapping.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

static const std::string loggerInstalledOS("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog log("Linux/InstalledOS.cpp", loggerInstalledOS);

VA::Moniker InstalledOS::getComputerSystemMoniker(VA::Moniker& monikerOS) {
    const ParameterList parameters(" monikerOS=", &monikerOS);
    log.entering(parameters);
    VA::Moniker computerSystem = computerSystemMonikerOf(monikerOS);
    log.exiting(parameters);
    return computerSystem;
}

VA::Moniker InstalledOS::getOperatingSystemMoniker(VA::Moniker& monikerComputer) {
    const ParameterList parameters(" monikerComputer=", &monikerComputer);
    log.entering(parameters);
    VA::Moniker operatingSystem = operatingSystemMonikerOf(monikerComputer);
    log.exiting(parameters);
    return operatingSystem;
}

bool InstalledOS::isPrimaryOS(bool&) {
    return false;
}

}  // namespace VA::OSStatusProvider
