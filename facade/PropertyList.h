#ifndef OSSTATUS_FACADE_PROPERTY_LIST_H
#define OSSTATUS_FACADE_PROPERTY_LIST_H

#include <cmpi/cmpidt.h>

namespace VA::OSStatusFacade {

/// The instance with the properties of the list and its keys: a new one, or the instance itself
/// when the list is null. The list ends with a null; names compare without case, unknown ones are
/// passed over. Throws Refusal when the broker makes no instance.
const CMPIInstance* narrowed(const CMPIBroker* broker, const CMPIInstance* instance,
                             const char** properties);

}  // namespace VA::OSStatusFacade

#endif
