#include "Answers.h"

#include <strings.h>

namespace floorprovider {
namespace {

template <unsigned keyCount>
constexpr Path path(const char* className, const Key (&keys)[keyCount]) {
    return {className, keys, keyCount};
}

template <unsigned keyCount, unsigned propertyCount>
constexpr Answer answer(const char* className, const Key (&keys)[keyCount],
                        const Property (&properties)[propertyCount]) {
    return {path(className, keys), properties, propertyCount};
}

constexpr Property text(const char* name, const char* value) {
    return {name, CMPI_chars, value};
}

constexpr Property moment(const char* name, const char* value) {
    return {name, CMPI_dateTime, value};
}

constexpr Property number(const char* name, CMPIType type, unsigned long long value) {
    return {name, type, nullptr, value};
}

constexpr Property reference(const char* name, const Path& value) {
    return {name, CMPI_ref, nullptr, 0, &value};
}

template <unsigned length>
constexpr Property list(const char* name, const unsigned short (&values)[length]) {
    return {name, CMPI_uint16A, nullptr, 0, nullptr, values, length};
}

constexpr char computerName[] = "simulated.example";
constexpr char systemName[] = "Simulated Linux";

constexpr Key computerKeys[] = {
    {"CreationClassName", "KORVA_ComputerSystem", nullptr},
    {"Name", computerName, nullptr},
};
constexpr Property computerProperties[] = {
    text("CreationClassName", "KORVA_ComputerSystem"),
    text("Name", computerName),
};

constexpr Key systemKeys[] = {
    {"CSCreationClassName", "KORVA_ComputerSystem", nullptr},
    {"CSName", computerName, nullptr},
    {"CreationClassName", "KORVA_OperatingSystem", nullptr},
    {"Name", systemName, nullptr},
};
constexpr unsigned short operationalStatus[] = {2, 11};
constexpr Property systemProperties[] = {
    text("CSCreationClassName", "KORVA_ComputerSystem"),
    text("CSName", computerName),
    text("CreationClassName", "KORVA_OperatingSystem"),
    text("Name", systemName),
    text("Description", ""),
    moment("InstallDate", "20230610090807.000000+000"),
    list("OperationalStatus", operationalStatus),
    number("HealthState", CMPI_uint16, 5),
    text("Status", "OK"),
    number("EnabledState", CMPI_uint16, 2),
    number("OSType", CMPI_uint16, 36),
    text("Version", "12.5"),
    moment("LastBootUpTime", "20240229235958.000000+000"),
    number("NumberOfLicensedUsers", CMPI_uint32, 0),
    number("NumberOfUsers", CMPI_uint32, 3),
    number("NumberOfProcesses", CMPI_uint32, 211),
    number("MaxNumberOfProcesses", CMPI_uint32, 32768),
    number("TotalSwapSpaceSize", CMPI_uint64, 2097152),
    number("TotalVirtualMemorySize", CMPI_uint64, 18874368),
    number("FreeVirtualMemory", CMPI_uint64, 13631488),
    number("FreePhysicalMemory", CMPI_uint64, 12058624),
    number("TotalVisibleMemorySize", CMPI_uint64, 16777216),
    number("SizeStoredInPagingFiles", CMPI_uint64, 2097151),
    number("FreeSpaceInPagingFiles", CMPI_uint64, 1572864),
    number("MaxProcessMemorySize", CMPI_uint64, 67108864),
    number("Distributed", CMPI_boolean, 0),
};

constexpr Key capabilitiesKeys[] = {{"InstanceID", systemName, nullptr}};
constexpr Property capabilitiesProperties[] = {
    text("InstanceID", systemName),
    text("ElementName", systemName),
    number("ElementNameEditSupported", CMPI_boolean, 0),
    number("HostShutdownBehavior", CMPI_uint16, 3),
};

constexpr Path computerPath = path("KORVA_ComputerSystem", computerKeys);
constexpr Path systemPath = path("KORVA_OperatingSystem", systemKeys);
constexpr Path capabilitiesPath = path("KORVA_OperatingSystemCapabilities", capabilitiesKeys);

constexpr Key installedKeys[] = {
    {"GroupComponent", nullptr, &computerPath},
    {"PartComponent", nullptr, &systemPath},
};
constexpr Property installedProperties[] = {
    reference("GroupComponent", computerPath),
    reference("PartComponent", systemPath),
};

constexpr Key runningKeys[] = {
    {"Antecedent", nullptr, &systemPath},
    {"Dependent", nullptr, &computerPath},
};
constexpr Property runningProperties[] = {
    reference("Antecedent", systemPath),
    reference("Dependent", computerPath),
};

constexpr Key elementKeys[] = {
    {"ManagedElement", nullptr, &systemPath},
    {"Capabilities", nullptr, &capabilitiesPath},
};
constexpr Property elementProperties[] = {
    reference("ManagedElement", systemPath),
    reference("Capabilities", capabilitiesPath),
};

constexpr Answer computer = answer("KORVA_ComputerSystem", computerKeys, computerProperties);
constexpr Answer served[] = {
    answer("KORVA_OperatingSystem", systemKeys, systemProperties),
    answer("KORVA_OperatingSystemCapabilities", capabilitiesKeys, capabilitiesProperties),
    answer("KORVA_InstalledOS", installedKeys, installedProperties),
    answer("KORVA_RunningOS", runningKeys, runningProperties),
    answer("KORVA_OSElementCapabilities", elementKeys, elementProperties),
};

struct Hop {
    const char* assocClass;
    const char* sourceClass;
    const Answer* farEnd;
};

constexpr Hop hops[] = {
    {"KORVA_InstalledOS", "KORVA_ComputerSystem", &served[0]},
    {"KORVA_InstalledOS", "KORVA_OperatingSystem", &computer},
    {"KORVA_RunningOS", "KORVA_ComputerSystem", &served[0]},
    {"KORVA_RunningOS", "KORVA_OperatingSystem", &computer},
    {"KORVA_OSElementCapabilities", "KORVA_OperatingSystem", &served[1]},
    {"KORVA_OSElementCapabilities", "KORVA_OperatingSystemCapabilities", &served[0]},
};

}  // namespace

const Answer* answerOf(const char* className) {
    for (const Answer& answer : served)
        if (strcasecmp(answer.path.className, className) == 0) return &answer;
    return nullptr;
}

const Answer* farEndOf(const char* sourceClass, const char* assocClass) {
    for (const Hop& hop : hops)
        if (strcasecmp(hop.assocClass, assocClass) == 0 &&
            strcasecmp(hop.sourceClass, sourceClass) == 0)
            return hop.farEnd;
    return nullptr;
}

}  // namespace floorprovider
