// KORVA_InstalledOS and KORVA_RunningOS differ in names and values only: what they do is here,
// once, and their units hold the values. Records bear the file of the unit whose values are in use.
#include "ComputerSystemAssociation.h"

#include "AssociationPaths.h"
#include "ClassIds.h"
#include "ProviderUtilities.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

using Utilities = VA::ProviderUtilities;

ComputerSystemAssociation::ComputerSystemAssociation(const AssociationTraits& _traits,
                                                     const CMPIBroker* _broker,
                                                     const CMPIContext* _context,
                                                     const CMPIObjectPath* objectPath)
    : traits(_traits),
      broker(_broker),
      context(_context),
      nameSpace(Utilities::getNamespace(objectPath)),
      operatingSystem(broker, context, nameSpace),
      computerSystem(broker, context, nameSpace) {
    const ParameterList parameters(broker, context, objectPath);
    traits.log.entering(parameters, SourceLocation::named(traits.constructor));
    requestedClassId = Utilities::getClassId(objectPath);
    traits.log.variable("requestedClassId", requestedClassId,
                        SourceLocation::named(traits.constructor));
    if (requestedClassId == operatingSystemId) {
        computerSystem.setObjectPath(locateComputerSystem(objectPath));
    } else if (requestedClassId == traits.classId) {
        computerSystem.setObjectPath(
            Utilities::createObjectPath(broker, "KORVA_ComputerSystem", nameSpace));
    } else if (requestedClassId == computerSystemId) {
        operatingSystem.setObjectPath(locateOperatingSystem(objectPath));
    }
    traits.log.exiting(parameters, SourceLocation::named(traits.constructor));
}

ComputerSystemAssociation::~ComputerSystemAssociation() noexcept(false) {
    traits.log.destructor(SourceLocation::named(traits.destructor));
}

ComputerSystemAssociation::operator bool() {
    traits.log.entering();
    bool current = false;
    if (requestedClassId == operatingSystemId) {
        current = computerSystem;
    } else if (requestedClassId == traits.classId) {
        current = operatingSystem && computerSystem;
    } else if (requestedClassId == computerSystemId) {
        current = operatingSystem;
    }
    traits.log.exiting();
    return current;
}

bool ComputerSystemAssociation::enumerates() const {
    return requestedClassId == traits.classId;
}

ComputerSystemAssociation& ComputerSystemAssociation::operator++() {
    traits.log.entering();
    if (requestedClassId == computerSystemId || requestedClassId == traits.classId) {
        ++operatingSystem;
    }
    if (requestedClassId == operatingSystemId || requestedClassId == traits.classId) {
        ++computerSystem;
    }
    traits.log.exiting();
    return *this;
}

CMPIObjectPath* ComputerSystemAssociation::pathOf(End end) {
    return end == End::computerSystem ? computerSystem.getObjectPath()
                                      : operatingSystem.getObjectPath();
}

CMPIObjectPath* ComputerSystemAssociation::getObjectPath() {
    traits.log.entering();
    CMPIObjectPath* path = Utilities::createObjectPath(broker, traits.className, nameSpace);
    if (path != nullptr) {
        for (const Role& role : traits.roles) {
            Utilities::setKeyProperty(path, role.name, pathOf(role.end));
        }
    }
    traits.log.exiting();
    return path;
}

CMPIInstance* ComputerSystemAssociation::getCMPIInstance(const char** properties) {
    const ParameterList parameters(" properties=", properties);
    traits.log.entering(parameters);
    CMPIObjectPath* path = getObjectPath();
    CMPIInstance* instance = Utilities::createInstance(broker, path);
    if (instance != nullptr) {
        for (const Role& role : traits.roles) setReference(path, instance, role.name);
        if (traits.setOwnProperties != nullptr) traits.setOwnProperties(instance);
    }
    traits.log.exiting(parameters);
    return instance;
}

CMPIObjectPath* ComputerSystemAssociation::getAssociatorNames() {
    traits.log.entering();
    CMPIObjectPath* path = nullptr;
    if (requestedClassId == computerSystemId) path = operatingSystem.getObjectPath();
    if (requestedClassId == operatingSystemId) path = computerSystem.getObjectPath();
    traits.log.exiting();
    return path;
}

CMPIInstance* ComputerSystemAssociation::getAssociator(const char** properties) {
    const ParameterList parameters(" properties=", properties);
    traits.log.entering(parameters);
    CMPIInstance* instance = nullptr;
    if (requestedClassId == computerSystemId) {
        instance = operatingSystem.getCMPIInstance(properties);
    }
    if (requestedClassId == operatingSystemId) {
        instance = computerSystem.getCMPIInstance(properties);
    }
    traits.log.exiting(parameters);
    return instance;
}

// These associations have always counted keys in 16 bits, other than CMPIOSElementCapabilities: a
// path with 65536 keys counts as one without keys.

CMPIObjectPath* ComputerSystemAssociation::locateComputerSystem(const CMPIObjectPath* objectPath) {
    const ParameterList parameters(" objectPath=", objectPath);
    traits.log.entering(parameters);
    CMPIObjectPath* path = locateFarEnd<unsigned short>(broker, nameSpace, "KORVA_ComputerSystem",
                                                        objectPath, traits.computerSystemOf);
    traits.log.exiting(parameters);
    return path;
}

CMPIObjectPath* ComputerSystemAssociation::locateOperatingSystem(const CMPIObjectPath* objectPath) {
    const ParameterList parameters(" objectPath=", objectPath);
    traits.log.entering(parameters);
    CMPIObjectPath* path = locateFarEnd<unsigned short>(broker, nameSpace, "KORVA_OperatingSystem",
                                                        objectPath, traits.operatingSystemOf);
    traits.log.exiting(parameters);
    return path;
}

}  // namespace VA::OSStatusProvider
