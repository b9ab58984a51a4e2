#ifndef OSSTATUS_CMPI_RUNNING_OS_H
#define OSSTATUS_CMPI_RUNNING_OS_H

#include "ClassIds.h"
#include "ComputerSystemAssociation.h"
#include "Linux/RunningOS.h"

namespace VA::OSStatusProvider {

class UnitLog;

/// What is KORVA_RunningOS's own.
struct RunningOSDesign {
    using Mapping = RunningOS;

    static constexpr const char* className = "KORVA_RunningOS";
    static constexpr unsigned short classId = runningOSId;
    static constexpr const char* constructor = "CMPIRunningOS";
    static constexpr const char* destructor = "~CMPIRunningOS";
    /// In the order in which paths and instances carry them.
    static constexpr Role roles[] = {
        {"Antecedent", End::operatingSystem},
        {"Dependent", End::computerSystem},
    };

    static const UnitLog& records();
    static void setOwnProperties(Mapping&, CMPIInstance*) {}
};

extern template class ComputerSystemAssociation<RunningOSDesign>;

/// Serves KORVA_RunningOS: the running operating systems of the computer system.
class CMPIRunningOS : public ComputerSystemAssociation<RunningOSDesign> {
  public:
    using ComputerSystemAssociation::ComputerSystemAssociation;
};

}  // namespace VA::OSStatusProvider

#endif
