#ifndef PROVIDER_ASSOCIATION_PATHS_H
#define PROVIDER_ASSOCIATION_PATHS_H

#include <string>

#include "Moniker.h"
#include "ProviderUtilities.h"

// The paths and references that adapters of associations make.

namespace VA::OSStatusProvider {

/// A new path of class `farClass`, null when the broker makes none. When `nearEnd` has keys, the
/// path gets those that `map`, from moniker to moniker, derives from them; what `map` throws passes
/// through. Keys are counted, once there is a path, in a number of type `Count`: associations
/// differ in its width, and so in what they make of a path with 65536 keys.
template <class Count, class Map>
CMPIObjectPath* locateFarEnd(const CMPIBroker* broker, const std::string& nameSpace,
                             const char* farClass, const CMPIObjectPath* nearEnd, Map map) {
    CMPIObjectPath* path = VA::ProviderUtilities::createObjectPath(broker, farClass, nameSpace);
    if (static_cast<Count>(VA::ProviderUtilities::getKeyCount(nearEnd)) == 0) return path;
    VA::Moniker moniker;
    VA::ProviderUtilities::transformObjectPathToMoniker(nearEnd, moniker);
    VA::Moniker mapped = map(moniker);
    VA::ProviderUtilities::transformMonikerToObjectPath(mapped, &path);
    return path;
}

/// Sets the reference that an association's path holds under `role` as a property of its instance;
/// a path without it leaves the property out.
inline void setReference(const CMPIObjectPath* path, CMPIInstance* instance, const char* role) {
    const CMPIObjectPath* reference = nullptr;
    if (VA::ProviderUtilities::getKeyProperty(path, role, &reference)) {
        // CMPI values hold paths as plain pointers; the instance only copies this one.
        VA::ProviderUtilities::setProperty(instance, role, const_cast<CMPIObjectPath*>(reference));
    }
}

}  // namespace VA::OSStatusProvider

#endif
