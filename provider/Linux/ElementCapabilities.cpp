// Operating system and capabilities know each other by name alone; the direction decides the key
// that holds it.
#include "ElementCapabilities.h"

#include "KeyMapping.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

// A category of its own: filters that single out this unit's records rely on it.
static const std::string loggerOSElementCapabilities("Zumbrel.OSStatusProvider");
static constexpr UnitLog log("Linux/ElementCapabilities.cpp", loggerOSElementCapabilities);

OSElementCapabilities::OSElementCapabilities() {
    log.method();
}

OSElementCapabilities::~OSElementCapabilities() noexcept(false) {
    log.destructor();
}

VA::Moniker OSElementCapabilities::getOperatingSystemMoniker(VA::Moniker& monikerCapabilities) {
    const ParameterList parameters(" monikerCapabilities=", &monikerCapabilities);
    log.entering(parameters);
    const std::string instanceId = valueOfFirst(monikerCapabilities, {"InstanceID"},
                                                "Could not find 'InstanceID' Key in Moniker");
    log.variable("InstanceID", instanceId.c_str());
    VA::Moniker operatingSystem = monikerOf("Name", instanceId);
    log.exiting(parameters);
    return operatingSystem;
}

VA::Moniker OSElementCapabilities::getOSCapabilitiesMoniker(VA::Moniker& monikerOS) {
    const ParameterList parameters(" monikerOS=", &monikerOS);
    log.entering(parameters);
    const std::string name =
        valueOfFirst(monikerOS, {"Name"}, "Could not find 'Name' Key in Moniker");
    VA::Moniker capabilities = monikerOf("InstanceID", name);
    log.exiting(parameters);
    return capabilities;
}

}  // namespace VA::OSStatusProvider
