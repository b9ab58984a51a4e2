#include "OperatingSystemCapabilities.h"

#include "FilteredWalk.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

static const std::string loggerOperatingSystemCapabilities("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog records("Linux/OperatingSystemCapabilities.cpp",
                                 loggerOperatingSystemCapabilities);

OperatingSystemCapabilities::OperatingSystemCapabilities() {
    instrumentation.selectNode(NodeLexicon::OperatingSystemNode);
}

OperatingSystemCapabilities::operator bool() {
    records.method();
    return instrumentation;
}

OperatingSystemCapabilities& OperatingSystemCapabilities::operator++() {
    records.entering();
    advanceToNext(instrumentation, filterSet, [this] { return passesFilters(); });
    records.exiting();
    return *this;
}

bool OperatingSystemCapabilities::passesFilters() {
    // By FilterType.
    static constexpr bool (OperatingSystemCapabilities::*texts[])(std::string&) = {
        &OperatingSystemCapabilities::getInstanceID};
    return passesAll(*this, filters, texts);
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
