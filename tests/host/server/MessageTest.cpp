// Requests as clients send them, and what is wrong with those that are none.
#include "host/server/Message.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>

#include "host/server/ElementWriter.h"
#include "host/server/ResponseValidator.h"
#include "host/server/ServerFixture.h"

namespace cmpihost::server {
namespace {

using namespace std::string_literals;

/// One request of each kind, as clients send them.
std::vector<std::string> sampleRequests() {
    std::vector<std::string> requests;
    const std::string folder = KORVA_SOURCE_DIR "/tests/fuzz/seeds/CimMessages";
    for (const auto& entry : std::filesystem::directory_iterator(folder)) {
        std::ifstream file(entry.path());
        requests.emplace_back(std::istreambuf_iterator<char>(file),
                              std::istreambuf_iterator<char>());
    }
    return requests;
}

std::string sampleRequest(const std::string& name) {
    std::ifstream file(KORVA_SOURCE_DIR "/tests/fuzz/seeds/CimMessages/" + name);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

std::string replaced(std::string text, const std::string& part, const std::string& by) {
    const std::size_t at = text.find(part);
    EXPECT_NE(at, text.npos) << part;
    return text.replace(at, part.size(), by);
}

/// "400 word: why" of a text that is no message; empty for a message.
std::string messageRefusal(const std::string& body) {
    try {
        readMessage(body);
    } catch (const MessageError& error) {
        return std::to_string(error.httpStatus()) + " " + error.cimError() + ": " + error.what();
    }
    return {};
}

const std::string plainCall =
    "<CIM CIMVERSION='2.0' DTDVERSION='2.0'><MESSAGE ID='7' PROTOCOLVERSION='1.0'><SIMPLEREQ>"
    "<IMETHODCALL NAME='GetClass'><LOCALNAMESPACEPATH><NAMESPACE NAME='root'/></LOCALNAMESPACEPATH>"
    "<IPARAMVALUE NAME='ClassName'><CLASSNAME NAME='A'/></IPARAMVALUE></IMETHODCALL></SIMPLEREQ>"
    "</MESSAGE></CIM>";
const std::string plainParameter = "<CLASSNAME NAME='A'/>";

std::string callWith(const std::string& content) {
    return replaced(plainCall, plainParameter, content);
}

TEST(Message, OfAnIntrinsicCallHasItsNamesAndParameters) {
    const Message message = readMessage(sampleRequest("enumerate-instances"));
    EXPECT_EQ(message.id, "4711");
    EXPECT_EQ(message.protocolVersion, "1.0");
    EXPECT_TRUE(message.intrinsic);
    EXPECT_EQ(message.method, "EnumerateInstances");
    EXPECT_EQ(message.nameSpace, "root/cimv2");
    ASSERT_EQ(message.parameters.size(), 5U);
    EXPECT_EQ(message.parameters[0].name, "ClassName");
    EXPECT_EQ(message.parameters[0].value->name, "CLASSNAME");
    EXPECT_EQ(message.parameters[1].name, "DeepInheritance");
    EXPECT_EQ(message.parameters[1].value->text, "TRUE");
}

TEST(Message, OfAMethodCallHasAnObjectAndTypes) {
    const Message message = readMessage(sampleRequest("method-of-instance"));
    EXPECT_FALSE(message.intrinsic);
    EXPECT_EQ(message.method, "RequestStateChange");
    EXPECT_EQ(message.nameSpace, "root/cimv2");
    EXPECT_TRUE(message.object.instance);
    EXPECT_EQ(message.object.className, "KORVA_OperatingSystem");
    ASSERT_EQ(message.object.keys.size(), 4U);
    EXPECT_EQ(message.object.keys[3].text, "Debian GNU/Linux");
    ASSERT_EQ(message.parameters.size(), 4U);
    EXPECT_EQ(message.parameters[0].type, "uint16");
    EXPECT_EQ(message.parameters[1].type, "");
    EXPECT_EQ(message.parameters[2].value->name, "VALUE.REFARRAY");
    EXPECT_FALSE(message.parameters[3].value);
    EXPECT_FALSE(readMessage(sampleRequest("method-of-class")).object.instance);
}

TEST(Message, MayHoldWhatIsNotLookedAt) {
    const Message message = readMessage(sampleRequest("tolerated"));
    EXPECT_EQ(message.id, "<\"1\">");
    EXPECT_EQ(message.protocolVersion, "1.4");
    EXPECT_EQ(message.method, "enumerateinstancenames");
    EXPECT_EQ(message.nameSpace, "root/cimv2");
    EXPECT_EQ(message.parameters.at(0).name, "CLASSNAME");
}

TEST(Message, IsWellFormedUtf8WithoutEntities) {
    EXPECT_EQ(messageRefusal(plainCall), "");
    const struct {
        std::string body;
        const char* refusal;
    } rows[] = {
        {"", "400 request-not-well-formed: line 1: no element found"},
        {plainCall.substr(0, 250), "400 request-not-well-formed: line 1: unclosed token"},
        {plainCall + plainCall, "400 request-not-well-formed: line 1: junk after document element"},
        {callWith("<VALUE>\xFF</VALUE>"), "400 request-not-well-formed: the document is not UTF-8"},
        {callWith("<VALUE>&#0;</VALUE>"),
         "400 request-not-well-formed: line 1: reference to invalid character number"},
        {"<!DOCTYPE CIM [<!ENTITY a 'b'>]>" + plainCall,
         "400 request-not-well-formed: the DOCTYPE has declarations"},
    };
    for (const auto& row : rows) EXPECT_EQ(messageRefusal(row.body), row.refusal) << row.body;
}

TEST(Message, IsOfKnownVersions) {
    const struct {
        const char* attribute;
        const char* version;
        const char* refusal;
    } rows[] = {
        {"CIMVERSION", "2.0", ""},
        {"CIMVERSION", "2.12", ""},
        {"CIMVERSION", "3.0", "501 unsupported-cim-version: CIMVERSION is not 2.x"},
        {"CIMVERSION", "2.", "501 unsupported-cim-version: CIMVERSION is not 2.x"},
        {"CIMVERSION", "2.0.1", "501 unsupported-cim-version: CIMVERSION is not 2.x"},
        {"CIMVERSION", "", "501 unsupported-cim-version: CIMVERSION is not 2.x"},
        {"DTDVERSION", "2.4", ""},
        {"DTDVERSION", "1.0", "501 unsupported-dtd-version: DTDVERSION is not 2.x"},
        {"DTDVERSION", "2", "501 unsupported-dtd-version: DTDVERSION is not 2.x"},
        {"PROTOCOLVERSION", "1.4", ""},
        {"PROTOCOLVERSION", "2.0", "501 unsupported-protocol-version: PROTOCOLVERSION is not 1.x"},
        {"PROTOCOLVERSION", "1.a", "501 unsupported-protocol-version: PROTOCOLVERSION is not 1.x"},
    };
    for (const auto& row : rows) {
        const std::size_t at = plainCall.find(row.attribute);
        const std::size_t value = plainCall.find('\'', at) + 1;
        std::string body = plainCall;
        body.replace(value, 3, row.version);
        EXPECT_EQ(messageRefusal(body), row.refusal) << body;
    }
    // The version is the first thing to know: of another one everything else may be different.
    EXPECT_EQ(messageRefusal("<CIM CIMVERSION='3.0'><NEW/></CIM>"),
              "501 unsupported-cim-version: CIMVERSION is not 2.x");
}

TEST(Message, IsOneRequest) {
    const std::string request = plainCall.substr(plainCall.find("<SIMPLEREQ>"));
    const std::string batch = "<MULTIREQ><SIMPLEREQ/><SIMPLEREQ/></MULTIREQ></MESSAGE></CIM>";
    EXPECT_EQ(messageRefusal(replaced(plainCall, request, batch)),
              "501 multiple-requests-unsupported: a message is one request here");
}

TEST(Message, HasAnIdThatCanBeRepeated) {
    const std::string longest(4096, '"');
    EXPECT_EQ(readMessage(replaced(plainCall, "ID='7'", "ID='" + longest + "'")).id, longest);
    EXPECT_EQ(messageRefusal(replaced(plainCall, "ID='7'", "ID='" + longest + "x'")),
              "400 request-not-valid: ID is longer than 4096 bytes");
}

TEST(Message, HasTheStructureOfARequest) {
    const struct {
        const char* part;
        const char* by;
        const char* refusal;
    } rows[] = {
        {" CIMVERSION='2.0'", "", "CIM lacks the attribute CIMVERSION"},
        {" DTDVERSION='2.0'", "", "CIM lacks the attribute DTDVERSION"},
        {" ID='7'", "", "MESSAGE lacks the attribute ID"},
        {" PROTOCOLVERSION='1.0'", "", "MESSAGE lacks the attribute PROTOCOLVERSION"},
        {" NAME='GetClass'", "", "IMETHODCALL lacks the attribute NAME"},
        {" NAME='root'", "", "NAMESPACE lacks the attribute NAME"},
        {" NAME='ClassName'", "", "IPARAMVALUE lacks the attribute NAME"},
        {" NAME='A'", "", "CLASSNAME lacks the attribute NAME"},
        {" NAME='A'", " name='A'", "CLASSNAME lacks the attribute NAME"},
        {"<NAMESPACE NAME='root'/>", "", "LOCALNAMESPACEPATH lacks NAMESPACE"},
        {"<LOCALNAMESPACEPATH><NAMESPACE NAME='root'/></LOCALNAMESPACEPATH>", "",
         "IMETHODCALL lacks LOCALNAMESPACEPATH"},
        {"</LOCALNAMESPACEPATH>", "</LOCALNAMESPACEPATH>\n text", "there is text in IMETHODCALL"},
        {"<CLASSNAME NAME='A'/>", "<VALUE/><VALUE/>",
         "VALUE does not belong where it is in IPARAMVALUE"},
        {"<CLASSNAME NAME='A'/>", "<CLASSNAME NAME='A'><VALUE/></CLASSNAME>",
         "VALUE does not belong where it is in CLASSNAME"},
        {"<CLASSNAME NAME='A'/>", "<VALUE><VALUE/></VALUE>",
         "VALUE does not belong where it is in VALUE"},
        {"<CLASSNAME NAME='A'/>", "<classname NAME='A'/>",
         "classname does not belong where it is in IPARAMVALUE"},
        {"<CLASSNAME NAME='A'/>", "<\xC3\xA9/>",
         "\\xC3\\xA9 does not belong where it is in IPARAMVALUE"},
        {"<CLASSNAME NAME='A'/>",
         "<INSTANCENAME CLASSNAME='A'><KEYVALUE/><KEYVALUE/></INSTANCENAME>",
         "KEYVALUE does not belong where it is in INSTANCENAME"},
        {"<CLASSNAME NAME='A'/>",
         "<INSTANCENAME CLASSNAME='A'><KEYBINDING NAME='K'/></INSTANCENAME>",
         "KEYBINDING lacks KEYVALUE|VALUE.REFERENCE"},
        {"<CLASSNAME NAME='A'/>",
         "<INSTANCENAME CLASSNAME='A'><KEYBINDING><KEYVALUE/></KEYBINDING></INSTANCENAME>",
         "KEYBINDING lacks the attribute NAME"},
        {"<CLASSNAME NAME='A'/>", "<VALUE.REFERENCE/>",
         "VALUE.REFERENCE lacks "
         "CLASSPATH|LOCALCLASSPATH|CLASSNAME|INSTANCEPATH|LOCALINSTANCEPATH|INSTANCENAME"},
        {"<CLASSNAME NAME='A'/>", "<INSTANCE CLASSNAME='A'><PROPERTY NAME='P'/></INSTANCE>",
         "PROPERTY lacks the attribute TYPE"},
        {"<SIMPLEREQ>", "<SIMPLEREQ><METHODCALL/>",
         "IMETHODCALL does not belong where it is in SIMPLEREQ"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(messageRefusal(replaced(plainCall, row.part, row.by)),
                  "400 request-not-valid: "s + row.refusal);
    }
    for (const char* root : {"<HTML/>", "<cim/>", "<MESSAGE/>"}) {
        EXPECT_EQ(messageRefusal(root), "400 request-not-valid: the document is no CIM");
    }
    for (const char* content : {"SIMPLERSP", "MULTIRSP", "SIMPLEEXPREQ", "MULTIEXPREQ"}) {
        const std::string message = "<MESSAGE ID='1' PROTOCOLVERSION='1.0'><"s + content + "/>";
        EXPECT_EQ(messageRefusal("<CIM CIMVERSION='2.0' DTDVERSION='2.0'>" + message +
                                 "</MESSAGE></CIM>"),
                  "400 request-not-valid: MESSAGE lacks SIMPLEREQ");
    }
    EXPECT_EQ(messageRefusal("<CIM CIMVERSION='2.0' DTDVERSION='2.0'><DECLARATION/></CIM>"),
              "400 request-not-valid: CIM lacks MESSAGE");
}

TEST(Message, IsUnderstoodWhereOnlyAValueIsOfTheWrongKind) {
    for (const char* content : {
             "",
             "<VALUE>a</VALUE>",
             "<VALUE.ARRAY/>",
             "<VALUE.REFARRAY/>",
             "<INSTANCENAME CLASSNAME='A'/>",
             "<LOCALCLASSPATH><LOCALNAMESPACEPATH><NAMESPACE NAME='root'/></LOCALNAMESPACEPATH>"
             "<CLASSNAME NAME='A'/></LOCALCLASSPATH>",
             "<CLASS NAME='A'/>",
         }) {
        EXPECT_EQ(readMessage(callWith(content)).method, "GetClass") << content;
    }
}

TEST(Message, HasBoundedNumbersOfThings) {
    const auto times = [](std::size_t count, const std::string& text) {
        std::string result;
        while (count-- > 0) result += text;
        return result;
    };
    const auto parameters = [&](std::size_t count) {
        return replaced(plainCall, "</LOCALNAMESPACEPATH>",
                        "</LOCALNAMESPACEPATH>" + times(count, "<IPARAMVALUE NAME='P'/>"));
    };
    EXPECT_EQ(readMessage(parameters(63)).parameters.size(), 64U);
    EXPECT_EQ(messageRefusal(parameters(64)),
              "400 request-not-valid: IPARAMVALUE does not belong where it is in IMETHODCALL");

    const auto keys = [&](std::size_t count) {
        return callWith("<INSTANCENAME CLASSNAME='A'>" +
                        times(count, "<KEYBINDING NAME='K'><KEYVALUE/></KEYBINDING>") +
                        "</INSTANCENAME>");
    };
    EXPECT_EQ(readMessage(keys(1000)).parameters.at(0).value->children.size(), 1000U);
    EXPECT_EQ(messageRefusal(keys(1001)),
              "400 request-not-valid: KEYBINDING does not belong where it is in INSTANCENAME");

    const auto names = [&](std::size_t count) {
        return callWith("<VALUE.ARRAY>" + times(count, "<VALUE>P</VALUE>") + "</VALUE.ARRAY>");
    };
    EXPECT_EQ(readMessage(names(1000)).parameters.at(0).value->children.size(), 1000U);
    EXPECT_EQ(messageRefusal(names(1001)),
              "400 request-not-valid: a parameter holds more than 1000 elements");
    EXPECT_EQ(messageRefusal(names(10000)),
              "400 request-not-well-formed: there are more than 10000 elements");
    EXPECT_EQ(messageRefusal(callWith(times(30, "<A>") + times(30, "</A>"))),
              "400 request-not-well-formed: elements lie deeper than 32 levels");
}

/// The element as a document, without the one of its parts (elements and attributes, itself the
/// first of them) that `part` counts down to.
std::string without(const XmlElement& element, int& part) {
    if (part-- == 0) return {};
    std::string xml = "<" + element.name;
    for (const XmlAttribute& attribute : element.attributes) {
        if (part-- == 0) continue;
        xml += " " + attribute.name + "=\"";
        writeAttributeText(xml, attribute.value);
        xml += '"';
    }
    xml += ">";
    writeText(xml, element.text);
    for (const XmlElement& child : element.children) xml += without(child, part);
    return xml + "</" + element.name + ">";
}

/// All the documents that lack one part of the document.
std::vector<std::string> withoutEachPart(const std::string& document) {
    std::vector<std::string> results;
    try {
        const XmlElement root = parseXml(document);
        for (int missing = 0;; ++missing) {
            int part = missing;
            std::string result = without(root, part);
            if (part >= 0) return results;
            results.push_back(std::move(result));
        }
    } catch (const XmlError&) {
        return results;
    }
}

TEST(Message, IsAnsweredOrRefusedWhateverPartIsMissing) {
    std::size_t answered = 0;
    std::size_t refused = 0;
    for (const std::string& request : sampleRequests()) {
        for (const std::string& body : withoutEachPart(request)) {
            const std::string answer = fixture::respond(body);
            if (answer.substr(0, 9) == "HTTP 400:" || answer.substr(0, 9) == "HTTP 501:") {
                ++refused;
            } else {
                ++answered;
                EXPECT_EQ(complaintsAbout(answer), std::vector<std::string>()) << body;
            }
        }
    }
    EXPECT_GT(answered, 300U);
    EXPECT_GT(refused, 500U);
}

}  // namespace
}  // namespace cmpihost::server
