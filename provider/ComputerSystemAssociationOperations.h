#ifndef OSSTATUS_COMPUTER_SYSTEM_ASSOCIATION_OPERATIONS_H
#define OSSTATUS_COMPUTER_SYSTEM_ASSOCIATION_OPERATIONS_H

// The operations of ComputerSystemAssociation, for the units that instantiate it.

#include "ClassIds.h"
#include "ComputerSystemAssociation.h"
#include "FarEnd.h"
#include "ProviderUtilities.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

template <class Design>
ComputerSystemAssociation<Design>::ComputerSystemAssociation(const CMPIBroker* _broker,
                                                             const CMPIContext* _context,
                                                             const CMPIObjectPath* objectPath)
    : broker(_broker),
      context(_context),
      nameSpace(VA::ProviderUtilities::getNamespace(objectPath)),
      operatingSystem(broker, context, nameSpace),
      computerSystem(broker, context, nameSpace) {
    const ParameterList parameters(broker, context, objectPath);
    Design::records().entering(parameters, Caller::named(Design::constructor));
    requestedClassId = VA::ProviderUtilities::getClassId(objectPath);
    Design::records().variable("requestedClassId", requestedClassId,
                               Caller::named(Design::constructor));
    switch (requestedClassId) {
        case operatingSystemId:
            computerSystem.setObjectPath(locateComputerSystem(objectPath));
            break;
        case Design::classId:
            computerSystem.setObjectPath(
                VA::ProviderUtilities::createObjectPath(broker, "KORVA_ComputerSystem", nameSpace));
            break;
        case computerSystemId:
            operatingSystem.setObjectPath(locateOperatingSystem(objectPath));
            break;
    }
    Design::records().exiting(parameters, Caller::named(Design::constructor));
}

template <class Design>
ComputerSystemAssociation<Design>::~ComputerSystemAssociation() noexcept(false) {
    Design::records().destructor(Caller::named(Design::destructor));
}

template <class Design>
ComputerSystemAssociation<Design>::operator bool() {
    Design::records().entering();
    bool current = false;
    switch (requestedClassId) {
        case operatingSystemId:
            current = computerSystem;
            break;
        case Design::classId:
            current = operatingSystem && computerSystem;
            break;
        case computerSystemId:
            current = operatingSystem;
            break;
    }
    Design::records().exiting();
    return current;
}

template <class Design>
bool ComputerSystemAssociation<Design>::enumerates() const {
    return requestedClassId == Design::classId;
}

template <class Design>
ComputerSystemAssociation<Design>& ComputerSystemAssociation<Design>::operator++() {
    Design::records().entering();
    switch (requestedClassId) {
        case operatingSystemId:
            ++computerSystem;
            break;
        case Design::classId:
            ++operatingSystem;
            ++computerSystem;
            break;
        case computerSystemId:
            ++operatingSystem;
            break;
    }
    Design::records().exiting();
    return *this;
}

template <class Design>
CMPIObjectPath* ComputerSystemAssociation<Design>::pathOf(End end) {
    return end == End::computerSystem ? computerSystem.getObjectPath()
                                      : operatingSystem.getObjectPath();
}

template <class Design>
CMPIObjectPath* ComputerSystemAssociation<Design>::getObjectPath() {
    Design::records().entering();
    CMPIObjectPath* path =
        VA::ProviderUtilities::createObjectPath(broker, Design::className, nameSpace);
    if (path != nullptr)
        for (const Role& role : Design::roles)
            VA::ProviderUtilities::setKeyProperty(path, role.name, pathOf(role.end));
    Design::records().exiting();
    return path;
}

template <class Design>
CMPIInstance* ComputerSystemAssociation<Design>::getCMPIInstance(const char** properties) {
    const ParameterList parameters(" properties=", properties);
    Design::records().entering(parameters);
    CMPIObjectPath* path = getObjectPath();
    CMPIInstance* instance = VA::ProviderUtilities::createInstance(broker, path);
    if (instance != nullptr) {
        for (const Role& role : Design::roles) setReference(path, instance, role.name);
        Design::setOwnProperties(mapping, instance);
    }
    Design::records().exiting(parameters);
    return instance;
}

template <class Design>
CMPIObjectPath* ComputerSystemAssociation<Design>::getAssociatorNames() {
    Design::records().entering();
    CMPIObjectPath* path = nullptr;
    if (requestedClassId == computerSystemId) path = operatingSystem.getObjectPath();
    if (requestedClassId == operatingSystemId) path = computerSystem.getObjectPath();
    Design::records().exiting();
    return path;
}

template <class Design>
CMPIInstance* ComputerSystemAssociation<Design>::getAssociator(const char** properties) {
    const ParameterList parameters(" properties=", properties);
    Design::records().entering(parameters);
    CMPIInstance* instance = nullptr;
    if (requestedClassId == computerSystemId)
        instance = operatingSystem.getCMPIInstance(properties);
    if (requestedClassId == operatingSystemId)
        instance = computerSystem.getCMPIInstance(properties);
    Design::records().exiting(parameters);
    return instance;
}

// These associations count keys in 16 bits.

template <class Design>
CMPIObjectPath* ComputerSystemAssociation<Design>::locateComputerSystem(
    const CMPIObjectPath* objectPath) {
    const ParameterList parameters(" objectPath=", objectPath);
    Design::records().entering(parameters);
    CMPIObjectPath* path =
        locate<unsigned short>({broker, nameSpace, "KORVA_ComputerSystem"}, objectPath, mapping,
                               &Mapping::getComputerSystemMoniker);
    Design::records().exiting(parameters);
    return path;
}

template <class Design>
CMPIObjectPath* ComputerSystemAssociation<Design>::locateOperatingSystem(
    const CMPIObjectPath* objectPath) {
    const ParameterList parameters(" objectPath=", objectPath);
    Design::records().entering(parameters);
    CMPIObjectPath* path =
        locate<unsigned short>({broker, nameSpace, "KORVA_OperatingSystem"}, objectPath, mapping,
                               &Mapping::getOperatingSystemMoniker);
    Design::records().exiting(parameters);
    return path;
}

}  // namespace VA::OSStatusProvider

#endif
