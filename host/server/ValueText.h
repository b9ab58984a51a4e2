#ifndef HOST_SERVER_VALUE_TEXT_H
#define HOST_SERVER_VALUE_TEXT_H

#include <string>
#include <string_view>

#include "host/broker/Value.h"

/// The types and texts of values in XML. Any threads may call these.
namespace cmpihost::server {

/// A CMPI type that has a form in XML.
struct XmlType {
    CMPIType cmpi;
    /// As TYPE and PARAMTYPE have it.
    std::string_view name;
    /// As VALUETYPE has it.
    std::string_view keyName;
};

/// The type of a value, of its elements for an array; null for one that only CMPI has, such as
/// CMPI_ptr.
const XmlType* xmlTypeOf(const Value& value);

/// Appends the text of a boolean, a number, a character, a string or a datetime, escaped. The value
/// is not null.
void writeValueText(std::string& xml, const Value& value);

}  // namespace cmpihost::server

#endif
