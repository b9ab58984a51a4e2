#include "CMPIRunningOS.h"

#include "ComputerSystemAssociationOperations.h"

namespace VA::OSStatusProvider {

static const std::string loggerCMPIRunningOS("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog unitLog("CMPIRunningOS.cpp", loggerCMPIRunningOS);

const UnitLog& RunningOSDesign::records() {
    return unitLog;
}

template class ComputerSystemAssociation<RunningOSDesign>;

}  // namespace VA::OSStatusProvider
