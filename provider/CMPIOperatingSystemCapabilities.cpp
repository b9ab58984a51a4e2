#include "CMPIOperatingSystemCapabilities.h"

#include "ElementAdapterOperations.h"

namespace VA::OSStatusProvider {

using Capabilities = OperatingSystemCapabilities;

static const std::string loggerCMPIOperatingSystemCapabilities("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog unitLog("CMPIOperatingSystemCapabilities.cpp",
                                 loggerCMPIOperatingSystemCapabilities);

static constexpr Key<Capabilities> keyTable[] = {
    {"InstanceID", &Capabilities::getInstanceID},
};

static constexpr Property<Capabilities> propertyTable[] = {
    property<&Capabilities::getInstanceID>("InstanceID"),
    property<&Capabilities::getElementName>("ElementName"),
    property<&Capabilities::getElementNameEditSupported>("ElementNameEditSupported"),
    property<&Capabilities::getMaxElementNameLen>("MaxElementNameLen"),
    property<&Capabilities::getRequestedStatesSupported>("RequestedStatesSupported"),
    property<&Capabilities::getHostShutdownBehavior>("HostShutdownBehavior"),
};

const UnitLog& OperatingSystemCapabilitiesDesign::records() {
    return unitLog;
}

Rows<Key<OperatingSystemCapabilitiesDesign::Element>> OperatingSystemCapabilitiesDesign::keys() {
    return keyTable;
}

Rows<Property<OperatingSystemCapabilitiesDesign::Element>>
OperatingSystemCapabilitiesDesign::properties() {
    return propertyTable;
}

template class ElementAdapter<OperatingSystemCapabilitiesDesign>;

}  // namespace VA::OSStatusProvider
