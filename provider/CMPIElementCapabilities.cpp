// The association of operating systems with their capabilities has ends, records and a walk of its
// own shape, and so is no ComputerSystemAssociation. Some of its operations leave without an
// exiting record; whoever reads the records relies on that.
#include "CMPIElementCapabilities.h"

#include "AssociationPaths.h"
#include "ClassIds.h"
#include "InstrumentationException.h"
#include "ProviderUtilities.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

using Utilities = VA::ProviderUtilities;

static const std::string loggerCMPIOSElementCapabilities("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog log("CMPIElementCapabilities.cpp", loggerCMPIOSElementCapabilities);

CMPIOSElementCapabilities::CMPIOSElementCapabilities(const CMPIBroker* _broker,
                                                     const CMPIContext* _context,
                                                     const CMPIObjectPath* objectPath)
    : broker(_broker),
      context(_context),
      nameSpace(Utilities::getNamespace(objectPath)),
      capabilities(broker, context, nameSpace),
      operatingSystem(broker, context, nameSpace) {
    const ParameterList parameters(broker, context, objectPath);
    log.entering(parameters);
    requestedClassId = Utilities::getClassId(objectPath);
    log.variable("requestedClassId", requestedClassId);
    switch (requestedClassId) {
        case operatingSystemCapabilitiesId:
            operatingSystem.setObjectPath(locateOperatingSystem(objectPath));
            break;
        case elementCapabilitiesId:
            if (!setObjectPath(objectPath)) throw VA::InstrumentationException("Object Not Found.");
            break;
        case operatingSystemId:
            capabilities.setObjectPath(locateCapabilities(objectPath));
            break;
    }
    log.exiting(parameters);
}

CMPIOSElementCapabilities::~CMPIOSElementCapabilities() noexcept(false) {
    log.destructor();
}

bool CMPIOSElementCapabilities::setObjectPath(const CMPIObjectPath* objectPath) {
    const ParameterList parameters(" objectPath=", objectPath);
    log.entering(parameters);
    if (Utilities::getKeyCount(objectPath) == 0) {
        if (!operatingSystem) return false;
        pairWithCurrentOperatingSystem();
    } else {
        singleInstance = true;
        if (!setKeyedObjectPath(objectPath)) return false;
    }
    log.exiting(parameters);
    return true;
}

// Both ends must belong together: the operating system's "Name" is what the capabilities' end maps
// to, letter for letter.
bool CMPIOSElementCapabilities::setKeyedObjectPath(const CMPIObjectPath* objectPath) {
    const CMPIObjectPath* end = nullptr;
    if (!Utilities::getKeyProperty(objectPath, "Capabilities", &end)) return false;
    capabilities.setObjectPath(end);
    const CMPIObjectPath* expected = locateOperatingSystem(end);
    if (!Utilities::getKeyProperty(objectPath, "ManagedElement", &end)) return false;
    std::string name;
    std::string expectedName;
    if (!Utilities::getKeyProperty(end, "Name", name) ||
        !Utilities::getKeyProperty(expected, "Name", expectedName) || name != expectedName) {
        return false;
    }
    operatingSystem.setObjectPath(end);
    return true;
}

void CMPIOSElementCapabilities::pairWithCurrentOperatingSystem() {
    capabilities.setObjectPath(locateCapabilities(operatingSystem.getObjectPath()));
}

CMPIObjectPath* CMPIOSElementCapabilities::getObjectPath() {
    log.entering();
    CMPIObjectPath* path =
        Utilities::createObjectPath(broker, "KORVA_OSElementCapabilities", nameSpace);
    if (path != nullptr) {
        Utilities::setKeyProperty(path, "ManagedElement", operatingSystem.getObjectPath());
        Utilities::setKeyProperty(path, "Capabilities", capabilities.getObjectPath());
    }
    log.exiting();
    return path;
}

CMPIInstance* CMPIOSElementCapabilities::getCMPIInstance(const char** properties) {
    const ParameterList parameters(" properties=", properties);
    log.entering(parameters);
    CMPIObjectPath* path = getObjectPath();
    CMPIInstance* instance = Utilities::createInstance(broker, path);
    if (instance == nullptr) return nullptr;
    setReference(path, instance, "ManagedElement");
    setReference(path, instance, "Capabilities");
    log.exiting(parameters);
    return instance;
}

CMPIObjectPath* CMPIOSElementCapabilities::getAssociatorNames() {
    log.entering();
    CMPIObjectPath* path = nullptr;
    if (requestedClassId == operatingSystemId) path = capabilities.getObjectPath();
    if (requestedClassId == operatingSystemCapabilitiesId) path = operatingSystem.getObjectPath();
    log.exiting();
    return path;
}

CMPIInstance* CMPIOSElementCapabilities::getAssociator(const char** properties) {
    log.entering(ParameterList(" properties=", properties));
    if (requestedClassId == operatingSystemId) return capabilities.getCMPIInstance(properties);
    if (requestedClassId == operatingSystemCapabilitiesId) {
        return operatingSystem.getCMPIInstance(properties);
    }
    return nullptr;
}

CMPIObjectPath* CMPIOSElementCapabilities::locateCapabilities(const CMPIObjectPath* objectPath) {
    const ParameterList parameters(" objectPath=", objectPath);
    log.entering(parameters);
    CMPIObjectPath* path = locateFarEnd<unsigned int>(
        broker, nameSpace, "KORVA_OperatingSystemCapabilities", objectPath,
        [this](VA::Moniker& os) { return elementCapabilities.getOSCapabilitiesMoniker(os); });
    log.exiting(parameters);
    return path;
}

CMPIObjectPath* CMPIOSElementCapabilities::locateOperatingSystem(const CMPIObjectPath* objectPath) {
    const ParameterList parameters(" objectPath=", objectPath);
    log.entering(parameters);
    CMPIObjectPath* path = locateFarEnd<unsigned int>(
        broker, nameSpace, "KORVA_OperatingSystem", objectPath,
        [this](VA::Moniker& ofCapabilities) {
            return elementCapabilities.getOperatingSystemMoniker(ofCapabilities);
        });
    log.exiting(parameters);
    return path;
}

CMPIOSElementCapabilities::operator bool() {
    log.entering();
    return hasCurrent;
}

bool CMPIOSElementCapabilities::enumerates() const {
    return requestedClassId == elementCapabilitiesId;
}

CMPIOSElementCapabilities& CMPIOSElementCapabilities::operator++() {
    log.entering();
    switch (requestedClassId) {
        case operatingSystemCapabilitiesId:
            ++operatingSystem;
            hasCurrent = operatingSystem;
            break;
        case operatingSystemId:
            ++capabilities;
            hasCurrent = capabilities;
            break;
        case elementCapabilitiesId:
            if (singleInstance) {
                hasCurrent = false;
            } else {
                advancePair();
            }
            break;
    }
    log.exiting();
    return *this;
}

// Capabilities inner, operating systems outer. The inner walk does not start again for the next
// operating system, since the capabilities apply no key: the walk ends when both are spent.
void CMPIOSElementCapabilities::advancePair() {
    ++capabilities;
    if (!capabilities) {
        ++operatingSystem;
        if (operatingSystem) pairWithCurrentOperatingSystem();
    }
    hasCurrent = operatingSystem || capabilities;
}

}  // namespace VA::OSStatusProvider
