#include "CMPIOperatingSystem.h"

#include "ElementAdapterOperations.h"

namespace VA::OSStatusProvider {

static const std::string loggerCMPIOperatingSystem("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog unitLog("CMPIOperatingSystem.cpp", loggerCMPIOperatingSystem);

using OS = OperatingSystem;

static constexpr Key<OS> keyTable[] = {
    {"CSCreationClassName", &OS::getCSCreationClassName},
    {"CSName", &OS::getCSName},
    {"CreationClassName", &OS::getCreationClassName},
    {"Name", &OS::getName},
};

static constexpr Property<OS> propertyTable[] = {
    property<&OS::getCaption>("Caption"),
    property<&OS::getDescription>("Description"),
    property<&OS::getElementName>("ElementName"),
    dateTime<OS, &OS::getInstallDate>("InstallDate"),
    property<&OS::getOperationalStatus>("OperationalStatus"),
    property<&OS::getStatusDescriptions>("StatusDescriptions"),
    property<&OS::getHealthState>("HealthState"),
    property<&OS::getPrimaryStatus>("PrimaryStatus"),
    property<&OS::getDetailedStatus>("DetailedStatus"),
    property<&OS::getOperatingStatus>("OperatingStatus"),
    property<&OS::getStatus>("Status"),
    property<&OS::getCommunicationStatus>("CommunicationStatus"),
    property<&OS::getEnabledState>("EnabledState"),
    property<&OS::getOtherEnabledState>("OtherEnabledState"),
    property<&OS::getRequestedState>("RequestedState"),
    property<&OS::getEnabledDefault>("EnabledDefault"),
    dateTime<OS, &OS::getTimeOfLastStateChange>("TimeOfLastStateChange"),
    property<&OS::getAvailableRequestedStates>("AvailableRequestedStates"),
    property<&OS::getTransitioningToState>("TransitioningToState"),
    property<&OS::getCSCreationClassName>("CSCreationClassName"),
    property<&OS::getCSName>("CSName"),
    property<&OS::getCreationClassName>("CreationClassName"),
    property<&OS::getName>("Name"),
    property<&OS::getOSType>("OSType"),
    property<&OS::getOtherTypeDescription>("OtherTypeDescription"),
    property<&OS::getVersion>("Version"),
    dateTime<OS, &OS::getLastBootUpTime>("LastBootUpTime"),
    dateTime<OS, &OS::getLocalDateTime>("LocalDateTime"),
    property<&OS::getCurrentTimeZone>("CurrentTimeZone"),
    property<&OS::getNumberOfLicensedUsers>("NumberOfLicensedUsers"),
    property<&OS::getNumberOfUsers>("NumberOfUsers"),
    property<&OS::getNumberOfProcesses>("NumberOfProcesses"),
    property<&OS::getMaxNumberOfProcesses>("MaxNumberOfProcesses"),
    property<&OS::getTotalSwapSpaceSize>("TotalSwapSpaceSize"),
    property<&OS::getTotalVirtualMemorySize>("TotalVirtualMemorySize"),
    property<&OS::getFreeVirtualMemory>("FreeVirtualMemory"),
    property<&OS::getFreePhysicalMemory>("FreePhysicalMemory"),
    property<&OS::getTotalVisibleMemorySize>("TotalVisibleMemorySize"),
    property<&OS::getSizeStoredInPagingFiles>("SizeStoredInPagingFiles"),
    property<&OS::getFreeSpaceInPagingFiles>("FreeSpaceInPagingFiles"),
    property<&OS::getMaxProcessMemorySize>("MaxProcessMemorySize"),
    property<&OS::isDistributed>("Distributed"),
    property<&OS::getMaxProcessesPerUser>("MaxProcessesPerUser"),
};

const UnitLog& OperatingSystemDesign::records() {
    return unitLog;
}

Rows<Key<OperatingSystemDesign::Element>> OperatingSystemDesign::keys() {
    return keyTable;
}

Rows<Property<OperatingSystemDesign::Element>> OperatingSystemDesign::properties() {
    return propertyTable;
}

template class ElementAdapter<OperatingSystemDesign>;

}  // namespace VA::OSStatusProvider
