#ifndef PROVIDER_LINUX_INSTALLED_OS_H
#define PROVIDER_LINUX_INSTALLED_OS_H

#include "Moniker.h"

namespace VA::OSStatusProvider {

/// Maps the ends of KORVA_InstalledOS onto each other, by their keys. Stateless; any number of
/// threads may use one each.
class InstalledOS {
  public:
    /// The far end's identity: see computerSystemMonikerOf and operatingSystemMonikerOf. The input
    /// is only read; its selected key changes. Throws VA::FrameworkException when it lacks the key.
    VA::Moniker getComputerSystemMoniker(VA::Moniker& monikerOS);
    VA::Moniker getOperatingSystemMoniker(VA::Moniker& monikerComputer);

    /// Whether the operating system is its computer's primary one: never known, so always false,
    /// and `primary` is left alone.
    bool isPrimaryOS(bool& primary);
};

}  // namespace VA::OSStatusProvider

#endif
