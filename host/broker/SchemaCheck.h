#ifndef HOST_BROKER_SCHEMA_CHECK_H
#define HOST_BROKER_SCHEMA_CHECK_H

#include "host/broker/BrokerCore.h"

/// Compares what a provider makes with what the schema declares. Internal. Every finding is a
/// violation; without a catalogue nothing is found.
namespace cmpihost {

/// Whether a property of that class may be set to `value`: CMPI_RC_OK, CMPI_RC_ERR_NO_SUCH_PROPERTY
/// or CMPI_RC_ERR_TYPE_MISMATCH.
CMPIrc checkProperty(BrokerCore& core, const ClassDeclaration& declaration, std::string_view name,
                     const Value& value);

/// A path that a provider hands to a client: its class is declared, its keys are the declared ones.
/// References in it are paths that the client sees too.
void checkPath(BrokerCore& core, const ObjectPathValue& path);

/// The path of the instance, and that its key properties agree with it.
void checkInstance(BrokerCore& core, const InstanceValue& instance);

/// Gives the path the declared keys that it lacks from the properties, as object managers do. A
/// null declaration declares no keys.
void completeKeys(const ClassDeclaration* declaration, const std::vector<PropertyValue>& properties,
                  ObjectPathValue& path);

}  // namespace cmpihost

#endif
