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

struct StatusRow {
    unsigned code;
    const char* name;
};
constexpr StatusRow statusRows[] = {
    {1, "FAILED"},
    {2, "ACCESS_DENIED"},
    {3, "INVALID_NAMESPACE"},
    {4, "INVALID_PARAMETER"},
    {5, "INVALID_CLASS"},
    {6, "NOT_FOUND"},
    {7, "NOT_SUPPORTED"},
    {8, "CLASS_HAS_CHILDREN"},
    {9, "CLASS_HAS_INSTANCES"},
    {10, "INVALID_SUPERCLASS"},
    {11, "ALREADY_EXISTS"},
    {12, "NO_SUCH_PROPERTY"},
    {13, "TYPE_MISMATCH"},
    {14, "QUERY_LANGUAGE_NOT_SUPPORTED"},
    {15, "INVALID_QUERY"},
    {16, "METHOD_NOT_AVAILABLE"},
    {17, "METHOD_NOT_FOUND"},
    {20, "NAMESPACE_NOT_EMPTY"},
    {21, "INVALID_ENUMERATION_CONTEXT"},
    {22, "INVALID_OPERATION_TIMEOUT"},
    {23, "PULL_HAS_BEEN_ABANDONED"},
    {24, "PULL_CANNOT_BE_ABANDONED"},
    {25, "FILTERED_ENUMERATION_NOT_SUPPORTED"},
    {26, "CONTINUATION_ON_ERROR_NOT_SUPPORTED"},
    {27, "SERVER_LIMITS_EXCEEDED"},
    {28, "SERVER_IS_SHUTTING_DOWN"},
};

/// Some clients crash on an ERROR without a description.
std::string statusName(unsigned code) {
    for (const StatusRow& row : statusRows)
        if (row.code == code) return row.name;
    return "status " + std::to_string(code);
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
    writeAttributeText(xml, description.empty() ? statusName(code) : shortened(description));
    xml += "\"/>";
    endResponse(xml, message);
    return xml;
}

}  // namespace cmpihost::server
