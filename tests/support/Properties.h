#ifndef TESTS_SUPPORT_PROPERTIES_H
#define TESTS_SUPPORT_PROPERTIES_H

#include <cmpi/cmpidt.h>

/// A property that KORVA_OperatingSystem publishes for a host that tells everything.
struct PublishedProperty {
    const char* name;
    CMPIType type;
    const char* value;  ///< for the plausible node of a simulated host, as cmpihost::Value tells it
    unsigned int id = 0;      ///< its number in VA::NodeLexicon; 0: the provider makes it
    const char* source = "";  ///< the file or directory of a Linux host that it comes from
    /// What the host gives, where that is another text than `value`.
    const char* hostValue = nullptr;
    /// A shell command that prints it, to hold this machine's value against; null where
    /// RealMachineTest reads it by other means.
    const char* command = nullptr;

    constexpr bool isText() const { return type == CMPI_string || type == CMPI_dateTime; }
    constexpr bool isFlag() const { return type == CMPI_boolean; }
    constexpr const char* hostText() const { return hostValue == nullptr ? value : hostValue; }
};

/// In the order in which they are published: creating the instance sets the keys first. The one
/// list for all tests and for the baseline of the benchmarks; values differ wherever a mix-up could
/// hide, and dates are those of a host in UTC.
inline constexpr PublishedProperty operatingSystemProperties[] = {
    {"CSCreationClassName", CMPI_string, "KORVA_ComputerSystem"},
    {"CSName", CMPI_string, "simulated.example"},
    {"CreationClassName", CMPI_string, "KORVA_OperatingSystem"},
    {"Name", CMPI_string, "Simulated Linux", 108, "etc/os-release", nullptr,
     "eval \"$(cat /etc/os-release 2>/dev/null || cat /usr/lib/os-release 2>/dev/null)\"; "
     "printf %s \"${NAME:-$(uname -s)}\""},
    {"Description", CMPI_string, ""},
    {"InstallDate", CMPI_dateTime, "20230610090807.000000+000", 139, "(dates)",
     "2023-06-10-09:08:07"},
    {"OperationalStatus", CMPI_uint16A, "{2, 11}"},
    {"HealthState", CMPI_uint16, "5"},
    {"Status", CMPI_string, "OK"},
    {"EnabledState", CMPI_uint16, "2"},
    {"OSType", CMPI_uint16, "36", 128, "", "35"},
    {"Version", CMPI_string, "12.5", 134, "etc/os-release", nullptr,
     "eval \"$(cat /etc/os-release 2>/dev/null || cat /usr/lib/os-release 2>/dev/null)\"; "
     "printf %s \"${VERSION_ID:-${BUILD_ID:-$(uname -r)}}\""},
    {"LastBootUpTime", CMPI_dateTime, "20240229235958.000000+000", 141, "proc/stat",
     "2024-02-29-23:59:58"},
    {"NumberOfLicensedUsers", CMPI_uint32, "0", 146},
    {"NumberOfUsers", CMPI_uint32, "3", 145, "run/systemd/sessions"},
    {"NumberOfProcesses", CMPI_uint32, "211", 144, "proc"},
    {"MaxNumberOfProcesses", CMPI_uint32, "32768", 142, "proc/sys/kernel", nullptr,
     "cd /proc/sys/kernel && cat pid_max threads-max 2>/dev/null | sort -n | head -n 1"},
    {"TotalSwapSpaceSize", CMPI_uint64, "2097152", 151, "proc/meminfo"},
    {"TotalVirtualMemorySize", CMPI_uint64, "18874368", 147, "proc/meminfo"},
    {"FreeVirtualMemory", CMPI_uint64, "13631488", 148, "proc/meminfo"},
    {"FreePhysicalMemory", CMPI_uint64, "12058624", 149, "proc/meminfo"},
    {"TotalVisibleMemorySize", CMPI_uint64, "16777216", 150, "proc/meminfo"},
    {"SizeStoredInPagingFiles", CMPI_uint64, "2097151", 152, "proc/meminfo"},
    {"FreeSpaceInPagingFiles", CMPI_uint64, "1572864", 153, "proc/meminfo"},
    {"MaxProcessMemorySize", CMPI_uint64, "67108864", 143, "", nullptr,
     "ulimit -S -v | sed s/unlimited/0/"},
    {"Distributed", CMPI_boolean, "false", 140},
};

/// The largest number that a property of VA::NodeLexicon has.
constexpr unsigned int largestPropertyId() {
    unsigned int largest = 0;
    for (const PublishedProperty& property : operatingSystemProperties)
        if (property.id > largest) largest = property.id;
    return largest;
}

#endif
