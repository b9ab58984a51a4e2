// The mapping of InstalledOS without its records, which this class never had.
#include "RunningOS.h"

#include "KeyMapping.h"

namespace VA::OSStatusProvider {

VA::Moniker RunningOS::getComputerSystemMoniker(VA::Moniker& monikerOS) {
    return computerSystemMonikerOf(monikerOS);
}

VA::Moniker RunningOS::getOperatingSystemMoniker(VA::Moniker& monikerComputer) {
    return operatingSystemMonikerOf(monikerComputer);
}

}  // namespace VA::OSStatusProvider
