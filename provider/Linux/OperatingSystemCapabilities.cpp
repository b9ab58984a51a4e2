// Each operating system has capabilities of its name; what they say is the same for all.
#include "OperatingSystemCapabilities.h"

#include <strings.h>

#include "UnitLog.h"

namespace VA::OSStatusProvider {

static const std::string loggerOperatingSystemCapabilities("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog log("Linux/OperatingSystemCapabilities.cpp",
                             loggerOperatingSystemCapabilities);

OperatingSystemCapabilities::OperatingSystemCapabilities() {
    instrumentation.selectNode(NodeLexicon::OperatingSystemNode);
}

OperatingSystemCapabilities::operator bool() {
    log.method();
    return instrumentation;
}

OperatingSystemCapabilities& OperatingSystemCapabilities::operator++() {
    log.entering();
    do {
        ++instrumentation;
    } while (filterSet && instrumentation && !passesFilters());
    log.exiting();
    return *this;
}

bool OperatingSystemCapabilities::passesFilters() {
    std::string identifier;
    for (const Filter& filter : filters) {
        if (filter.type != InstanceIDFilter) continue;
        if (!getInstanceID(identifier)) return false;
        if (strcasecmp(filter.value.c_str(), identifier.c_str()) != 0) return false;
    }
    return true;
}

bool OperatingSystemCapabilities::getInstanceID(std::string& value) {
    return instrumentation.getProperty(NodeLexicon::Name, value);
}

bool OperatingSystemCapabilities::getElementName(std::string& value) {
    return getInstanceID(value);
}

bool OperatingSystemCapabilities::getElementNameEditSupported(bool& value) {
    if (!instrumentation.isPropertyReadOnly(NodeLexicon::Name, value)) return false;
    value = !value;
    return true;
}

bool OperatingSystemCapabilities::getHostShutdownBehavior(unsigned short& value) {
    value = 3;
    return true;
}

}  // namespace VA::OSStatusProvider
