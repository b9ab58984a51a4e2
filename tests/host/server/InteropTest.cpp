#include "host/server/Interop.h"

#include <gtest/gtest.h>

#include "host/server/ResponseValidator.h"
#include "host/server/ServerFixture.h"

namespace cmpihost::server {
namespace {

using InteropTexts = std::vector<std::string>;

const std::string objectManagerText =
    "root/interop:KORVA_ObjectManager.SystemCreationClassName=\"KORVA_ComputerSystem\","
    "SystemName=\"vm\",CreationClassName=\"KORVA_ObjectManager\",Name=\"cmpihost\"";

std::string nameSpaceText(const std::string& name) {
    return "root/interop:CIM_Namespace.SystemCreationClassName=\"KORVA_ComputerSystem\","
           "SystemName=\"vm\",ObjectManagerCreationClassName=\"KORVA_ObjectManager\","
           "ObjectManagerName=\"cmpihost\",CreationClassName=\"CIM_Namespace\",Name=\"" +
           name + "\"";
}

class TheInteropNamespace : public testing::Test {
  protected:
    OperationResult ask(Operation operation, const ObjectPathValue& path) const {
        OperationRequest request;
        request.operation = operation;
        request.path = path;
        return interop_.ask(request);
    }

    InteropTexts paths(const std::string& className) const {
        InteropTexts texts;
        const ObjectPathValue path{"root/interop", className};
        for (const ObjectPathValue& each : ask(Operation::EnumerateInstanceNames, path).paths)
            texts.push_back(toString(each));
        return texts;
    }

    /// "NAME VALUE" of each property.
    InteropTexts properties(const std::string& className) const {
        InteropTexts texts;
        const ObjectPathValue path{"root/interop", className};
        for (const InstanceValue& each : ask(Operation::EnumerateInstances, path).instances)
            for (const PropertyValue& property : each.properties)
                texts.push_back(property.name + " " + property.value.toText());
        return texts;
    }

