#ifndef HOST_SERVER_REQUEST_VALUE_H
#define HOST_SERVER_REQUEST_VALUE_H

#include <optional>
#include <string>

#include "host/broker/ClassCatalogue.h"
#include "host/broker/Value.h"
#include "host/server/XmlTree.h"

/// Values as clients send them.
namespace cmpihost::server {

/// The value that a text stands for; none when it stands for none of that type. `type` is a scalar
/// type other than a reference. Integers are decimal or hexadecimal and in range, datetimes 25
/// characters, booleans TRUE or FALSE in any case, reals decimal or INF, -INF, NaN. Blanks count.
std::optional<Value> valueFromText(const std::string& text, CMPIType type);

/// The CMPI type that a name of a CIM type stands for ("uint16", "reference"), without case; none
/// for any other name.
std::optional<CMPIType> typeNamed(const std::string& name);

/// The value of a VALUE, VALUE.ARRAY, VALUE.REFERENCE or VALUE.REFARRAY whose structure has been
/// checked, in that type (with CMPI_ARRAY for an array). A reference without a namespace is in
/// `nameSpace`. Throws CimError: cimInvalidParameter for a text that is no such value,
/// cimTypeMismatch for an array in place of a single value or the other way round.
Value readValue(const XmlElement& element, CMPIType type, const ClassCatalogue& catalogue,
                const std::string& nameSpace);

/// An INSTANCE as a client sends it. Its properties have the types that the schema declares, else
/// those that the client tells; its path has the keys that are among the properties. Throws
/// CimError as readValue does.
InstanceValue readInstance(const XmlElement& element, const ClassCatalogue& catalogue,
                           const std::string& nameSpace);

}  // namespace cmpihost::server

#endif
