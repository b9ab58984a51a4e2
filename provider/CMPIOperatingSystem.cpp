// What KORVA_OperatingSystem publishes: keys and properties as tables, so that a reader can hold
// them against the class in the schema.
#include "CMPIOperatingSystem.h"

#include "ElementAdapter-inl.h"

namespace VA::OSStatusProvider {

static const std::string loggerCMPIOperatingSystem("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog log("CMPIOperatingSystem.cpp", loggerCMPIOperatingSystem);

using OS = OperatingSystem;

static constexpr KeyFilter<OS> filters[] = {
    {"CSName", "CSName", OS::CSNameFilter},
    {"Name", "Name", OS::NameFilter},
};

static constexpr Key<OS> keys[] = {
    {"CSCreationClassName", &OS::getCSCreationClassName},
    {"CSName", &OS::getCSName},
    {"CreationClassName", &OS::getCreationClassName},
    {"Name", &OS::getName},
};

static constexpr Property<OS> properties[] = {
    {"Caption", &OS::getCaption},
    {"Description", &OS::getDescription},
    {"ElementName", &OS::getElementName},
    {"InstallDate", &OS::getInstallDate, TextForm::dateTime},
    {"OperationalStatus", &OS::getOperationalStatus},
    {"StatusDescriptions", &OS::getStatusDescriptions},
    {"HealthState", &OS::getHealthState},
    {"PrimaryStatus", &OS::getPrimaryStatus},
    {"DetailedStatus", &OS::getDetailedStatus},
    {"OperatingStatus", &OS::getOperatingStatus},
    {"Status", &OS::getStatus},
    {"CommunicationStatus", &OS::getCommunicationStatus},
    {"EnabledState", &OS::getEnabledState},
    {"OtherEnabledState", &OS::getOtherEnabledState},
    {"RequestedState", &OS::getRequestedState},
    {"EnabledDefault", &OS::getEnabledDefault},
    {"TimeOfLastStateChange", &OS::getTimeOfLastStateChange, TextForm::dateTime},
    {"AvailableRequestedStates", &OS::getAvailableRequestedStates},
    {"TransitioningToState", &OS::getTransitioningToState},
    {"CSCreationClassName", &OS::getCSCreationClassName},
    {"CSName", &OS::getCSName},
    {"CreationClassName", &OS::getCreationClassName},
    {"Name", &OS::getName},
    {"OSType", &OS::getOSType},
    {"OtherTypeDescription", &OS::getOtherTypeDescription},
    {"Version", &OS::getVersion},
    {"LastBootUpTime", &OS::getLastBootUpTime, TextForm::dateTime},
    {"LocalDateTime", &OS::getLocalDateTime, TextForm::dateTime},
    {"CurrentTimeZone", &OS::getCurrentTimeZone},
    {"NumberOfLicensedUsers", &OS::getNumberOfLicensedUsers},
    {"NumberOfUsers", &OS::getNumberOfUsers},
    {"NumberOfProcesses", &OS::getNumberOfProcesses},
    {"MaxNumberOfProcesses", &OS::getMaxNumberOfProcesses},
    {"TotalSwapSpaceSize", &OS::getTotalSwapSpaceSize},
    {"TotalVirtualMemorySize", &OS::getTotalVirtualMemorySize},
    {"FreeVirtualMemory", &OS::getFreeVirtualMemory},
    {"FreePhysicalMemory", &OS::getFreePhysicalMemory},
    {"TotalVisibleMemorySize", &OS::getTotalVisibleMemorySize},
    {"SizeStoredInPagingFiles", &OS::getSizeStoredInPagingFiles},
    {"FreeSpaceInPagingFiles", &OS::getFreeSpaceInPagingFiles},
    {"MaxProcessMemorySize", &OS::getMaxProcessMemorySize},
    {"Distributed", &OS::isDistributed},
    {"MaxProcessesPerUser", &OS::getMaxProcessesPerUser},
};

const ElementTraits<OS> CMPIOperatingSystem::traits = {
    "KORVA_OperatingSystem",
    "CMPIOperatingSystem",
    "~CMPIOperatingSystem",
    filters,
    keys,
    properties,
    true,  // values are shared: "Description", whose getter writes nothing, is published empty
    log,
};

template class ElementAdapter<OperatingSystem>;

}  // namespace VA::OSStatusProvider
