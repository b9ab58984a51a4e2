// What the framework reports of an operating system, turned into the values that CIM has for it.
// Some conversions look wrong and are not: clients know them as they are.
#include "OperatingSystem.h"

#include <strings.h>

#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <utility>

#include "UnitLog.h"

namespace VA::OSStatusProvider {

using namespace VA::NodeLexicon;

static const std::string loggerOperatingSystem("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog log("Linux/OperatingSystem.cpp", loggerOperatingSystem);

namespace {

/// What a range of status codes means in the CIM value maps.
struct NodeStatus {
    unsigned int firstCode;
    unsigned int lastCode;
    unsigned short enabledState;
    unsigned short healthState;
    unsigned short operationalStatus[2];
    unsigned int operationalStatusCount;
};

constexpr NodeStatus nodeStatuses[] = {
    {0, 0, 0, 0, {0}, 1},        // Unknown
    {1, 1, 2, 5, {2, 11}, 2},    // Enabled; OK; OK, In Service
    {2, 2, 10, 0, {0}, 1},       // Starting
    {8, 8, 9, 0, {0}, 1},        // Quiesce
    {9, 9, 10, 0, {0}, 1},       // Starting
    {12, 12, 6, 0, {0}, 1},      // Enabled but Offline
    {16, 16, 3, 0, {0}, 1},      // Disabled
    {20, 20, 5, 10, {3, 5}, 2},  // Not Applicable; Degraded/Warning; Degraded, Predictive Failure
    {21, 26, 5, 10, {3}, 1},     // Not Applicable; Degraded/Warning; Degraded
    {0, 4294967295U, 5, 0, {0}, 1},  // all others: Not Applicable
};

const NodeStatus& meaningOf(unsigned int code) {
    const NodeStatus* status = nodeStatuses;
    while (code < status->firstCode || code > status->lastCode) ++status;
    return *status;
}

}  // namespace

OperatingSystem::OperatingSystem() {
    instrumentation.selectNode(OperatingSystemNode);
}

OperatingSystem::operator bool() {
    log.method();
    return instrumentation;
}

OperatingSystem& OperatingSystem::operator++() {
    log.entering();
    do {
        ++instrumentation;
    } while (filterSet && instrumentation && !passesFilters());
    log.exiting();
    return *this;
}

void OperatingSystem::setFilter(FilterType type, std::string value) {
    filterSet = true;
    filters.push_back({type, std::move(value)});
    while (instrumentation && !passesFilters()) ++instrumentation;
}

// The first filter that fails ends the test: nothing further is read.
bool OperatingSystem::passesFilters() {
    std::string text;
    for (const Filter& filter : filters) {
        bool known = false;
        switch (filter.type) {
            case CSNameFilter:
                known = getCSName(text);
                break;
            case NameFilter:
                known = getName(text);
                break;
            default:
                continue;
        }
        if (!known || strcasecmp(filter.value.c_str(), text.c_str()) != 0) return false;
    }
    return true;
}

bool OperatingSystem::getOperationalStatus(std::vector<unsigned short>& value) {
    const NodeStatus& status = meaningOf(instrumentation.getNodeStatus());
    value.insert(value.end(), status.operationalStatus,
                 status.operationalStatus + status.operationalStatusCount);
    return true;
}

bool OperatingSystem::getHealthState(unsigned short& value) {
    value = meaningOf(instrumentation.getNodeStatus()).healthState;
    return true;
}

bool OperatingSystem::getStatus(std::string& value) {
    value = "OK";
    return true;
}

bool OperatingSystem::getEnabledState(unsigned short& value) {
    value = meaningOf(instrumentation.getNodeStatus()).enabledState;
    return true;
}

bool OperatingSystem::getCSCreationClassName(std::string& value) {
    value = "KORVA_ComputerSystem";
    return true;
}

bool OperatingSystem::getCSName(std::string& value) {
    return instrumentation.getComputerName(value);
}

bool OperatingSystem::getCreationClassName(std::string& value) {
    value = "KORVA_OperatingSystem";
    return true;
}

bool OperatingSystem::getOSType(unsigned short& value) {
    unsigned int raw = 0;
    if (!instrumentation.getProperty(OSType, raw)) return false;
    // The CIM value map is ahead of the framework's numbers by one, from 65 on by two, and names
    // nothing above 68.
    if (raw == 0) {
        value = 0;  // Unknown
    } else if (raw <= 64) {
        value = static_cast<unsigned short>(raw + 1);
    } else if (raw <= 68) {
        value = static_cast<unsigned short>(raw + 2);
    } else {
        value = 1;  // Other
    }
    return true;
}

bool OperatingSystem::getSize(Properties id, unsigned long long& value) {
    unsigned int kilobytes = 0;
    const bool known = instrumentation.getProperty(id, kilobytes);
    value = kilobytes;
    return known;
}

bool OperatingSystem::getDateTime(Properties id, std::string& value) {
    if (!instrumentation.getProperty(id, value)) return false;
    // The zone as libc holds it, without initialising it. The sign is '+' west of UTC: the opposite
    // of the host's own offset, and that of the zone in which the instrumentation gives its dates.
    const long zone = timezone;
    const char sign = zone < 0 ? '-' : '+';
    const auto minutes = static_cast<unsigned int>(std::labs(zone / 60));
    // What the text does not reach stays 0.
    unsigned int year = 0, month = 0, day = 0, hour = 0, minute = 0, second = 0;
    char separator;
    std::sscanf(value.c_str(), "%4u %1c %2u %1c %2u %1c %2u %1c %2u %1c %2u", &year, &separator,
                &month, &separator, &day, &separator, &hour, &separator, &minute, &separator,
                &second);
    dateTimeBuffer = {};
    if (std::snprintf(dateTimeBuffer.data(), dateTimeBuffer.size(),
                      "%4u%02u%02u%02u%02u%02u.%06u%1c%03u", year, month, day, hour, minute, second,
                      0U, sign, minutes) == 0) {
        return false;
    }
    value = dateTimeBuffer.data();
    return true;
}

bool executeReboot() {
    return false;
}

bool executeShutdown() {
    return false;
}

}  // namespace VA::OSStatusProvider
