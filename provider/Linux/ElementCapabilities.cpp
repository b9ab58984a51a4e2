#include "ElementCapabilities.h"

#include "KeyMapping.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

// A category of its own: filters that single out this unit's records rely on it.
static const std::string loggerOSElementCapabilities("Zumbrel.OSStatusProvider");
static constexpr UnitLog records("Linux/ElementCapabilities.cpp", loggerOSElementCapabilities);

OSElementCapabilities::OSElementCapabilities() {
    records.method();
}

OSElementCapabilities::~OSElementCapabilities() noexcept(false) {
    records.destructor();
}

VA::Moniker OSElementCapabilities::getOperatingSystemMoniker(VA::Moniker& monikerCapabilities) {
    const ParameterList parameters(" monikerCapabilities=", &monikerCapabilities);
    records.entering(parameters);
    const std::string instanceId = valueOfFirst(monikerCapabilities, {"InstanceID"},
                                                "Could not find 'InstanceID' Key in Moniker");
    records.variable("InstanceID", instanceId.c_str());
    VA::Moniker operatingSystem = monikerOf("Name", instanceId);
    records.exiting(parameters);
    return operatingSystem;
}

VA::Moniker OSElementCapabilities::getOSCapabilitiesMoniker(VA::Moniker& monikerOS) {
    const ParameterList parameters(" monikerOS=", &monikerOS);
    records.entering(parameters);
    const std::string name =
        valueOfFirst(monikerOS, {"Name"}, "Could not find 'Name' Key in Moniker");
    VA::Moniker capabilities = monikerOf("InstanceID", name);
    records.exiting(parameters);
    return capabilities;
}

}  // namespace VA::OSStatusProvider
