// What makes a message unreadable is told in the order in which clients can mend it: first that it
// is no XML, then that it is of another version, then what its elements lack.
#include "host/server/Message.h"

#include <utility>

#include "base/Ascii.h"
#include "host/server/RequestGrammar.h"

namespace cmpihost::server {

namespace {

constexpr std::size_t mostValueElements = 1000;
/// A response repeats it, escaped.
constexpr std::size_t longestId = 4096;

[[noreturn]] void refuseStructure(const std::string& detail) {
    throw MessageError(400, "request-not-valid", detail);
}

XmlElement parsedBody(std::string_view body) {
    try {
        return parseXml(body);
    } catch (const XmlError& error) {
        throw MessageError(400, "request-not-well-formed", error.what());
    }
}

/// Whether it is the major version with a point and digits behind it.
bool isVersion(std::string_view text, char major) {
    if (text.size() < 3 || text[0] != major || text[1] != '.') return false;
    for (const char digit : text.substr(2)) {
        if (!base::isDigit(digit)) return false;
    }
    return true;
}

/// An attribute that is missing is an error of structure.
void checkVersion(const XmlElement& element, const char* attribute, char major,
                  const char* cimError) {
    const std::string* const version = element.attribute(attribute);
    if (version != nullptr && !isVersion(*version, major)) {
        throw MessageError(501, cimError, std::string(attribute) + " is not " + major + ".x");
    }
}

void checkVersions(const XmlElement& root) {
    if (root.name != "CIM") refuseStructure("the document is no CIM");
    checkVersion(root, "CIMVERSION", '2', "unsupported-cim-version");
    checkVersion(root, "DTDVERSION", '2', "unsupported-dtd-version");
    const XmlElement* const message = root.child("MESSAGE");
    if (message == nullptr) return;
    checkVersion(*message, "PROTOCOLVERSION", '1', "unsupported-protocol-version");
    if (message->child("MULTIREQ") != nullptr) {
        throw MessageError(501, "multiple-requests-unsupported", "a message is one request here");
    }
}

MessageParameter readParameter(XmlElement& element, bool intrinsic) {
    MessageParameter parameter;
    parameter.name = *element.attribute("NAME");
    if (const std::string* const type = element.attribute("PARAMTYPE")) parameter.type = *type;
    if (element.children.empty()) return parameter;
    parameter.value = std::move(element.children.front());
    if (intrinsic && parameter.value->children.size() > mostValueElements) {
        refuseStructure("a parameter holds more than 1000 elements");
    }
    return parameter;
}

/// `element` is an IMETHODCALL or a METHODCALL. Its first child says where, the rest with what.
void readCall(XmlElement& element, Message& message) {
    message.intrinsic = element.name == "IMETHODCALL";
    message.method = *element.attribute("NAME");
    const XmlElement& target = element.children.front();
    if (message.intrinsic) {
        message.nameSpace = readNameSpace(target);
    } else {
        message.object = readPath(target);
        message.nameSpace = message.object.nameSpace;
    }
    message.parameters.reserve(element.children.size() - 1);
    for (auto child = element.children.begin() + 1; child != element.children.end(); ++child) {
        message.parameters.push_back(readParameter(*child, message.intrinsic));
    }
}

}  // namespace

Message readMessage(std::string_view body) {
    XmlElement root = parsedBody(body);
    checkVersions(root);
    if (const auto error = structuralError(root)) refuseStructure(*error);

    XmlElement& envelope = root.children.front();
    Message message;
    message.id = *envelope.attribute("ID");
    if (message.id.size() > longestId) refuseStructure("ID is longer than 4096 bytes");
    message.protocolVersion = *envelope.attribute("PROTOCOLVERSION");
    readCall(envelope.children.front().children.back(), message);
    return message;
}

}  // namespace cmpihost::server
