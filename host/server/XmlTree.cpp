#include "host/server/XmlTree.h"

namespace cmpihost::server {

const std::string* XmlElement::attribute(std::string_view attributeName) const {
    for (const XmlAttribute& each : attributes) {
        if (each.name == attributeName) return &each.value;
    }
    return nullptr;
}

const XmlElement* XmlElement::child(std::string_view childName) const {
    for (const XmlElement& each : children) {
        if (each.name == childName) return &each;
    }
    return nullptr;
}

XmlElement parseXml(std::string_view) {
    throw XmlError("not built yet");
}

}  // namespace cmpihost::server
