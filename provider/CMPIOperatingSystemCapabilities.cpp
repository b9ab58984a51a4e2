// What KORVA_OperatingSystemCapabilities publishes: keys and properties as tables, so that a reader
// can hold them against the class in the schema.
#include "CMPIOperatingSystemCapabilities.h"

#include "ElementAdapter-inl.h"

namespace VA::OSStatusProvider {

using Capabilities = OperatingSystemCapabilities;

static const std::string loggerCMPIOperatingSystemCapabilities("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog log("CMPIOperatingSystemCapabilities.cpp",
                             loggerCMPIOperatingSystemCapabilities);

static constexpr KeyFilter<Capabilities> filters[] = {
    {"InstanceID", "instanceId", Capabilities::InstanceIDFilter},
};

static constexpr Key<Capabilities> keys[] = {
    {"InstanceID", &Capabilities::getInstanceID},
};

static constexpr Property<Capabilities> properties[] = {
    {"InstanceID", &Capabilities::getInstanceID},
    {"ElementName", &Capabilities::getElementName},
    {"ElementNameEditSupported", &Capabilities::getElementNameEditSupported},
    {"MaxElementNameLen", &Capabilities::getMaxElementNameLen},
    {"RequestedStatesSupported", &Capabilities::getRequestedStatesSupported},
    {"HostShutdownBehavior", &Capabilities::getHostShutdownBehavior},
};

const ElementTraits<Capabilities> CMPIOperatingSystemCapabilities::traits = {
    "KORVA_OperatingSystemCapabilities",
    "CMPIOperatingSystemCapabilities",
    "~CMPIOperatingSystemCapabilities",
    filters,
    keys,
    properties,
    false,  // values are not shared: what a getter leaves unwritten is empty
    log,
};

template class ElementAdapter<OperatingSystemCapabilities>;

}  // namespace VA::OSStatusProvider
