#include "InstalledOS.h"

#include "KeyMapping.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

static const std::string loggerInstalledOS("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog records("Linux/InstalledOS.cpp", loggerInstalledOS);

VA::Moniker InstalledOS::getComputerSystemMoniker(VA::Moniker& monikerOS) {
    const ParameterList parameters(" monikerOS=", &monikerOS);
    records.entering(parameters);
    VA::Moniker computerSystem = computerSystemMonikerOf(monikerOS);
    records.exiting(parameters);
    return computerSystem;
}

VA::Moniker InstalledOS::getOperatingSystemMoniker(VA::Moniker& monikerComputer) {
    const ParameterList parameters(" monikerComputer=", &monikerComputer);
    records.entering(parameters);
    VA::Moniker operatingSystem = operatingSystemMonikerOf(monikerComputer);
    records.exiting(parameters);
    return operatingSystem;
}

bool InstalledOS::isPrimaryOS(bool&) {
    return false;
}

}  // namespace VA::OSStatusProvider
