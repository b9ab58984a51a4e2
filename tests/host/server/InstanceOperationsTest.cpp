// What the shipped providers and those of other makers are asked, and what becomes of their
// answers.
#include <gmock/gmock.h>

#include "host/mof/MofParser.h"
#include "host/server/ServerFixture.h"

namespace cmpihost::server {
namespace {

using namespace fixture;
using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

const char* const nothing = "<IRETURNVALUE></IRETURNVALUE>";

std::string enumerated(const std::string& name, const std::string& more = {}) {
    return content(respond(operation("EnumerateInstances", className("ClassName", name) + more)));
}

std::string names(const std::string& name) {
    return content(respond(operation("EnumerateInstanceNames", className("ClassName", name))));
}

/// The request or its error, whatever came.
std::string gotten(const std::string& path, const std::string& more = {}) {
    const std::string document =
        respond(operation("GetInstance", parameter("InstanceName", path) + more));
    const std::string wrong = error(document);
    return wrong.empty() ? content(document) : wrong;
}

/// The classes of the paths, in their order.
std::vector<std::string> classesIn(const std::string& xml) {
    std::vector<std::string> classes;
    const std::string tag = "<INSTANCENAME CLASSNAME=\"";
    for (std::size_t at = xml.find(tag); at != std::string::npos; at = xml.find(tag, at + 1)) {
        const std::size_t start = at + tag.size();
        classes.push_back(xml.substr(start, xml.find('"', start) - start));
    }
    return classes;
}

TEST(InstanceOperations, EnumerateEachClassUnderTheNamesOfItsAncestors) {
    using List = std::vector<std::string>;
    const List systems = {"KORVA_ComputerSystem", "KORVA_OperatingSystem"};
    const struct {
        const char* asked;
        List found;
    } rows[] = {
        {"KORVA_OperatingSystem", {"KORVA_OperatingSystem"}},
        {"korva_operatingSYSTEM", {"KORVA_OperatingSystem"}},
        {"CIM_OperatingSystem", {"KORVA_OperatingSystem"}},
        {"CIM_EnabledLogicalElement", systems},
        {"CIM_LogicalElement", systems},
        {"CIM_ManagedSystemElement", systems},
        {"CIM_System", {"KORVA_ComputerSystem"}},
        {"CIM_ComputerSystem", {"KORVA_ComputerSystem"}},
        {"CIM_Capabilities", {"KORVA_OperatingSystemCapabilities"}},
        {"CIM_EnabledLogicalElementCapabilities", {"KORVA_OperatingSystemCapabilities"}},
        {"CIM_ManagedElement",
         {"KORVA_ComputerSystem", "KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities"}},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(classesIn(names(row.asked)), row.found) << row.asked;
        EXPECT_EQ(classesIn(enumerated(row.asked)), row.found) << row.asked;
    }
    // The references of associations are paths, too.
    const std::pair<const char*, const char*> associations[] = {
        {"KORVA_RunningOS", "KORVA_RunningOS"},
        {"CIM_RunningOS", "KORVA_RunningOS"},
        {"CIM_Dependency", "KORVA_RunningOS"},
        {"CIM_InstalledOS", "KORVA_InstalledOS"},
        {"CIM_SystemComponent", "KORVA_InstalledOS"},
        {"CIM_Component", "KORVA_InstalledOS"},
        {"CIM_ElementCapabilities", "KORVA_OSElementCapabilities"},
    };
    for (const auto& [asked, found] : associations) {
        EXPECT_EQ(classesIn(names(asked)).at(0), found) << asked;
        EXPECT_EQ(count(enumerated(asked), "<VALUE.NAMEDINSTANCE>"), 1U) << asked;
    }
}

TEST(InstanceOperations, EnumerateInstancesGivesNamedInstances) {
    EXPECT_EQ(
        enumerated("CIM_OperatingSystemCapabilities"),
        "<IRETURNVALUE><VALUE.NAMEDINSTANCE>"
        "<INSTANCENAME CLASSNAME=\"KORVA_OperatingSystemCapabilities\">"
        "<KEYBINDING NAME=\"InstanceID\"><KEYVALUE VALUETYPE=\"string\">Fixture Linux"
        "</KEYVALUE></KEYBINDING></INSTANCENAME>"
        "<INSTANCE CLASSNAME=\"KORVA_OperatingSystemCapabilities\">"
        "<PROPERTY NAME=\"InstanceID\" TYPE=\"string\"><VALUE>Fixture Linux</VALUE></PROPERTY>"
        "<PROPERTY NAME=\"ElementName\" TYPE=\"string\"><VALUE>Fixture Linux</VALUE>"
        "</PROPERTY>"
        "<PROPERTY NAME=\"ElementNameEditSupported\" TYPE=\"boolean\"><VALUE>FALSE</VALUE>"
        "</PROPERTY>"
        "<PROPERTY NAME=\"HostShutdownBehavior\" TYPE=\"uint16\"><VALUE>3</VALUE></PROPERTY>"
        "</INSTANCE></VALUE.NAMEDINSTANCE></IRETURNVALUE>");
}

TEST(InstanceOperations, AnEnumerationOfAKnownClassThatNobodyServesIsEmpty) {
    const std::string class_ = className("ClassName", "TEST_Base");
    const std::string other = className("ClassName", "TEST_Thing");
    ObjectManager& manager = foreignManager();
    for (const char* name : {"EnumerateInstances", "EnumerateInstanceNames"}) {
        // TEST_Thing is registered for root/test only.
        EXPECT_EQ(content(respond(manager, operation(name, class_, "root/other"))), nothing);
        EXPECT_EQ(content(respond(manager, operation(name, other, "root/other"))), nothing);
    }
    EXPECT_EQ(
        error(respond(manager, operation("GetInstance",
                                         parameter("InstanceName",
                                                   instanceName("TEST_Thing", {{"Name", "first"}})),
                                         "root/other"))),
        "6: root/other:TEST_Thing.Name=&quot;first&quot;: there is no such instance");
}

TEST(InstanceOperations, PropertyListsTakeAwayPropertiesAndNothingElse) {
    const std::string version =
        "<PROPERTY NAME=\"Version\" TYPE=\"string\"><VALUE>12.5</VALUE></PROPERTY>";
    const std::string instance = "<INSTANCE CLASSNAME=\"KORVA_OperatingSystem\">";
    const std::string none = instance + "</INSTANCE>";
    const std::string one = instance + version + "</INSTANCE>";
    const struct {
        std::string list;
        std::string instance;
    } rows[] = {
        {list("PropertyList", {"Version"}), one},
        {list("PropertyList", {"vERSION", "Version", "Nonsense"}), one},
        {value("PropertyList", "Version"), one},
        {list("PropertyList", {"Nonsense"}), none},
        {list("PropertyList", {}), none},
        {parameter("PropertyList", "<VALUE.ARRAY/>"), none},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(gotten(operatingSystem(), row.list),
                  "<IRETURNVALUE>" + row.instance + "</IRETURNVALUE>");
        EXPECT_THAT(
            enumerated("KORVA_OperatingSystem", row.list),
            EndsWith("</INSTANCENAME>" + row.instance + "</VALUE.NAMEDINSTANCE></IRETURNVALUE>"));
    }
    for (const std::string& null : {std::string(), parameter("PropertyList", "")}) {
        EXPECT_EQ(count(gotten(operatingSystem(), null), "<PROPERTY"), 26U);
        EXPECT_EQ(count(enumerated("KORVA_OperatingSystem", null), "<PROPERTY"), 26U);
    }
}

TEST(InstanceOperations, LocalOnlyAndIncludeQualifiersChangeNothing) {
    const std::string all = gotten(operatingSystem());
    EXPECT_EQ(count(all, "<PROPERTY"), 26U);
    for (const char* name : {"LocalOnly", "IncludeQualifiers", "IncludeClassOrigin"}) {
        for (const char* flag : {"TRUE", "false"})
            EXPECT_EQ(gotten(operatingSystem(), value(name, flag)), all) << name;
    }
}

TEST(InstanceOperations, WithoutDeepInheritanceThePropertiesOfSubclassesAreLeftOut) {
    ObjectManager& manager = foreignManager();
    const std::string deep = value("DeepInheritance", "TRUE");
    const std::string flat = value("DeepInheritance", "FALSE");
    for (const char* operationName : {"EnumerateInstances", "OpenEnumerateInstances"}) {
        const std::string all =
            operationName[0] == 'O' ? value("MaxObjectCount", "9") : std::string();
        const auto properties = [&](const char* name, const std::string& more) {
            return count(
                respond(manager, operation(operationName, className("ClassName", name) + all + more,
                                           "root/test")),
                "<PROPERTY ");
        };
        EXPECT_EQ(properties("TEST_Base", deep), 2U);
        EXPECT_EQ(properties("TEST_Base", ""), 2U);
        EXPECT_EQ(properties("TEST_Base", flat), 0U);
        EXPECT_EQ(properties("TEST_Thing", flat), 2U);
    }
    // Of a class whose properties are unknown nothing is left out.
    EXPECT_EQ(
        count(enumerated("CIM_OperatingSystem", value("DeepInheritance", "FALSE")), "<PROPERTY"),
        26U);
}

TEST(InstanceOperations, GetInstanceGivesOneInstanceWithoutAPath) {
    EXPECT_EQ(gotten(computerSystem()),
              "<IRETURNVALUE><INSTANCE CLASSNAME=\"KORVA_ComputerSystem\">"
              "<PROPERTY NAME=\"CreationClassName\" TYPE=\"string\"><VALUE>KORVA_ComputerSystem"
              "</VALUE></PROPERTY>"
              "<PROPERTY NAME=\"Name\" TYPE=\"string\"><VALUE>fixture.example</VALUE></PROPERTY>"
              "<PROPERTY NAME=\"ElementName\" TYPE=\"string\"><VALUE>fixture.example</VALUE>"
              "</PROPERTY>"
              "<PROPERTY NAME=\"NameFormat\" TYPE=\"string\"><VALUE>Other</VALUE></PROPERTY>"
              "</INSTANCE></IRETURNVALUE>");
}

/// A KEYBINDING that refers to an instance.
std::string keyOfReference(const std::string& name, const std::string& path) {
    return "<KEYBINDING NAME=\"" + name + "\"><VALUE.REFERENCE>" + path +
           "</VALUE.REFERENCE></KEYBINDING>";
}

std::string runningOS(const std::string& antecedent, const std::string& dependent) {
    return "<INSTANCENAME CLASSNAME=\"KORVA_RunningOS\">" + keyOfReference("dependent", dependent) +
           keyOfReference("Antecedent", antecedent) + "</INSTANCENAME>";
}

std::string on(const std::string& host, const std::string& path) {
    return "<INSTANCEPATH><NAMESPACEPATH><HOST>" + host +
           "</HOST><LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/><NAMESPACE NAME=\"cimv2\"/>"
           "</LOCALNAMESPACEPATH></NAMESPACEPATH>" +
           path + "</INSTANCEPATH>";
}

/// Below that namespace, on no host.
std::string inNameSpace(const std::string& above, const std::string& path) {
    return "<LOCALINSTANCEPATH><LOCALNAMESPACEPATH><NAMESPACE NAME=\"" + above +
           "\"/><NAMESPACE NAME=\"cimv2\"/></LOCALNAMESPACEPATH>" + path + "</LOCALINSTANCEPATH>";
}

TEST(InstanceOperations, GetInstanceFindsByAllKeysInAnyOrderAndSpelling) {
    const std::string found[] = {
        operatingSystem(),
        instanceName("korva_OPERATINGSYSTEM", {{"name", "fixture LINUX"},
                                               {"CREATIONCLASSNAME", "korva_operatingsystem"},
                                               {"csname", "FIXTURE.example"},
                                               {"CSCreationClassName", "KORVA_COMPUTERSYSTEM"}}),
        "<INSTANCENAME CLASSNAME=\"KORVA_OperatingSystemCapabilities\"><KEYVALUE>Fixture Linux"
        "</KEYVALUE></INSTANCENAME>",
        runningOS(operatingSystem(), computerSystem()),
        runningOS(on("elsewhere", operatingSystem()), on("nowhere", computerSystem())),
        runningOS(inNameSpace("ROOT", operatingSystem()), computerSystem()),
    };
    for (const std::string& path : found)
        EXPECT_THAT(gotten(path), StartsWith("<IRETURNVALUE><INSTANCE CLASSNAME=\"KORVA_")) << path;
}

TEST(InstanceOperations, GetInstanceOfKeysThatNameNothingIsStatusSix) {
    using Keys = std::vector<std::pair<std::string, std::string>>;
    const Keys right = {{"CSCreationClassName", "KORVA_ComputerSystem"},
                        {"CSName", "fixture.example"},
                        {"CreationClassName", "KORVA_OperatingSystem"},
                        {"Name", "Fixture Linux"}};
    for (std::size_t wrong = 0; wrong < right.size(); ++wrong) {
        Keys keys = right;
        keys[wrong].second += "x";
        EXPECT_THAT(gotten(instanceName("KORVA_OperatingSystem", keys)), StartsWith("6: "))
            << wrong;
    }
    const std::string others[] = {
        instanceName("KORVA_OperatingSystemCapabilities", {{"InstanceID", "fixture linux"}}),
        instanceName("KORVA_ComputerSystem", {{"CreationClassName", "x"}, {"Name", "x"}}),
        // An instance has the name of its own class, not of an ancestor.
        instanceName("CIM_OperatingSystem", right),
        runningOS(operatingSystem(), instanceName("KORVA_ComputerSystem",
                                                  {{"CreationClassName", "KORVA_ComputerSystem"},
                                                   {"Name", "other.example"}})),
        runningOS(inNameSpace("other", operatingSystem()), computerSystem()),
    };
    for (const std::string& path : others) EXPECT_THAT(gotten(path), StartsWith("6: ")) << path;
}

TEST(InstanceOperations, GetInstanceOfWrongKeysIsStatusFour) {
    const std::string paths[] = {
        "<INSTANCENAME CLASSNAME=\"KORVA_OperatingSystem\"/>",
        "<INSTANCENAME CLASSNAME=\"KORVA_OperatingSystem\"><KEYVALUE>x</KEYVALUE></INSTANCENAME>",
        instanceName("KORVA_ComputerSystem", {{"Name", "fixture.example"}}),
        instanceName("KORVA_ComputerSystem", {{"Name", "a"}, {"name", "b"}}),
        instanceName("KORVA_OperatingSystemCapabilities", {{"Instance", "Fixture Linux"}}),
        instanceName("KORVA_RunningOS", {{"Antecedent", "a"}, {"Dependent", "b"}}),
    };
    for (const std::string& path : paths) EXPECT_THAT(gotten(path), StartsWith("4: ")) << path;
}

/// The provider alone, without the facade in front: it looks at few of the keys, and breaks off
/// where the computer system is missing.
ObjectManager& providerAlone() {
    std::string sections;
    for (const char* each : {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities",
                             "KORVA_InstalledOS", "KORVA_OSElementCapabilities"})
        sections += registration(each, "OperatingSystemProvider", "korzbosstatusprofileprovider",
                                 "instance");
    return newManager("schema", sections);
}

TEST(InstanceOperations, CompareTheKeysThatAProviderDoesNotLookAt) {
    ObjectManager& manager = providerAlone();
    const auto asked = [&](const std::string& path) {
        const std::string document =
            respond(manager, operation("GetInstance", parameter("InstanceName", path)));
        return error(document).substr(0, 2);
    };
    EXPECT_EQ(asked(operatingSystem()), "");
    EXPECT_EQ(asked(capabilities()), "");
    EXPECT_EQ(asked(instanceName("KORVA_OperatingSystemCapabilities", {{"InstanceID", "x"}})),
              "6:");
    EXPECT_EQ(asked(instanceName("KORVA_OperatingSystem", {{"CSCreationClassName", "x"},
                                                           {"CSName", "fixture.example"},
                                                           {"CreationClassName", "x"},
                                                           {"Name", "Fixture Linux"}})),
              "6:");
    const auto capable = [](const std::string& source, const std::string& able) {
        return "<INSTANCENAME CLASSNAME=\"KORVA_OSElementCapabilities\">" +
               keyOfReference("ManagedElement", source) + keyOfReference("Capabilities", able) +
               "</INSTANCENAME>";
    };
    const std::string others =
        instanceName("KORVA_OperatingSystemCapabilities", {{"InstanceID", "x"}});
    EXPECT_EQ(asked(capable(operatingSystem(), capabilities())), "");
    EXPECT_EQ(asked(capable(inNameSpace("ROOT", operatingSystem()), capabilities())), "");
    EXPECT_EQ(asked(capable(inNameSpace("other", operatingSystem()), capabilities())), "6:");
    EXPECT_EQ(asked(capable(operatingSystem(), others)), "6:");
}

TEST(InstanceOperations, AnEnumerationThatBreaksOffFails) {
    ObjectManager& manager = providerAlone();
    for (const char* name : {"EnumerateInstances", "EnumerateInstanceNames"}) {
        EXPECT_EQ(
            error(respond(manager, operation(name, className("ClassName", "KORVA_InstalledOS")))),
            std::string("1: ") + name +
                " of KORVA_InstalledOS: the answer of the provider broke off");
    }
}

TEST(InstanceOperations, WhatOneProviderLeavesUnfinishedIsNotWholeWithThatOfAnother) {
    const std::string broken = registration("KORVA_InstalledOS", "OperatingSystemProvider",
                                            "korzbosstatusprofileprovider", "instance");
    const std::string whole = registration("TEST_Part", "Parts", "foreign_parts", "instance");
    for (const std::string& sections : {broken + whole, whole + broken}) {
        Schema schema = Schema::load(KORVA_SOURCE_DIR "/schema");
        schema.add(mof::parse("class TEST_Part : CIM_Component { [Key] string Id; };", "more.mof"));
        ObjectManager& manager = newManager(std::move(schema), sections);
        EXPECT_EQ(error(respond(manager, operation("EnumerateInstances",
                                                   className("ClassName", "CIM_Component")))),
                  "1: EnumerateInstances of CIM_Component: the answer of the provider broke off");
    }
}

TEST(InstanceOperations, AnExceptionOfAProviderFailsItsRequestAndNoOther) {
    std::string sections;
    for (const char* each :
         {"KORVA_RunningOS", "KORVA_OSElementCapabilities", "KORVA_OperatingSystem"})
        sections += registration(each, "OperatingSystemProvider", "cmpihost_stand_in", "instance");
    ObjectManager& manager = newManager("schema", sections);
    const auto asked = [&](const char* name) {
        return respond(manager, operation("EnumerateInstances", className("ClassName", name)));
    };
    EXPECT_EQ(error(asked("KORVA_RunningOS")),
              "1: an exception left the provider: the moon is down");
    EXPECT_EQ(error(asked("KORVA_OSElementCapabilities")),
              "1: an exception left the provider: of an unknown type");
    EXPECT_EQ(count(asked("KORVA_OperatingSystem"), "<VALUE.NAMEDINSTANCE>"), 1U);
}

TEST(InstanceOperations, GetPropertyGivesTheValueAlone) {
    const auto asked = [](const std::string& path, const char* name) {
        const std::string document = respond(operation(
            "GetProperty", parameter("InstanceName", path) + value("PropertyName", name)));
        return error(document).empty() ? content(document) : error(document);
    };
    EXPECT_EQ(asked(operatingSystem(), "ostype"), "<IRETURNVALUE><VALUE>36</VALUE></IRETURNVALUE>");
    EXPECT_EQ(asked(operatingSystem(), "OperationalStatus"),
              "<IRETURNVALUE><VALUE.ARRAY><VALUE>2</VALUE><VALUE>11</VALUE></VALUE.ARRAY>"
              "</IRETURNVALUE>");
    EXPECT_THAT(asked(runningOS(operatingSystem(), computerSystem()), "Dependent"),
                StartsWith("<IRETURNVALUE><VALUE.REFERENCE><INSTANCEPATH>"));
    EXPECT_EQ(asked(operatingSystem(), "OtherTypeDescription"), nothing);
    EXPECT_EQ(asked(operatingSystem(), "Nonsense"),
              "12: KORVA_OperatingSystem has no property Nonsense");
    EXPECT_THAT(asked(instanceName("KORVA_OperatingSystemCapabilities", {{"InstanceID", "x"}}),
                      "ElementName"),
                StartsWith("6: "));
}

TEST(InstanceOperations, WhatAProviderRefusesIsRefusedInItsWords) {
    const std::string instance =
        "<INSTANCE CLASSNAME=\"KORVA_ComputerSystem\">"
        "<PROPERTY NAME=\"Name\" TYPE=\"string\"><VALUE>x</VALUE></PROPERTY></INSTANCE>";
    const std::string system = parameter("InstanceName", computerSystem());
    const std::string requests[] = {
        operation("CreateInstance", parameter("NewInstance", instance)),
        operation("ModifyInstance",
                  parameter("ModifiedInstance", "<VALUE.NAMEDINSTANCE>" + computerSystem() +
                                                    instance + "</VALUE.NAMEDINSTANCE>")),
        operation("DeleteInstance", system),
        operation("SetProperty", system + value("PropertyName", "Name") + value("NewValue", "x")),
        operation("ExecQuery", value("QueryLanguage", "WQL") +
                                   value("Query", "select * from CIM_ComputerSystem where 1=2")),
    };
    for (const std::string& request : requests)
        EXPECT_THAT(error(respond(request)), StartsWith("7: ")) << request;
}

TEST(InstanceOperations, AnUnknownClassIsStatusFive) {
    const std::string path = instanceName("TEST_Nothing", {{"Name", "x"}});
    const std::string instance = "<INSTANCE CLASSNAME=\"TEST_Nothing\"/>";
    const std::string property = value("PropertyName", "Name");
    const std::string requests[] = {
        operation("EnumerateInstances", className("ClassName", "TEST_Nothing")),
        operation("EnumerateInstanceNames", className("ClassName", "TEST_Nothing")),
        operation("GetInstance", parameter("InstanceName", path)),
        operation("GetProperty", parameter("InstanceName", path) + property),
        operation("SetProperty", parameter("InstanceName", path) + property),
        operation("CreateInstance", parameter("NewInstance", instance)),
        operation("ModifyInstance",
                  parameter("ModifiedInstance",
                            "<VALUE.NAMEDINSTANCE>" + path + instance + "</VALUE.NAMEDINSTANCE>")),
        operation("DeleteInstance", parameter("InstanceName", path)),
        operation("ExecQuery",
                  value("QueryLanguage", "WQL") + value("Query", "select * from TEST_Nothing")),
        methodCall("Sum", path),
    };
    for (const std::string& request : requests)
        EXPECT_EQ(error(respond(request)), "5: TEST_Nothing: no such class in root/cimv2");
}

/// What providers of parts answer: each tells by a key which one it is, and nobody looks at those
/// of the path.
std::string askedOfParts(const std::string& name, const std::string& parameters) {
    const std::string document =
        respond(foreignManager(), operation(name, parameters, "root/test"));
    return error(document).empty() ? content(document) : error(document);
}

TEST(InstanceOperations, AskEachProviderOfASuperclassForItsOwnClass) {
    const std::string found =
        askedOfParts("EnumerateInstances", className("ClassName", "TEST_Part"));
    EXPECT_EQ(classesIn(found), (std::vector<std::string>{"TEST_Part", "TEST_SparePart"}));
    EXPECT_THAT(found, HasSubstr(">wheel<"));
    EXPECT_THAT(found, HasSubstr(">spare<"));
}

TEST(InstanceOperations, LeaveOutAnInstanceOfOtherKeysThanWereAsked) {
    const auto gottenPart = [](const char* id) {
        return askedOfParts("GetInstance",
                            parameter("InstanceName", instanceName("TEST_Part", {{"Id", id}})));
    };
    EXPECT_THAT(gottenPart("wheel"),
                StartsWith("<IRETURNVALUE><INSTANCE CLASSNAME=\"TEST_Part\">"));
    EXPECT_EQ(gottenPart("WHEEL"),
              "6: root/test:TEST_Part.Id=&quot;WHEEL&quot;: there is no such instance");
}

}  // namespace
}  // namespace cmpihost::server
