#include "CMPIOperatingSystemCapabilities.h"

#include "ElementAdapterOperations.h"
#include "PropertyTable.h"

namespace VA::OSStatusProvider {

using Capabilities = OperatingSystemCapabilities;

static const std::string loggerCMPIOperatingSystemCapabilities("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog unitLog("CMPIOperatingSystemCapabilities.cpp",
                                 loggerCMPIOperatingSystemCapabilities);

static constexpr Key<Capabilities> keys[] = {
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

void OperatingSystemCapabilitiesDesign::setKeys(Element& element, CMPIObjectPath* path) {
    OSStatusProvider::setKeys(keys, element, path);
}

void OperatingSystemCapabilitiesDesign::setProperties(Element& element, const CMPIBroker* broker,
                                                      CMPIInstance* instance) {
    for (const Property<Capabilities>& row : propertyTable) {
        PropertyValues fresh;
        row.publish(row.name, element, fresh, broker, instance);
    }
}

template class ElementAdapter<OperatingSystemCapabilitiesDesign>;

}  // namespace VA::OSStatusProvider
