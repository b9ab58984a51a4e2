// Requests from text to text: over the shipped providers, the bare one and those of other makers.
#include "host/server/ResponseValidator.h"
#include "host/server/ResultSummary.h"
#include "host/server/ServerFixture.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <utility>
#include <vector>

namespace cmpihost::server::association_tests {
namespace {

using namespace fixture;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;
using ::testing::StartsWith;

using Objects = std::vector<std::string>;

const std::string computer = "KORVA_ComputerSystem(fixture.example)";
const std::string running =
    "KORVA_RunningOS(KORVA_OperatingSystem(Fixture Linux), KORVA_ComputerSystem(fixture.example))";
const std::string installed =
    "KORVA_InstalledOS(KORVA_ComputerSystem(fixture.example), KORVA_OperatingSystem(Fixture "
    "Linux))";
const std::string capable =
    "KORVA_OSElementCapabilities(KORVA_OperatingSystem(Fixture Linux), "
    "KORVA_OperatingSystemCapabilities(Fixture Linux))";
const std::string system = "KORVA_OperatingSystem(Fixture Linux)";
const std::string abilities = "KORVA_OperatingSystemCapabilities(Fixture Linux)";

std::string from(const std::string& source) {
    return parameter("ObjectName", source);
}

/// A question with filters and what it finds.
struct Row {
    std::string source;
    std::string filters;
    Objects found;
};

std::vector<Row> associatorRows() {
    const std::string os = operatingSystem();
    const std::string cs = computerSystem();
    return {
        {os, "", {computer, abilities}},
        {cs, "", {system}},
        {capabilities(), "", {system}},
        // Each filter alone, by the class itself, by a superclass, in another spelling.
        {os, className("AssocClass", "KORVA_RunningOS"), {computer}},
        {os, className("AssocClass", "cim_dependency"), {computer}},
        {os, className("AssocClass", "CIM_Component"), {computer}},
        {os, className("AssocClass", "CIM_ElementCapabilities"), {abilities}},
        {os, className("ResultClass", "KORVA_ComputerSystem"), {computer}},
        {os, className("ResultClass", "CIM_System"), {computer}},
        {os, className("ResultClass", "CIM_ManagedElement"), {computer, abilities}},
        {os, className("ResultClass", "CIM_Capabilities"), {abilities}},
        {os, className("ResultClass", "KORVA_OperatingSystem"), {}},
        {os, value("Role", "Antecedent"), {computer}},
        {os, value("Role", "partcomponent"), {computer}},
        {os, value("Role", "ManagedElement"), {abilities}},
        {os, value("Role", "Dependent"), {}},
        {os, value("Role", "Nobody"), {}},
        {os, value("ResultRole", "GroupComponent"), {computer}},
        {os, value("ResultRole", "CAPABILITIES"), {abilities}},
        {os, value("ResultRole", "Antecedent"), {}},
        {cs, value("Role", "Dependent"), {system}},
        // Together.
        {os,
         className("AssocClass", "CIM_RunningOS") + className("ResultClass", "CIM_ComputerSystem") +
             value("Role", "Antecedent") + value("ResultRole", "Dependent"),
         {computer}},
        {os, value("Role", "Antecedent") + value("ResultRole", "GroupComponent"), {}},
        {os, className("AssocClass", "KORVA_RunningOS") + value("Role", "PartComponent"), {}},
        {os,
         className("AssocClass", "KORVA_RunningOS") + className("ResultClass", "CIM_Capabilities"),
         {}},
        // Known classes that are none of what is there.
        {os, className("AssocClass", "KORVA_OperatingSystem"), {}},
        {os, className("ResultClass", "KORVA_RunningOS"), {}},
    };
}

std::vector<Row> referenceRows() {
    const std::string os = operatingSystem();
    const std::string cs = computerSystem();
    return {
        {os, "", {installed, running, capable}},
        {cs, "", {installed, running}},
        {capabilities(), "", {capable}},
        {os, className("ResultClass", "KORVA_RunningOS"), {running}},
        {os, className("ResultClass", "CIM_SystemComponent"), {installed}},
        {os, className("ResultClass", "CIM_ComputerSystem"), {}},
        {os, value("Role", "antecedent"), {running}},
        {cs, value("Role", "Dependent"), {running}},
        {os, value("Role", "Dependent"), {}},
        {os, className("ResultClass", "CIM_Dependency") + value("Role", "Antecedent"), {running}},
        {os, className("ResultClass", "CIM_Dependency") + value("Role", "PartComponent"), {}},
    };
}

/// Asks for the objects and for their names.
void expectFound(ObjectManager& manager, const std::string& objects, const std::string& names,
                 const std::vector<Row>& rows, const std::string& nameSpace = "root/cimv2") {
    for (const Row& row : rows) {
        for (const std::string& name : {objects, names}) {
            const std::string answer =
                respond(manager, operation(name, from(row.source) + row.filters, nameSpace));
            EXPECT_EQ(objectsIn(answer), row.found) << name << row.source << row.filters;
            EXPECT_THAT(complaintsAbout(answer, name), IsEmpty());
        }
    }
}

TEST(AssociationOperations, FindTheOtherEndsByEachFilterAloneAndTogether) {
    ObjectManager& manager = shippedManager();
    expectFound(manager, "Associators", "AssociatorNames", associatorRows());
    EXPECT_THAT(manager.takeComplaints(), IsEmpty());
}

TEST(AssociationOperations, FindTheAssociationsByEachFilterAloneAndTogether) {
    ObjectManager& manager = shippedManager();
    expectFound(manager, "References", "ReferenceNames", referenceRows());
    EXPECT_THAT(manager.takeComplaints(), IsEmpty());
}

/// The provider without the facade: it knows concrete classes only and refuses references.
ObjectManager& bareManager() {
    std::string text;
    const auto section = [&](const std::string& name, const std::string& provider,
                             const std::string& library, const std::string& types) {
        text += "[" + name + "]\nprovider: " + provider + "\nlocation: " + library +
                "\ntype: " + types + "\nnamespace: root/cimv2\n";
    };
    for (const char* const name : {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities"})
        section(name, "OperatingSystemProvider", "korzbosstatusprofileprovider", "instance");
    for (const char* const name :
         {"KORVA_InstalledOS", "KORVA_RunningOS", "KORVA_OSElementCapabilities"})
        section(name, "OperatingSystemProvider", "korzbosstatusprofileprovider",
                "instance association");
    section("KORVA_ComputerSystem", "ComputerSystemProvider", "korvacomputersystemprovider",
            "instance");
    return newManager("schema", text);
}

TEST(AssociationOperations, FindTheSameWithoutTheFacade) {
    ObjectManager& manager = bareManager();
    expectFound(manager, "Associators", "AssociatorNames", associatorRows());
    expectFound(manager, "References", "ReferenceNames", referenceRows());
}

TEST(AssociationOperations, OfASourceThatDoesNotExistFindNothing) {
    const std::string elsewhere =
        instanceName("KORVA_ComputerSystem",
                     {{"CreationClassName", "KORVA_ComputerSystem"}, {"Name", "elsewhere"}});
    const std::string other =
        instanceName("KORVA_OperatingSystem", {{"CSCreationClassName", "KORVA_ComputerSystem"},
                                               {"CSName", "fixture.example"},
                                               {"CreationClassName", "KORVA_OperatingSystem"},
                                               {"Name", "Other"}});
    const std::string ofParent =
        instanceName("CIM_OperatingSystem", {{"CSCreationClassName", "KORVA_ComputerSystem"},
                                             {"CSName", "fixture.example"},
                                             {"CreationClassName", "KORVA_OperatingSystem"},
                                             {"Name", "Fixture Linux"}});
    for (const auto give : {shippedManager, bareManager}) {
        ObjectManager& manager = give();
        for (const char* const name :
             {"Associators", "AssociatorNames", "References", "ReferenceNames"}) {
            for (const std::string& source : {elsewhere, other, ofParent}) {
                EXPECT_EQ(content(respond(manager, operation(name, from(source)))),
                          "<IRETURNVALUE></IRETURNVALUE>");
            }
        }
    }
}

TEST(AssociationOperations, FindASourceByAnySpellingThatItsProviderTakes) {
    const std::string shouted =
        instanceName("korva_operatingsystem", {{"NAME", "Fixture Linux"},
                                               {"creationclassname", "korva_operatingsystem"},
                                               {"CSName", "FIXTURE.example"},
                                               {"CSCreationClassName", "KORVA_ComputerSystem"}});
    for (const auto give : {shippedManager, bareManager}) {
        ObjectManager& manager = give();
        expectFound(manager, "Associators", "AssociatorNames",
                    {{shouted, "", {computer, abilities}}});
        expectFound(manager, "References", "ReferenceNames",
                    {{shouted, "", {installed, running, capable}}});
    }
}

TEST(AssociationOperations, FindNothingInTheInteropNamespace) {
    const std::string names = content(respond(operation(
        "EnumerateInstanceNames", className("ClassName", "CIM_ObjectManager"), "root/interop")));
    const std::size_t start = names.find("<INSTANCENAME");
    ASSERT_NE(start, std::string::npos);
    const std::string source = names.substr(start, names.find("</IRETURNVALUE>") - start);
    expectFound(shippedManager(), "Associators", "AssociatorNames", {{source, "", {}}},
                "root/interop");
    expectFound(shippedManager(), "References", "ReferenceNames", {{source, "", {}}},
                "root/interop");
    const std::string asked =
        from(source) + className("AssocClass", "CIM_ElementConformsToProfile");
    EXPECT_EQ(error(respond(operation("AssociatorNames", asked, "root/interop"))),
              "7: CIM_ElementConformsToProfile: not served in root/interop");
}

/// A request that fails, and the error that answers it.
struct Refusal {
    std::string name;
    std::string parameters;
    std::string error;
};

TEST(AssociationOperations, RefuseWhatIsUnknownOrWrong) {
    const std::string os = from(operatingSystem());
    const std::string unnamed = from(
        "<INSTANCENAME CLASSNAME=\"KORVA_OperatingSystem\">"
        "<KEYVALUE>x</KEYVALUE></INSTANCENAME>");
    const Refusal rows[] = {
        {"Associators", from(instanceName("KORVA_Foo", {{"Name", "x"}})),
         "4: KORVA_Foo: no such class in root/cimv2"},
        {"ReferenceNames", className("ObjectName", "KORVA_Foo"),
         "4: KORVA_Foo: no such class in root/cimv2"},
        {"AssociatorNames", os + className("AssocClass", "KORVA_Foo"),
         "4: KORVA_Foo: no such class in root/cimv2"},
        {"Associators", os + className("ResultClass", "KORVA_Foo"),
         "4: KORVA_Foo: no such class in root/cimv2"},
        {"References", os + className("ResultClass", "KORVA_Foo"),
         "4: KORVA_Foo: no such class in root/cimv2"},
        {"AssociatorNames", os + className("AssocClass", "cim_elementconformstoprofile"),
         "7: CIM_ElementConformsToProfile: not served in root/cimv2"},
        {"ReferenceNames", os + className("ResultClass", "CIM_ReferencedProfile"),
         "7: CIM_ReferencedProfile: not served in root/cimv2"},
        {"AssociatorNames", os + value("Role", "not a name"),
         "4: \"not a name\" is no name that a role can have"},
        {"AssociatorNames", os + value("ResultRole", "1st"),
         "4: \"1st\" is no name that a role can have"},
        {"References", os + value("Role", ""), "4: \"\" is no name that a role can have"},
    };
    for (const Refusal& row : rows) {
        std::string text = row.error;
        for (std::size_t at = text.find('"'); at != std::string::npos; at = text.find('"'))
            text.replace(at, 1, "&quot;");
        EXPECT_EQ(error(respond(operation(row.name, row.parameters))), text) << row.parameters;
    }
    const std::string wrong[] = {
        "",
        unnamed,
        from(instanceName("KORVA_ComputerSystem", {{"Name", "fixture.example"}})),
        os + className("Foo", "KORVA_OperatingSystem"),
        os + value("AssocClass", "CIM_Component"),
        os + os};
    for (const std::string& parameters : wrong)
        EXPECT_THAT(error(respond(operation("Associators", parameters))), StartsWith("4: "))
            << parameters;
    EXPECT_THAT(error(respond(operation("References", os + className("AssocClass", "CIM_Foo")))),
                StartsWith("4: "));
    EXPECT_THAT(error(respond(operation("Associators", os, "root/nowhere"))), StartsWith("3: "));
}

TEST(AssociationOperations, AnswerInTheFormsThatClientsRead) {
    const std::string os = from(operatingSystem());
    const std::string path =
        "<INSTANCEPATH><NAMESPACEPATH><HOST>server.example</HOST><LOCALNAMESPACEPATH><NAMESPACE "
        "NAME=\"root\"/><NAMESPACE NAME=\"cimv2\"/></LOCALNAMESPACEPATH></NAMESPACEPATH>"
        "<INSTANCENAME CLASSNAME=\"KORVA_ComputerSystem\"><KEYBINDING NAME=\"CreationClassName\">"
        "<KEYVALUE VALUETYPE=\"string\">KORVA_ComputerSystem</KEYVALUE></KEYBINDING><KEYBINDING "
        "NAME=\"Name\"><KEYVALUE VALUETYPE=\"string\">fixture.example</KEYVALUE></KEYBINDING>"
        "</INSTANCENAME></INSTANCEPATH>";
    EXPECT_EQ(content(respond(
                  operation("AssociatorNames", os + className("AssocClass", "KORVA_RunningOS")))),
              "<IRETURNVALUE><OBJECTPATH>" + path + "</OBJECTPATH></IRETURNVALUE>");
    EXPECT_EQ(
        content(respond(operation("Associators", os + className("AssocClass", "KORVA_RunningOS") +
                                                     list("PropertyList", {"name"})))),
        "<IRETURNVALUE><VALUE.OBJECTWITHPATH>" + path +
            "<INSTANCE CLASSNAME=\"KORVA_ComputerSystem\"><PROPERTY NAME=\"Name\" "
            "TYPE=\"string\"><VALUE>fixture.example</VALUE></PROPERTY></INSTANCE>"
            "</VALUE.OBJECTWITHPATH></IRETURNVALUE>");
    const std::string reference =
        content(respond(operation("References", os + className("ResultClass", "KORVA_RunningOS") +
                                                    list("PropertyList", {"Dependent"}))));
    EXPECT_THAT(reference, StartsWith("<IRETURNVALUE><VALUE.OBJECTWITHPATH><INSTANCEPATH>"));
    EXPECT_THAT(reference, HasSubstr("<INSTANCE CLASSNAME=\"KORVA_RunningOS\"><PROPERTY.REFERENCE "
                                     "NAME=\"Dependent\" REFERENCECLASS=\"KORVA_ComputerSystem\">"
                                     "<VALUE.REFERENCE>" +
                                     path + "</VALUE.REFERENCE></PROPERTY.REFERENCE></INSTANCE>"));
    EXPECT_THAT(content(respond(operation("ReferenceNames", os))),
                StartsWith("<IRETURNVALUE><OBJECTPATH><INSTANCEPATH>"));
}

TEST(AssociationOperations, ApplyPropertyLists) {
    const std::string given = from(operatingSystem()) + className("AssocClass", "KORVA_RunningOS");
    const std::string all = respond(operation("Associators", given));
    EXPECT_GT(count(all, "<PROPERTY"), 2U);
    EXPECT_EQ(respond(operation("Associators", given + parameter("PropertyList", ""))), all);
    EXPECT_EQ(
        count(respond(operation("Associators", given + list("PropertyList", {}))), "<PROPERTY "),
        0U);
    EXPECT_EQ(count(respond(operation("Associators",
                                      given + list("PropertyList", {"Nothing", "NAME", "name"}))),
                    "<PROPERTY "),
              1U);
    EXPECT_EQ(
        objectsIn(respond(operation("Associators", given + value("IncludeQualifiers", "TRUE") +
                                                       value("IncludeClassOrigin", "TRUE")))),
        Objects{computer});
}

TEST(AssociationOperations, TellWhoNamesAnInstanceWithoutKeysWhatToGive) {
    const std::string keyless = "<INSTANCENAME CLASSNAME=\"korva_operatingsystem\"></INSTANCENAME>";
    for (const char* name : {"Associators", "AssociatorNames", "References", "ReferenceNames"}) {
        EXPECT_EQ(content(respond(operation(name, from(keyless)))),
                  "<ERROR CODE=\"7\" DESCRIPTION=\"KORVA_OperatingSystem: an instance without keys "
                  "is none to start from; give all keys, or a CLASSNAME to be answered with "
                  "classes\"/>");
    }
}

TEST(AssociationOperations, AnswerClassesToAClass) {
    const std::string os = "<CLASSNAME NAME=\"KORVA_OperatingSystem\"/>";
    const std::string cs = "<CLASSNAME NAME=\"KORVA_ComputerSystem\"/>";
    ObjectManager& manager = shippedManager();
    expectFound(manager, "Associators", "AssociatorNames",
                {{os, "", {"KORVA_ComputerSystem", "KORVA_OperatingSystemCapabilities"}},
                 {"<CLASSNAME NAME=\"CIM_OperatingSystem\"/>",
                  "",
                  {"KORVA_ComputerSystem", "KORVA_OperatingSystemCapabilities"}},
                 {cs, "", {"KORVA_OperatingSystem"}},
                 {cs, className("AssocClass", "CIM_ElementCapabilities"), {}},
                 {os, value("Role", "Antecedent"), {"KORVA_ComputerSystem"}},
                 {os, value("ResultRole", "Capabilities"), {"KORVA_OperatingSystemCapabilities"}},
                 {os, className("ResultClass", "CIM_System"), {"KORVA_ComputerSystem"}},
                 {"<CLASSNAME NAME=\"CIM_ManagedElement\"/>", "", {}}});
    expectFound(manager, "References", "ReferenceNames",
                {{os, "", {"KORVA_InstalledOS", "KORVA_RunningOS", "KORVA_OSElementCapabilities"}},
                 {cs, "", {"KORVA_InstalledOS", "KORVA_RunningOS"}},
                 {cs, value("Role", "Dependent"), {"KORVA_RunningOS"}},
                 {cs, className("ResultClass", "CIM_Component"), {"KORVA_InstalledOS"}}});
    const std::string path =
        "<CLASSPATH><NAMESPACEPATH><HOST>server.example</HOST><LOCALNAMESPACEPATH><NAMESPACE "
        "NAME=\"root\"/><NAMESPACE NAME=\"cimv2\"/></LOCALNAMESPACEPATH></NAMESPACEPATH>"
        "<CLASSNAME NAME=\"KORVA_OperatingSystem\"/></CLASSPATH>";
    EXPECT_EQ(content(respond(operation("AssociatorNames", from(cs)))),
              "<IRETURNVALUE><OBJECTPATH>" + path + "</OBJECTPATH></IRETURNVALUE>");
    EXPECT_EQ(
        content(respond(operation("Associators", from(cs) + list("PropertyList", {"CSName"})))),
        "<IRETURNVALUE><VALUE.OBJECTWITHPATH>" + path +
            "<CLASS NAME=\"KORVA_OperatingSystem\" SUPERCLASS=\"CIM_OperatingSystem\">"
            "<PROPERTY NAME=\"CSName\" TYPE=\"string\"></PROPERTY></CLASS>"
            "</VALUE.OBJECTWITHPATH></IRETURNVALUE>");
    EXPECT_THAT(
        content(respond(operation("Associators", from(cs) + value("IncludeQualifiers", "TRUE")))),
        HasSubstr("<QUALIFIER NAME=\"Key\""));
}

const std::string thing = instanceName("TEST_Thing", {{"Name", "first"}});

TEST(AssociationOperations, AskProvidersOfOtherMakers) {
    ObjectManager& manager = foreignManager("# Nothing more.\n");
    const Objects parts = {"TEST_Part(wheel)", "TEST_SparePart(spare)"};
    expectFound(manager, "Associators", "AssociatorNames",
                {{thing, "", parts},
                 {thing, className("AssocClass", "TEST_Link"), parts},
                 {thing, className("AssocClass", "TEST_SpareLink"), parts},
                 {thing, className("ResultClass", "TEST_Part"), parts},
                 {thing, className("ResultClass", "test_sparepart"), {"TEST_SparePart(spare)"}},
                 {thing, value("Role", "Whole"), parts},
                 {thing, value("Role", "Part"), {}},
                 {instanceName("TEST_Part", {{"Id", "wheel"}}), "", {"TEST_Thing(first)"}},
                 {instanceName("TEST_SparePart", {{"Id", "spare"}}),
                  value("ResultRole", "whole"),
                  {"TEST_Thing(first)"}},
                 {instanceName("TEST_Part", {{"Id", "no such"}}), "", {}}},
                "root/test");
}

TEST(AssociationOperations, AskEachProviderForTheAssociationsThatAreItsOwn) {
    // The second provider fails for any association but those that it knows, which this is not.
    ObjectManager& manager = foreignManager(
        "[TEST_OwnLink]\nprovider: OperatingSystemProvider\n"
        "location: korzbosstatusprofileprovider\ntype: association\n"
        "namespace: root/test\n",
        "[Association] class TEST_OwnLink : TEST_Link {};");
    EXPECT_THAT(error(respond(manager, operation("AssociatorNames",
                                                 from(thing) + className("AssocClass", "TEST_Link"),
                                                 "root/test"))),
                StartsWith("5: the provider of TEST_OwnLink: "));
}

TEST(AssociationOperations, OfAProviderThatTellsNoReferencesAndNoInstancesFailAndNameIt) {
    ObjectManager& manager = foreignManager("# Nothing more.\n");
    for (const char* const name : {"References", "ReferenceNames"})
        EXPECT_THAT(error(respond(manager, operation(name, from(thing), "root/test"))),
                    StartsWith("7: the provider of TEST_Link: "));
}

std::string property(const std::string& name, const std::string& instance) {
    return "<PROPERTY.REFERENCE NAME=\"" + name + "\"><VALUE.REFERENCE>" + instance +
           "</VALUE.REFERENCE></PROPERTY.REFERENCE>";
}

TEST(AssociationOperations, FindReferencesByTheirRolesWhereBothEndsAreOfOneClass) {
    // The provider of the associations refuses references; another one has instances of classes
    // below them, and tells all that it keeps whatever it is asked for.
    const auto section = [](const std::string& name, const std::string& provider,
                            const std::string& library, const std::string& type) {
        return "[" + name + "]\nprovider: " + provider + "\nlocation: " + library +
               "\ntype: " + type + "\nnamespace: root/test\n";
    };
    ObjectManager& manager = foreignManager(
        section("TEST_Bond", "Links", "foreign_links", "association") +
            section("TEST_StrongBond", "Things", "foreign_things", "instance") +
            section("TEST_Hold", "Links", "foreign_links", "association") +
            section("TEST_StrongHold", "Things", "foreign_things", "instance"),
        "[Association] class TEST_Bond { [Key] TEST_Thing REF Left; [Key] TEST_Thing REF Right; };"
        "[Association] class TEST_Hold { [Key] TEST_Part REF Part; [Key] TEST_Thing REF Holder; };"
        "class TEST_StrongBond : TEST_Bond {}; class TEST_StrongHold : TEST_Hold {};");
    const std::string second = instanceName("TEST_Thing", {{"Name", "second"}});
    const std::string wheel = instanceName("TEST_Part", {{"Id", "wheel"}});
    const std::string kept[] = {
        "<INSTANCE CLASSNAME=\"TEST_Thing\"><PROPERTY NAME=\"Name\" TYPE=\"string\"><VALUE>second"
        "</VALUE></PROPERTY>" +
            property("Part", wheel) + "</INSTANCE>",
        "<INSTANCE CLASSNAME=\"TEST_StrongBond\">" + property("Left", thing) +
            property("Right", second) + "</INSTANCE>"};
    for (const std::string& instance : kept) {
        EXPECT_EQ(
            error(respond(manager, operation("CreateInstance", parameter("NewInstance", instance),
                                             "root/test"))),
            "");
    }
    const Objects bond = {"TEST_StrongBond(TEST_Thing(first), TEST_Thing(second))"};
    const std::string bonds = className("ResultClass", "TEST_Bond");
    expectFound(manager, "References", "ReferenceNames",
                {{thing, bonds, bond},
                 {thing, bonds + value("Role", "left"), bond},
                 {thing, bonds + value("Role", "Right"), {}},
                 {second, bonds, bond},
                 {second, bonds + value("Role", "Right"), bond},
                 {second, bonds + value("Role", "Left"), {}},
                 // The second thing has a property of that name, but is no such association.
                 {wheel, className("ResultClass", "TEST_Hold"), {}}},
                "root/test");
}

TEST(AssociationOperations, FailAsAWholeWhenOneProviderFails) {
    ObjectManager& manager = foreignManager(
        "[TEST_OtherLink]\nprovider: Nobody\nlocation: nowhere\n"
        "type: association\nnamespace: root/test\n");
    const std::string answer =
        respond(manager, operation("AssociatorNames", from(thing), "root/test"));
    EXPECT_THAT(error(answer), StartsWith("1: the provider of TEST_OtherLink: "));
    EXPECT_THAT(error(answer), HasSubstr("libnowhere.so"));
    EXPECT_THAT(answer, Not(HasSubstr("OBJECTPATH")));
    EXPECT_EQ(
        objectsIn(respond(manager, operation("AssociatorNames",
                                             from(thing) + className("AssocClass", "TEST_Link"),
                                             "root/test")))
            .size(),
        2U);
}

TEST(AssociationOperations, AskForAnAssociationThatNoSchemaDeclaresByItsName) {
    ObjectManager& manager =
        newManager("tests/host/providers/test.mof",
                   "[TEST_Thing]\nprovider: Things\nlocation: foreign_things\ntype: instance\n"
                   "namespace: root/test\n"
                   "[TEST_Part]\nprovider: Parts\nlocation: foreign_parts\ntype: instance\n"
                   "namespace: root/test\n"
                   "[TEST_Secret]\nprovider: Links\nlocation: foreign_links\ntype: association\n"
                   "namespace: root/test\n");
    expectFound(manager, "Associators", "AssociatorNames",
                {{thing, "", {"TEST_Part(wheel)"}},
                 {thing, className("AssocClass", "TEST_Secret"), {"TEST_Part(wheel)"}},
                 {thing, className("AssocClass", "TEST_Link"), {}},
                 {thing, className("ResultClass", "TEST_Thing"), {}},
                 {"<CLASSNAME NAME=\"TEST_Thing\"/>", "", {}}},
                "root/test");
}

TEST(AssociationOperations, BelieveInASourceWhoseInstancesNobodyServes) {
    ObjectManager& manager =
        newManager("tests/host/providers/test.mof",
                   "[TEST_Part]\nprovider: Parts\nlocation: foreign_parts\ntype: instance\n"
                   "namespace: root/test\n"
                   "[TEST_Link]\nprovider: Links\nlocation: foreign_links\ntype: association\n"
                   "namespace: root/test\n");
    expectFound(manager, "Associators", "AssociatorNames", {{thing, "", {"TEST_Part(wheel)"}}},
                "root/test");
}

TEST(AssociationOperations, AskWhereTheSchemaLacksAClassThatWouldTell) {
    ObjectManager& manager = foreignManager(
        "[TEST_Gadget]\nprovider: Things\nlocation: foreign_things\ntype: instance\n"
        "namespace: root/test\n"
        "[TEST_Tie]\nprovider: Links\nlocation: foreign_links\ntype: association\n"
        "namespace: root/test\n"
        "[TEST_Odd]\nprovider: OperatingSystemProvider\n"
        "location: korzbosstatusprofileprovider\ntype: association\nnamespace: root/test\n",
        "class TEST_Gadget : EXAMPLE_Unknown { [Key] string Name; };"
        "[Association] class TEST_Tie { [Key] EXAMPLE_Other REF Whole; [Key] TEST_Thing REF Part; "
        "};"
        "[Association] class TEST_Odd { [Key] EXAMPLE_Other REF Whole; [Key] TEST_Part REF Part; "
        "};");
    const std::string gadget = instanceName("TEST_Gadget", {{"Name", "first"}});
    // The provider of the last one refuses all classes but its own: that a gadget may be no such
    // end is why that is not a failure, and that a part is one for certain is why it is.
    expectFound(manager, "Associators", "AssociatorNames",
                {{gadget, "", {"TEST_Thing(first)"}},
                 {gadget, className("AssocClass", "TEST_Tie"), {"TEST_Thing(first)"}},
                 {gadget, className("AssocClass", "TEST_Odd"), {}},
                 {gadget,
                  className("AssocClass", "TEST_Link") + value("Role", "Part"),
                  {"TEST_Thing(first)"}},
                 // That the provider answers with things is no reason to believe it.
                 {gadget, className("AssocClass", "TEST_Link") + value("Role", "Whole"), {}},
                 {"<CLASSNAME NAME=\"TEST_Gadget\"/>", "", {}}},
                "root/test");
    const std::string part = from(instanceName("TEST_Part", {{"Id", "wheel"}}));
    EXPECT_THAT(error(respond(manager, operation("AssociatorNames", part, "root/test"))),
                StartsWith("5: the provider of TEST_Odd: "));
}

}  // namespace
}  // namespace cmpihost::server::association_tests
