#ifndef PROVIDER_LINUX_RUNNING_OS_H
#define PROVIDER_LINUX_RUNNING_OS_H

#include "Moniker.h"

namespace VA::OSStatusProvider {

/// Maps the ends of KORVA_RunningOS onto each other, by the same rules as InstalledOS. Stateless,
/// and writes no records.
class RunningOS {
  public:
    VA::Moniker getComputerSystemMoniker(VA::Moniker& monikerOS);
    VA::Moniker getOperatingSystemMoniker(VA::Moniker& monikerComputer);
};

}  // namespace VA::OSStatusProvider

#endif
