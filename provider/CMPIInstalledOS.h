#ifndef OSSTATUS_CMPI_INSTALLED_OS_H
#define OSSTATUS_CMPI_INSTALLED_OS_H

#include "ClassIds.h"
#include "ComputerSystemAssociation.h"
#include "Linux/InstalledOS.h"

namespace VA::OSStatusProvider {

class UnitLog;

/// What is KORVA_InstalledOS's own.
struct InstalledOSDesign {
    using Mapping = InstalledOS;

    static constexpr const char* className = "KORVA_InstalledOS";
    static constexpr unsigned short classId = installedOSId;
    static constexpr const char* constructor = "CMPIInstalledOS";
    static constexpr const char* destructor = "~CMPIInstalledOS";
    /// In the order in which paths and instances carry them.
    static constexpr Role roles[] = {
        {"GroupComponent", End::computerSystem},
        {"PartComponent", End::operatingSystem},
    };

    static const UnitLog& records();
    /// Asks for "PrimaryOS", which is never known.
    static void setOwnProperties(Mapping& mapping, CMPIInstance* instance);
};

extern template class ComputerSystemAssociation<InstalledOSDesign>;

/// Serves KORVA_InstalledOS: the installed operating systems of the computer system.
class CMPIInstalledOS : public ComputerSystemAssociation<InstalledOSDesign> {
  public:
    using ComputerSystemAssociation::ComputerSystemAssociation;
};

}  // namespace VA::OSStatusProvider

#endif
