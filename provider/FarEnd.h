#ifndef OSSTATUS_FAR_END_H
#define OSSTATUS_FAR_END_H

#include <string>

#include "Moniker.h"
#include "ProviderUtilities.h"

namespace VA::OSStatusProvider {

/// What a far end's path is made with.
struct FarEnd {
    const CMPIBroker* broker;
    const std::string& nameSpace;
    const char* className;
};

/// A new path of the far end, null when the broker makes none. When `nearEnd` has keys, the path
/// gets those that `mapping` derives from them; what the mapping throws passes through. Keys are
/// counted, once there is a path, in a number of type `Count`.
template <class Count, class Mapping>
CMPIObjectPath* locate(const FarEnd& farEnd, const CMPIObjectPath* nearEnd, Mapping& mapping,
                       VA::Moniker (Mapping::*map)(VA::Moniker&)) {
    CMPIObjectPath* path =
        VA::ProviderUtilities::createObjectPath(farEnd.broker, farEnd.className, farEnd.nameSpace);
    if (static_cast<Count>(VA::ProviderUtilities::getKeyCount(nearEnd)) == 0) return path;
    VA::Moniker moniker;
    VA::ProviderUtilities::transformObjectPathToMoniker(nearEnd, moniker);
    VA::Moniker mapped = (mapping.*map)(moniker);
    VA::ProviderUtilities::transformMonikerToObjectPath(mapped, &path);
    return path;
}

/// Sets the reference that an association's path holds under `role` as a property of its instance;
/// a path without it leaves the property out.
inline void setReference(const CMPIObjectPath* path, CMPIInstance* instance, const char* role) {
    const CMPIObjectPath* reference = nullptr;
    if (VA::ProviderUtilities::getKeyProperty(path, role, &reference))
        // CMPI values hold paths as plain pointers; the instance only copies this one.
        VA::ProviderUtilities::setProperty(instance, role, const_cast<CMPIObjectPath*>(reference));
}

}  // namespace VA::OSStatusProvider

#endif
