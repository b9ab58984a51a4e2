#include "host/server/ResponseWriter.h"

#include <gmock/gmock.h>

#include "host/server/ResponseValidator.h"

namespace cmpihost::server {
namespace {

Message messageOf(const std::string& id, const std::string& method, bool intrinsic = true) {
    Message message;
    message.id = id;
    message.method = method;
    message.intrinsic = intrinsic;
    message.protocolVersion = "1.4";
    return message;
}

/// The description in an ERROR response, whose document the validator takes.
std::string descriptionOf(unsigned code, const std::string& description) {
    const std::string document = errorResponse(messageOf("1", "GetClass"), code, description);
    EXPECT_THAT(complaintsAbout(document, "GetClass"), testing::ElementsAre());
    const std::string before = "DESCRIPTION=\"";
    const std::size_t start = document.find(before) + before.size();
    return document.substr(start, document.find('"', start) - start);
}

TEST(ResponseWriter, AResponseRepeatsIdAndNameInTheOldestVersions) {
    const Message message = messageOf("a<1>\"&'", "enumerateInstances");
    std::string xml;
    beginResponse(xml, message);
    xml += "<IRETURNVALUE></IRETURNVALUE>";
    endResponse(xml, message);
    EXPECT_EQ(xml,
              "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n"
              "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"a&lt;1&gt;&quot;&amp;'\" "
              "PROTOCOLVERSION=\"1.0\"><SIMPLERSP><IMETHODRESPONSE NAME=\"enumerateInstances\">"
              "<IRETURNVALUE></IRETURNVALUE></IMETHODRESPONSE></SIMPLERSP></MESSAGE></CIM>\n");
    EXPECT_THAT(complaintsAbout(xml, "enumerateInstances"), testing::ElementsAre());
}

TEST(ResponseWriter, AMethodIsAnsweredByItsOwnElement) {
    const std::string document = errorResponse(messageOf("", "Reboot", false), 16, "not <here>");
    EXPECT_EQ(document,
              "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n"
              "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"\" PROTOCOLVERSION=\"1.0\">"
              "<SIMPLERSP><METHODRESPONSE NAME=\"Reboot\"><ERROR CODE=\"16\" DESCRIPTION=\"not "
              "&lt;here&gt;\"/></METHODRESPONSE></SIMPLERSP></MESSAGE></CIM>\n");
    EXPECT_THAT(complaintsAbout(document, "Reboot"), testing::ElementsAre());
}

TEST(ResponseWriter, AnErrorAlwaysHasADescription) {
    EXPECT_EQ(descriptionOf(4711, ""), "it failed");
    EXPECT_EQ(descriptionOf(6, "a\tb\r\n\x01\xFF\"c\""),
              "a b  \xEF\xBF\xBD\xEF\xBF\xBD&quot;c&quot;");
}

TEST(ResponseWriter, ADescriptionIsCutBetweenCharacters) {
    const std::string penguin = "\xF0\x9F\x90\xA7";
    EXPECT_EQ(descriptionOf(1, std::string(500, 'x')), std::string(500, 'x'));
    EXPECT_EQ(descriptionOf(1, std::string(501, 'x')), std::string(500, 'x'));
    EXPECT_EQ(descriptionOf(1, std::string(499, 'x') + penguin + penguin),
              std::string(499, 'x') + penguin);
    EXPECT_EQ(descriptionOf(1, std::string(499, 'x') + "<<"), std::string(499, 'x') + "&lt;");
    EXPECT_EQ(descriptionOf(1, std::string(499, 'x') + "\xF0\x9F"),
              std::string(499, 'x') + "\xEF\xBF\xBD");
}

}  // namespace
}  // namespace cmpihost::server