    Statistics statistics_;
    const Interop interop_{"vm", {"root/cimv2", "root/interop"}, statistics_};
};

TEST_F(TheInteropNamespace, HasAnObjectManagerAndItsNamespaces) {
    const InteropTexts spaces = {nameSpaceText("root/cimv2"), nameSpaceText("root/interop")};
    const struct {
        const char* className;
        InteropTexts paths;
    } rows[] = {
        {"CIM_ObjectManager", {objectManagerText}},
        {"korva_objectmanager", {objectManagerText}},
        {"CIM_WBEMService", {objectManagerText}},
        {"CIM_Service", {objectManagerText}},
        {"CIM_EnabledLogicalElement", {objectManagerText}},
        {"CIM_Namespace", spaces},
        {"CIM_ManagedElement", {objectManagerText, spaces[0], spaces[1]}},
        {"__Namespace",
         {"root/interop:__Namespace.Name=\"root/cimv2\"",
          "root/interop:__Namespace.Name=\"root/interop\""}},
    };
    for (const auto& row : rows) {
        EXPECT_TRUE(interop_.serves(row.className)) << row.className;
        EXPECT_EQ(paths(row.className), row.paths) << row.className;
    }
}

TEST_F(TheInteropNamespace, TellsWhatTheServerDid) {
    statistics_.countOperation(std::chrono::microseconds(300), false);
    statistics_.countOperation(std::chrono::nanoseconds(1700999), true);
    statistics_.countRefusal();
    const InteropTexts expected = {
        "Description cmpihost version " KORVA_VERSION
        ", which answers WBEM clients from the CMPI providers of this host",
        "ElementName cmpihost",
        "EnabledState 2",
        "SystemCreationClassName KORVA_ComputerSystem",
        "SystemName vm",
        "CreationClassName KORVA_ObjectManager",
        "Name cmpihost",
        "Started true",
        "GatherStatisticalData false",
        "Operations 2",
        "FailedOperations 1",
        "RefusedRequests 1",
        "OperationTime 2000",
        "UpTime 0"};
    EXPECT_EQ(properties("CIM_ObjectManager"), expected);
}

TEST_F(TheInteropNamespace, HasOnlyPropertiesThatItsClassesDeclareInTheirTypes) {
    const ObjectPathValue path{"root/interop", "CIM_ManagedElement"};
    std::vector<InstanceValue> all = ask(Operation::EnumerateInstances, path).instances;
    all.push_back(ask(Operation::EnumerateInstances, {"root/interop", "__Namespace"}).instances[0]);
    ASSERT_EQ(all.size(), 4U);
    for (const InstanceValue& each : all) {
        const ClassDeclaration* const declared = interop_.catalogue().find(each.path.className);
        ASSERT_NE(declared, nullptr);
        std::size_t keys = 0;
        for (const PropertyDeclaration& property : declared->properties) keys += property.key;
        EXPECT_EQ(each.path.keys.size(), keys);
        for (const PropertyValue& property : each.properties) {
            const PropertyDeclaration* const known = declared->property(property.name);
            ASSERT_NE(known, nullptr) << property.name;
            EXPECT_EQ(known->type, property.value.type()) << property.name;
            EXPECT_EQ(known->key, each.path.key(property.name) != nullptr) << property.name;
        }
    }
}

TEST_F(TheInteropNamespace, AnswersNothingElse) {
    const ObjectPathValue manager =
        ask(Operation::EnumerateInstanceNames, {"root/interop", "CIM_ObjectManager"}).paths.at(0);
    ObjectPathValue stranger = manager;
    stranger.keys.back().value = "another";
    const struct {
        Operation operation;
        ObjectPathValue path;
        CMPIrc rc;
        std::string message;
    } rows[] = {
        {Operation::GetInstance, manager, CMPI_RC_OK, ""},
        {Operation::GetInstance, stranger, CMPI_RC_ERR_NOT_FOUND,
         "root/interop:KORVA_ObjectManager.SystemCreationClassName=\"KORVA_ComputerSystem\","
         "SystemName=\"vm\",CreationClassName=\"KORVA_ObjectManager\",Name=\"another\": no such "
         "instance"},
        {Operation::EnumerateInstances,
         {"root/interop", "CIM_RegisteredProfile"},
         CMPI_RC_ERR_INVALID_CLASS,
         "CIM_RegisteredProfile: no such class in root/interop"},
        {Operation::DeleteInstance, manager, CMPI_RC_ERR_NOT_SUPPORTED,
         "what root/interop holds is only to be read, not by DeleteInstance"},
        {Operation::ExecQuery,
         {"root/interop", "CIM_Namespace"},
         CMPI_RC_ERR_NOT_SUPPORTED,
         "what root/interop holds is only to be read, not by ExecQuery"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.path.className);
        const OperationResult result = ask(row.operation, row.path);
        EXPECT_EQ(result.rc, row.rc);
        EXPECT_EQ(result.message.value_or(""), row.message);
        EXPECT_EQ(result.instances.size(), row.rc == CMPI_RC_OK ? 1U : 0U);
    }
}

}  // namespace

namespace fixture {
namespace {

std::string interopAnswer(const std::string& name, const std::string& parameters) {
    const std::string document = respond(operation(name, parameters, "root/interop"));
    for (const std::string& complaint : complaintsAbout(document, name)) ADD_FAILURE() << complaint;
    return document;
}

std::string objectManagerParameter(const std::string& creationClass, const std::string& name) {
    return parameter(
        "InstanceName",
        instanceName("KORVA_ObjectManager", {{"Name", name},
                                             {"CreationClassName", creationClass},
                                             {"SystemName", "server.example"},
                                             {"SystemCreationClassName", "KORVA_ComputerSystem"}}));
}

TEST(TheInteropNamespaceOfAServer, IsTheSecondThatClientsTry) {
    const std::string spaces = className("ClassName", "CIM_Namespace");
    EXPECT_EQ(error(respond(operation("EnumerateInstanceNames", spaces, "interop"))),
              "3: interop: no such namespace");
    const std::string found = interopAnswer("EnumerateInstanceNames", spaces);
    const std::string key = "<KEYBINDING NAME=\"Name\"><KEYVALUE VALUETYPE=\"string\">";
    EXPECT_EQ(count(found, key), 2U);
    EXPECT_EQ(count(found, key + "root/cimv2<"), 1U);
    EXPECT_EQ(count(found, key + "root/interop<"), 1U);
    EXPECT_EQ(error(respond(operation("EnumerateInstanceNames", spaces, "root/PG_Interop"))),
              "3: root/PG_Interop: no such namespace");
}

TEST(TheInteropNamespaceOfAServer, GivesItsObjectManagerByAllKeys) {
    const std::string brand = list("PropertyList", {"elementname"});
    EXPECT_EQ(
        content(interopAnswer("GetInstance",
                              objectManagerParameter("korva_objectmanager", "cmpihost") + brand)),
        "<IRETURNVALUE><INSTANCE CLASSNAME=\"KORVA_ObjectManager\"><PROPERTY "
        "NAME=\"ElementName\" TYPE=\"string\"><VALUE>cmpihost</VALUE></PROPERTY></INSTANCE>"
        "</IRETURNVALUE>");
    EXPECT_EQ(
        error(interopAnswer("GetInstance", objectManagerParameter("KORVA_ObjectManager", "cimom")))
            .substr(0, 3),
        "6: ");
    const std::string oneKey =
        parameter("InstanceName", instanceName("KORVA_ObjectManager", {{"Name", "cmpihost"}}));
    EXPECT_EQ(error(interopAnswer("GetInstance", oneKey)).substr(0, 3), "4: ");
}

TEST(TheInteropNamespaceOfAServer, CountsEachOperation) {
    ObjectManagerSetup setup;
    setup.hostName = "server.example";
    ObjectManager manager(std::move(setup));
    const std::string request =
        operation("EnumerateInstances",
                  className("ClassName", "CIM_ObjectManager") +
                      list("PropertyList", {"Operations", "FailedOperations"}),
                  "root/interop");
    const auto counters = [&](const std::string& operations, const std::string& failed) {
        return "<PROPERTY NAME=\"Operations\" TYPE=\"uint64\"><VALUE>" + operations +
               "</VALUE></PROPERTY><PROPERTY NAME=\"FailedOperations\" TYPE=\"uint64\"><VALUE>" +
               failed + "</VALUE></PROPERTY>";
    };
    EXPECT_EQ(count(respond(manager, request), counters("0", "0")), 1U);
    respond(manager, operation("EnumerateInstances", className("ClassName", "KORVA_Foo")));
    EXPECT_EQ(count(respond(manager, request), counters("2", "1")), 1U);
}

TEST(TheInteropNamespaceOfAServer, FailsWithTheStatusThatClientsExpect) {
    const std::string name = objectManagerParameter("KORVA_ObjectManager", "cmpihost");
    const struct {
        const char* operation;
        std::string parameters;
        const char* error;
    } rows[] = {
        {"EnumerateInstances", className("ClassName", "CIM_RegisteredProfile"), "5: "},
        {"EnumerateInstanceNames", className("ClassName", "CIM_WBEMServerNamespace"), "5: "},
        {"EnumerateInstances", className("ClassName", "KORVA_OperatingSystem"), "5: "},
        {"DeleteInstance", name, "7: "},
        {"CreateInstance",
         parameter("NewInstance", "<INSTANCE CLASSNAME=\"CIM_Namespace\"></INSTANCE>"), "7: "},
        {"SetProperty", name + value("PropertyName", "ElementName") + value("NewValue", "x"),
         "7: "},
        {"GetProperty", name + value("PropertyName", "ElementName"), ""},
        {"GetProperty", name + value("PropertyName", "Colour"), "12: "},
        {"AssociatorNames",
         parameter("ObjectName", "<CLASSNAME NAME=\"CIM_ObjectManager\"/>") +
             className("AssocClass", "CIM_ElementConformsToProfile"),
         "7: "},
    };
    for (const auto& row : rows) {
        const std::string found = error(interopAnswer(row.operation, row.parameters));
        EXPECT_EQ(found.substr(0, std::string(row.error).size()), row.error) << row.operation;
        EXPECT_EQ(found.empty(), std::string(row.error).empty()) << row.operation << found;
    }
}

}  // namespace
}  // namespace fixture
}  // namespace cmpihost::server
