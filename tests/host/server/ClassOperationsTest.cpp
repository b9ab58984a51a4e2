#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "host/mof/MofParser.h"
#include "host/server/ResponseValidator.h"
#include "host/server/ServerFixture.h"
#include "support/GoldenFile.h"

namespace cmpihost::server::fixture {
namespace {

/// An element a line.
std::string elementsOf(const std::string& xml) {
    std::string text;
    for (const char c : xml) {
        if (c == '<' && !text.empty() && text.back() == '>') text += '\n';
        text += c;
    }
    return text + '\n';
}

std::string classResponse(const std::string& name, const std::string& parameters,
                          const std::string& nameSpace) {
    const std::string document = respond(operation(name, parameters, nameSpace));
    for (const std::string& complaint : complaintsAbout(document, name)) ADD_FAILURE() << complaint;
    return document;
}

std::string classAnswer(const std::string& name, const std::string& parameters,
                        const std::string& nameSpace) {
    return content(classResponse(name, parameters, nameSpace));
}

/// What follows NAME=" in each tag of that kind, with a blank between two.
std::string namesInTags(const std::string& xml, const std::string& tag) {
    const std::string start = "<" + tag + " NAME=\"";
    std::string names;
    for (std::size_t at = xml.find(start); at != std::string::npos; at = xml.find(start, at + 1)) {
        const std::size_t name = at + start.size();
        names += (names.empty() ? "" : " ") + xml.substr(name, xml.find('"', name) - name);
    }
    return names;
}

/// Without providers; its classes are in root/cimv2.
std::unique_ptr<ObjectManager> managerOf(const std::string& mof) {
    ObjectManagerSetup setup;
    setup.schema.add(mof::parse(mof, "test.mof"));
    setup.hostName = "server.example";
    return std::make_unique<ObjectManager>(std::move(setup));
}

const std::string deepInheritance = value("DeepInheritance", "TRUE");
const std::string wholeClass = value("LocalOnly", "FALSE") + value("IncludeClassOrigin", "TRUE");

TEST(ClassOperations, GetClassTellsAllOfAShippedClass) {
    for (const char* name : {"KORVA_OperatingSystem", "KORVA_RunningOS"}) {
        expectGolden(
            std::string(KORVA_TEST_DATA "/classes/") + name + ".xml",
            elementsOf(classAnswer("GetClass", className("ClassName", name), "root/cimv2")));
    }
}

TEST(ClassOperations, GetClassTellsWhatAClassOfTheInteropNamespaceInherits) {
    for (const char* name : {"KORVA_ObjectManager", "__Namespace"}) {
        expectGolden(std::string(KORVA_TEST_DATA "/classes/") + name + ".xml",
                     elementsOf(classAnswer("GetClass", className("ClassName", name) + wholeClass,
                                            "root/interop")));
    }
}

TEST(ClassOperations, GetClassTellsOnlyWhatIsAskedFor) {
    const std::string bare =
        className("ClassName", "cim_namespace") + value("IncludeQualifiers", "false");
    const struct {
        const char* what;
        std::string parameters;
        const char* properties;
    } rows[] = {
        {"its own, unless told otherwise", bare,
         "SystemCreationClassName SystemName ObjectManagerCreationClassName ObjectManagerName "
         "CreationClassName Name ClassInfo"},
        {"a list without case", bare + list("PropertyList", {"NAME", "Nothing", "name"}), "Name"},
        {"an empty list", bare + list("PropertyList", {}), ""},
        {"a list with what is inherited",
         bare + list("PropertyList", {"Caption", "Name"}) + value("LocalOnly", "FALSE"),
         "Name Caption"},
        {"a list with what is inherited, but local only", bare + list("PropertyList", {"Caption"}),
         ""},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.what);
        const std::string answer = classAnswer("GetClass", row.parameters, "root/interop");
        EXPECT_EQ(namesInTags(answer, "PROPERTY"), row.properties);
        EXPECT_EQ(namesInTags(answer, "CLASS"), "CIM_Namespace");
        EXPECT_EQ(namesInTags(answer, "QUALIFIER"), "");
        EXPECT_EQ(count(answer, "CLASSORIGIN"), 0U);
    }
}

TEST(ClassOperations, ClassesAreListedFromTheRootsDownwards) {
    const std::string shipped =
        "KORVA_ComputerSystem KORVA_InstalledOS KORVA_OperatingSystem "
        "KORVA_OperatingSystemCapabilities KORVA_OSElementCapabilities KORVA_RunningOS";
    const struct {
        const char* nameSpace;
        const char* above;
        bool anyDegree;
        std::string names;
    } rows[] = {
        // Of what they descend from only the names are known.
        {"root/cimv2", "", false, shipped},
        {"root/cimv2", "", true, shipped},
        {"root/cimv2", "CIM_OperatingSystem", false, "KORVA_OperatingSystem"},
        {"root/cimv2", "cim_enabledlogicalelement", false,
         "KORVA_ComputerSystem KORVA_OperatingSystem"},
        {"root/cimv2", "CIM_Dependency", true, "KORVA_RunningOS"},
        {"root/cimv2", "KORVA_OperatingSystem", true, ""},
        {"root/interop", "", false, "__Namespace CIM_ManagedElement"},
        {"root/interop", "CIM_ManagedElement", false, "CIM_ManagedSystemElement CIM_Namespace"},
        {"root/interop", "CIM_Service", true,
         "CIM_ObjectManager CIM_WBEMService KORVA_ObjectManager"},
        {"root/interop", "", true,
         "__Namespace CIM_EnabledLogicalElement CIM_LogicalElement CIM_ManagedElement "
         "CIM_ManagedSystemElement CIM_Namespace CIM_ObjectManager CIM_Service CIM_WBEMService "
         "KORVA_ObjectManager"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(std::string(row.nameSpace) + " " + row.above + (row.anyDegree ? " deep" : ""));
        const std::string above = row.above;
        const std::string parameters = (above.empty() ? "" : className("ClassName", above)) +
                                       (row.anyDegree ? deepInheritance : "");
        EXPECT_EQ(
            namesInTags(classAnswer("EnumerateClassNames", parameters, row.nameSpace), "CLASSNAME"),
            row.names);
        EXPECT_EQ(namesInTags(classAnswer("EnumerateClasses", parameters, row.nameSpace), "CLASS"),
                  row.names);
    }
}

TEST(ClassOperations, ClassesThatAreRegisteredForTheInteropNamespaceAreKnownThere) {
    ObjectManager& manager = foreignManager(
        registration("TEST_SparePart", "Spares", "foreign_parts", "instance", "root/interop"));
    const auto asked = [&](const char* name, const std::string& parameters) {
        return respond(manager, operation(name, parameters, "root/interop"));
    };
    const auto classOf = [&](const char* name) {
        return asked("GetClass", className("ClassName", name) + wholeClass);
    };
    EXPECT_EQ(namesInTags(classOf("test_sparepart"), "PROPERTY"), "Id");
    EXPECT_EQ(namesInTags(classOf("TEST_Part"), "PROPERTY"), "Id");
    EXPECT_EQ(error(classOf("TEST_Thing")), "6: TEST_Thing: no such class in root/interop");
    EXPECT_EQ(namesInTags(asked("EnumerateClassNames", ""), "CLASSNAME"),
              "__Namespace CIM_ManagedElement TEST_Part");
    const auto gotten = [&](const std::string& key) {
        return asked("GetInstance",
                     parameter("InstanceName", instanceName("TEST_SparePart", {{key, "spare"}})));
    };
    EXPECT_EQ(content(gotten("ID")),
              "<IRETURNVALUE><INSTANCE CLASSNAME=\"TEST_SparePart\"><PROPERTY NAME=\"Id\" "
              "TYPE=\"string\"><VALUE>spare</VALUE></PROPERTY></INSTANCE></IRETURNVALUE>");
    EXPECT_EQ(error(gotten("Name")), "4: TEST_SparePart.Name: the class has no such key");
}

TEST(ClassOperations, AnAnswerWithoutClassesIsStillAnAnswer) {
    const std::string leaf = className("ClassName", "KORVA_RunningOS");
    EXPECT_EQ(classAnswer("EnumerateClassNames", leaf, "root/cimv2"),
              "<IRETURNVALUE></IRETURNVALUE>");
    EXPECT_EQ(classAnswer("EnumerateClasses", leaf, "root/cimv2"), "<IRETURNVALUE></IRETURNVALUE>");
}

TEST(ClassOperations, QualifiersAreDeclared) {
    const auto declaration = [](const std::string& name) {
        return classAnswer("GetQualifier", value("QualifierName", name), "root/cimv2");
    };
    EXPECT_EQ(
        declaration("key"),
        "<IRETURNVALUE><QUALIFIER.DECLARATION NAME=\"Key\" TYPE=\"boolean\" ISARRAY=\"false\" "
        "OVERRIDABLE=\"false\"><SCOPE REFERENCE=\"true\" PROPERTY=\"true\"></SCOPE>"
        "<VALUE>FALSE</VALUE></QUALIFIER.DECLARATION></IRETURNVALUE>");
    EXPECT_EQ(declaration("Values"),
              "<IRETURNVALUE><QUALIFIER.DECLARATION NAME=\"Values\" TYPE=\"string\" "
              "ISARRAY=\"true\" TRANSLATABLE=\"true\"><SCOPE PROPERTY=\"true\" METHOD=\"true\" "
              "PARAMETER=\"true\"></SCOPE></QUALIFIER.DECLARATION></IRETURNVALUE>");
    EXPECT_EQ(declaration("Version"),
              "<IRETURNVALUE><QUALIFIER.DECLARATION NAME=\"Version\" TYPE=\"string\" "
              "ISARRAY=\"false\" TOSUBCLASS=\"false\" TRANSLATABLE=\"true\"><SCOPE CLASS=\"true\" "
              "ASSOCIATION=\"true\" INDICATION=\"true\"></SCOPE></QUALIFIER.DECLARATION>"
              "</IRETURNVALUE>");
}

/// The text without what stands between the two, these included.
std::string leftOut(std::string text, const std::string& start, const std::string& end) {
    for (std::size_t at = text.find(start); at != std::string::npos; at = text.find(start, at))
        text.erase(at, text.find(end, at + start.size()) + end.size() - at);
    return text;
}

TEST(ClassOperations, EveryQualifierOfTheClassesHasADeclarationOfItsTypeAndFlavors) {
    const std::string nothing;
    for (const char* nameSpace : {"root/cimv2", "root/interop"}) {
        const std::string declared =
            leftOut(classAnswer("EnumerateQualifiers", nothing, nameSpace), " ISARRAY=\"", "\"");
        const std::string classes =
            leftOut(classAnswer("EnumerateClasses", deepInheritance + value("LocalOnly", "FALSE"),
                                nameSpace),
                    " PROPAGATED=\"", "\"");
        const std::string start = "<QUALIFIER NAME=\"";
        std::size_t met = 0;
        for (std::size_t at = classes.find(start); at != std::string::npos;
             at = classes.find(start, at + 1), ++met) {
            const std::size_t name = at + start.size();
            const std::string all = classes.substr(name, classes.find('>', name) - name + 1);
            EXPECT_EQ(count(declared, "<QUALIFIER.DECLARATION NAME=\"" + all), 1U) << all;
        }
        EXPECT_GT(met, 40U);
    }
}

TEST(ClassOperations, ADeclarationOfTheSchemaStandsForThatOfTheStandard) {
    const auto manager = managerOf(
        "Qualifier Units : string = \"none\", Scope(any);\n"
        "Qualifier Mine : uint8[], Scope(class), Flavor(Restricted, DisableOverride);");
    const std::string declarations = respond(*manager, operation("EnumerateQualifiers"));
    EXPECT_EQ(count(declarations, "NAME=\"Units\""), 1U);
    EXPECT_EQ(content(respond(*manager, operation("GetQualifier", value("QualifierName", "mine")))),
              "<IRETURNVALUE><QUALIFIER.DECLARATION NAME=\"Mine\" TYPE=\"uint8\" ISARRAY=\"true\" "
              "OVERRIDABLE=\"false\" TOSUBCLASS=\"false\"><SCOPE CLASS=\"true\"></SCOPE>"
              "</QUALIFIER.DECLARATION></IRETURNVALUE>");
}

TEST(ClassOperations, FailWithTheStatusThatClientsExpect) {
    const std::string fixed =
        "7: classes and qualifiers are read from files when the server starts, and no client can "
        "change them";
    const struct {
        const char* name;
        std::string parameters;
        const char* nameSpace;
        std::string error;
    } rows[] = {
        {"GetClass", className("ClassName", "KORVA_Foo"), "root/cimv2",
         "6: KORVA_Foo: no such class in root/cimv2"},
        {"GetClass", className("ClassName", "KORVA_OperatingSystem"), "root/interop",
         "6: KORVA_OperatingSystem: no such class in root/interop"},
        {"GetClass", className("ClassName", "CIM_OperatingSystem"), "root/cimv2",
         "6: CIM_OperatingSystem: only the name of this class is known here; the option --schema "
         "can give the server MOF that declares it, such as a whole CIM schema"},
        {"GetClass", className("ClassName", "CIM_RegisteredProfile"), "root/interop",
         "6: CIM_RegisteredProfile: no such class in root/interop"},
        {"GetClass", className("ClassName", "KORVA_Foo"), "root/other",
         "3: root/other: no such namespace"},
        {"EnumerateClasses", className("ClassName", "KORVA_Foo"), "root/cimv2",
         "5: KORVA_Foo: no such class in root/cimv2"},
        {"EnumerateClassNames", className("ClassName", "KORVA_Foo"), "root/cimv2",
         "5: KORVA_Foo: no such class in root/cimv2"},
        {"EnumerateClassNames", {}, "interop", "3: interop: no such namespace"},
        {"GetQualifier", value("QualifierName", "Foo"), "root/cimv2",
         "6: Foo: no such qualifier in root/cimv2"},
        {"EnumerateQualifiers", {}, "root", "3: root: no such namespace"},
        {"CreateClass", parameter("NewClass", "<CLASS NAME=\"KORVA_Foo\"></CLASS>"), "root/cimv2",
         fixed},
        {"ModifyClass", parameter("ModifiedClass", "<CLASS NAME=\"KORVA_RunningOS\"></CLASS>"),
         "root/cimv2", fixed},
        {"DeleteClass", className("ClassName", "KORVA_RunningOS"), "root/cimv2", fixed},
        {"SetQualifier",
         parameter("QualifierDeclaration",
                   "<QUALIFIER.DECLARATION NAME=\"Key\" TYPE=\"boolean\"/>"),
         "root/cimv2", fixed},
        {"DeleteQualifier", value("QualifierName", "Key"), "root/cimv2", fixed},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(error(classResponse(row.name, row.parameters, row.nameSpace)), row.error)
            << row.name << " " << row.nameSpace;
    }
}

TEST(ClassOperations, RefuseParametersThatTheyDoNotKnow) {
    const struct {
        const char* name;
        std::string parameters;
    } rows[] = {
        {"GetClass", {}},
        {"GetClass", parameter("ClassName", {})},
        {"GetClass", value("ClassName", "KORVA_RunningOS")},
        {"GetClass", className("ClassName", "KORVA_RunningOS") + deepInheritance},
        {"GetClass", className("ClassName", "KORVA_RunningOS") + value("LocalOnly", "maybe")},
        {"EnumerateClasses", list("PropertyList", {"Name"})},
        {"EnumerateClassNames", deepInheritance + deepInheritance},
        {"EnumerateClassNames", value("LocalOnly", "TRUE")},
        {"GetQualifier", {}},
        {"EnumerateQualifiers", value("QualifierName", "Key")},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(error(classResponse(row.name, row.parameters, "root/cimv2")).substr(0, 3), "4: ")
            << row.name << row.parameters;
    }
}

TEST(ClassOperations, MoreClassesThanAnybodyCanUseAreAnError) {
    // Each of the classes below the first shows its long text again.
    std::string mof =
        "class BIG_A { [Description(\"" + std::string(1U << 18U, 'x') + "\")] uint8 P; };\n";
    for (int index = 0; index < 17; ++index)
        mof += "class BIG_B" + std::to_string(index) + " : BIG_A {};\n";
    const auto manager = managerOf(mof);
    const auto enumerate = [&](const std::string& parameters) {
        return respond(*manager, operation("EnumerateClasses", deepInheritance + parameters));
    };
    EXPECT_EQ(error(enumerate(value("LocalOnly", "FALSE"))).substr(0, 4), "27: ");
    EXPECT_EQ(error(enumerate({})), "");
}

}  // namespace
}  // namespace cmpihost::server::fixture
