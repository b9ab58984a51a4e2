#ifndef HOST_SERVER_XML_TREE_H
#define HOST_SERVER_XML_TREE_H

#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

/// XML documents of clients, as trees of bounded size.
namespace cmpihost::server {

struct XmlAttribute {
    std::string name;
    std::string value;
};

/// An element with what it holds.
struct XmlElement {
    std::string name{};
    std::vector<XmlAttribute> attributes{};
    std::vector<XmlElement> children{};
    /// The character data that stands directly in it, references and CDATA sections decoded.
    std::string text{};

    /// The value of an attribute, null if it is not there.
    const std::string* attribute(std::string_view attributeName) const;
    /// The first child of that name, null if there is none.
    const XmlElement* child(std::string_view childName) const;
};

/// A text that is no well-formed XML in UTF-8, that declares entities, or that is larger than what
/// is read here. what() says why, in ASCII.
class XmlError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

/// Reads a whole document and gives its root. A byte order mark, comments, processing instructions
/// and a DOCTYPE without declarations are skipped. Throws XmlError, also past 32 levels, 10 000
/// elements, 16 attributes of an element or 256 bytes of a name. Any thread may call it.
XmlElement parseXml(std::string_view document);

}  // namespace cmpihost::server

#endif
