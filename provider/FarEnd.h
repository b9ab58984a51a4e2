#ifndef OSSTATUS_FAR_END_H
#define OSSTATUS_FAR_END_H

#include "Moniker.h"
#include "ProviderUtilities.h"

namespace VA::OSStatusProvider {

/// Writes the keys of an association's far end into `farEnd`, as `mapping` derives them from the
/// keys of `nearEnd`; without keys there, nothing is written. What the mapping throws passes
/// through. `farEnd` may be null.
template <class Mapping>
void mapKeys(const CMPIObjectPath* nearEnd, Mapping& mapping,
             VA::Moniker (Mapping::*map)(VA::Moniker&), CMPIObjectPath*& farEnd) {
    VA::Moniker moniker;
    VA::ProviderUtilities::transformObjectPathToMoniker(nearEnd, moniker);
    VA::Moniker mapped = (mapping.*map)(moniker);
    VA::ProviderUtilities::transformMonikerToObjectPath(mapped, &farEnd);
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
