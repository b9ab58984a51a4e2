#ifndef HOST_SERVER_XML_TEXT_H
#define HOST_SERVER_XML_TEXT_H

#include <string>
#include <string_view>

/// Texts in XML; each function appends to `xml`. What is no XML in a text (control characters,
/// bytes that are no UTF-8) becomes U+FFFD. Any threads may call these.
namespace cmpihost::server {

/// As the content of an element.
void writeText(std::string& xml, std::string_view text);

/// As the value of an attribute in double quotes: tabs and ends of lines become blanks.
void writeAttributeText(std::string& xml, std::string_view text);

/// A blank and the whole attribute. `name` is one of XML.
void writeAttribute(std::string& xml, std::string_view name, std::string_view value);

}  // namespace cmpihost::server

#endif
