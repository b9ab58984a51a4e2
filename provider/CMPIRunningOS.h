#ifndef PROVIDER_CMPI_RUNNING_OS_H
#define PROVIDER_CMPI_RUNNING_OS_H

#include "ComputerSystemAssociation.h"

namespace VA::OSStatusProvider {

/// Serves KORVA_RunningOS: the running operating systems of the computer system.
class CMPIRunningOS : public ComputerSystemAssociation {
  public:
    static const AssociationTraits traits;

    /// Throws as ComputerSystemAssociation.
    CMPIRunningOS(const CMPIBroker* _broker, const CMPIContext* _context,
                  const CMPIObjectPath* objectPath)
        : ComputerSystemAssociation(traits, _broker, _context, objectPath) {}
};

}  // namespace VA::OSStatusProvider

#endif
