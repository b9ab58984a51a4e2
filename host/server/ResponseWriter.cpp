// Versions are the lowest ones whatever the client's are: nothing in the responses is newer, and
// all clients take them.
#include "host/server/ResponseWriter.h"

#include <string_view>

#include "base/Utf8.h"
#include "host/server/ElementWriter.h"

namespace cmpihost::server {

namespace {

constexpr std::size_t longestDescription = 500;

std::string_view elementOf(const Message& message) {
    return message.intrinsic ? "IMETHODRESPONSE" : "METHODRESPONSE";
}

/// The first characters of a text.
std::string_view shortened(std::string_view text) {
    std::string_view rest = text;
    for (std::size_t count = 0; count < longestDescription && !rest.empty(); ++count)
        base::takeUtf8(rest);
    return text.substr(0, text.size() - rest.size());
}

}  // namespace

void beginResponse(std::string& xml, const Message& message) {
    xml +=
        "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n"
        "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"";
    writeAttributeText(xml, message.id);
    xml += "\" PROTOCOLVERSION=\"1.0\"><SIMPLERSP><";
    xml += elementOf(message);
    xml += " NAME=\"";
    writeAttributeText(xml, message.method);
    xml += "\">";
}

void endResponse(std::string& xml, const Message& message) {
    xml += "</";
    xml += elementOf(message);
    xml += "></SIMPLERSP></MESSAGE></CIM>\n";
}

std::string errorResponse(const Message& message, unsigned code, const std::string& description) {
    std::string xml;
    beginResponse(xml, message);
    xml += "<ERROR CODE=\"" + std::to_string(code) + "\" DESCRIPTION=\"";
    // Some clients crash on an ERROR without a description.
    writeAttributeText(xml, description.empty() ? "it failed" : shortened(description));
    xml += "\"/>";
    endResponse(xml, message);
    return xml;
}

}  // namespace cmpihost::server
