#ifndef PROVIDER_CMPI_INSTALLED_OS_H
#define PROVIDER_CMPI_INSTALLED_OS_H

#include "ComputerSystemAssociation.h"

namespace VA::OSStatusProvider {

/// Serves KORVA_InstalledOS: the installed operating systems of the computer system.
class CMPIInstalledOS : public ComputerSystemAssociation {
  public:
    static const AssociationTraits traits;

    /// Throws as ComputerSystemAssociation.
    CMPIInstalledOS(const CMPIBroker* _broker, const CMPIContext* _context,
                    const CMPIObjectPath* objectPath)
        : ComputerSystemAssociation(traits, _broker, _context, objectPath) {}
};

}  // namespace VA::OSStatusProvider

#endif
