#ifndef TESTS_HOST_SERVER_RESPONSE_VALUES_H
#define TESTS_HOST_SERVER_RESPONSE_VALUES_H

#include <string>

/// The texts of values in responses.
namespace cmpihost::server::validator {

/// Whether it is the name of a type, as it is spelled in XML.
bool isType(const std::string& name);

/// Whether the text is one that a value of the type has. `type` is such a name.
bool isValueText(const std::string& type, const std::string& text);

/// Whether it is the text of a key that is tagged so: "string", "boolean", "numeric".
bool isKeyText(const std::string& valueType, const std::string& text);

/// Whether it can be the name of a class, a property or the like.
bool isIdentifier(const std::string& text);

/// The characters of a text in UTF-8.
std::size_t characterCount(const std::string& text);

}  // namespace cmpihost::server::validator

#endif
