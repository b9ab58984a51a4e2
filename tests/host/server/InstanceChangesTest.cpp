// What changes instances and what queries them, and how providers get it.
#include <gmock/gmock.h>

#include "host/server/ServerFixture.h"

namespace cmpihost::server {
namespace {

using namespace fixture;
using testing::StartsWith;

/// An INSTANCE of TEST_Thing, with its properties.
std::string thing(const std::string& properties) {
    return "<INSTANCE CLASSNAME=\"test_thing\">" + properties + "</INSTANCE>";
}

std::string property(const std::string& name, const std::string& type, const std::string& text) {
    return "<PROPERTY NAME=\"" + name + "\" TYPE=\"" + type + "\"><VALUE>" + text +
           "</VALUE></PROPERTY>";
}

std::string thingNamed(const std::string& name) {
    return parameter("InstanceName", instanceName("TEST_Thing", {{"name", name}}));
}

/// What foreign providers answer: the content or the error.
std::string foreign(const std::string& name, const std::string& parameters) {
    const std::string document =
        respond(foreignManager(), operation(name, parameters, "root/TEST"));
    return error(document).empty() ? content(document) : error(document);
}

TEST(InstanceChanges, CreateChangeAndDeleteWhereAProviderDoes) {
    const std::string created =
        "<IRETURNVALUE><INSTANCENAME CLASSNAME=\"TEST_Thing\">"
        "<KEYBINDING NAME=\"Name\"><KEYVALUE VALUETYPE=\"string\">second"
        "</KEYVALUE></KEYBINDING></INSTANCENAME></IRETURNVALUE>";
    const std::string second = parameter("NewInstance", thing(property("name", "string", "second") +
                                                              property("u16", "uint16", "7")));
    EXPECT_EQ(foreign("CreateInstance", second), created);
    EXPECT_EQ(foreign("CreateInstance", second),
              "11: CreateInstance of TEST_Thing: it exists already");
    EXPECT_EQ(foreign("GetProperty", thingNamed("second") + value("PropertyName", "U16")),
              "<IRETURNVALUE><VALUE>7</VALUE></IRETURNVALUE>");
    EXPECT_EQ(foreign("SetProperty", thingNamed("second") + value("PropertyName", "u16") +
                                         value("NewValue", "0x10")),
              "");
    EXPECT_EQ(foreign("GetProperty", thingNamed("second") + value("PropertyName", "U16")),
              "<IRETURNVALUE><VALUE>16</VALUE></IRETURNVALUE>");
    EXPECT_EQ(
        foreign(
            "ModifyInstance",
            parameter("ModifiedInstance",
                      "<VALUE.NAMEDINSTANCE>" + instanceName("TEST_Thing", {{"Name", "second"}}) +
                          thing(property("Text", "string", "new")) + "</VALUE.NAMEDINSTANCE>") +
                list("PropertyList", {"Text"})),
        "");
    EXPECT_EQ(foreign("DeleteInstance", thingNamed("second")), "");
    EXPECT_EQ(foreign("DeleteInstance", thingNamed("second")), "6: no such thing");
    EXPECT_EQ(foreign("GetInstance", thingNamed("second")),
              "6: GetInstance of TEST_Thing: there is no such instance");
}

TEST(InstanceChanges, SentInstancesReachProvidersInTheTypesOfTheSchema) {
    // The provider tells what came: each property with its CMPI type in hexadecimal.
    EXPECT_EQ(
        foreign("ModifyInstance",
                parameter(
                    "ModifiedInstance",
                    "<VALUE.NAMEDINSTANCE>" + instanceName("TEST_Thing", {{"Name", "none"}}) +
                        thing(property("u8", "uint64", "9") + property("FLAG", "boolean", "true") +
                              "<PROPERTY NAME=\"Text\" TYPE=\"string\"/>") +
                        "</VALUE.NAMEDINSTANCE>") +
                    list("PropertyList", {"u8", "Text"})),
        "1: modify U8:80 Flag:2 Text:1600(null) [u8] [Text]");
}

TEST(InstanceChanges, SentInstancesThatDoNotFitTheSchemaAreRefused) {
    const auto create = [](const std::string& properties) {
        return foreign("CreateInstance", parameter("NewInstance", thing(properties)));
    };
    const auto modify = [](const std::string& className, const std::string& properties) {
        return foreign(
            "ModifyInstance",
            parameter("ModifiedInstance", "<VALUE.NAMEDINSTANCE>" +
                                              instanceName("TEST_Thing", {{"Name", "first"}}) +
                                              "<INSTANCE CLASSNAME=\"" + className + "\">" +
                                              properties + "</INSTANCE></VALUE.NAMEDINSTANCE>"));
    };
    EXPECT_EQ(create(property("Nonsense", "string", "x")),
              "4: TEST_Thing has no property Nonsense");
    EXPECT_EQ(create(property("U8", "uint8", "256")), "4: U8: '256' is no uint8");
    EXPECT_EQ(modify("TEST_Thing", property("Nonsense", "string", "x")),
              "12: TEST_Thing has no property Nonsense");
    EXPECT_EQ(foreign("SetProperty", thingNamed("first") + value("PropertyName", "Colour") +
                                         value("NewValue", "1")),
              "12: TEST_Thing has no property Colour");
    EXPECT_EQ(modify("TEST_Part", ""), "4: the instance is of TEST_Part, its path of TEST_Thing");
    EXPECT_EQ(foreign("SetProperty",
                      thingNamed("first") + value("PropertyName", "List") + value("NewValue", "1")),
              "13: a single value is given for an array");
}

TEST(Queries, AreForProvidersToUnderstand) {
    const auto asked = [](const char* language, const char* query) {
        return foreign("ExecQuery", value("QueryLanguage", language) + value("Query", query));
    };
    EXPECT_THAT(asked("DMTF:CQL", "SELECT * FROM TEST_Thing"),
                StartsWith("<IRETURNVALUE><VALUE.OBJECTWITHPATH><INSTANCEPATH><NAMESPACEPATH>"
                           "<HOST>server.example</HOST>"));
    EXPECT_EQ(asked("DMTF:CQL", "SELECT x FROM TEST_Thing"), "15: SELECT x FROM TEST_Thing");
    EXPECT_EQ(asked("WQL", "SELECT * FROM TEST_Thing"), "14: WQL");
    EXPECT_EQ(asked("WQL", "SELECT *"), "15: the query names no class behind FROM: SELECT *");
    EXPECT_THAT(asked("WQL", "SELECT * FROM TEST_Base"), StartsWith("14: "));
    EXPECT_THAT(asked("WQL", "SELECT * FROM TEST_Link"),
                StartsWith("7: no instance provider is registered for TEST_Link"));
}

}  // namespace
}  // namespace cmpihost::server
