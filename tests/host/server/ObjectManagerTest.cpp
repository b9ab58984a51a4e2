#include "host/server/ObjectManager.h"

#include <gmock/gmock.h>

#include "host/server/CimError.h"
#include "host/server/ServerFixture.h"

namespace cmpihost::server {
namespace {

using namespace fixture;
using testing::AllOf;
using testing::Contains;
using testing::Each;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;
using testing::StartsWith;

OperationRequest namesOf(const std::string& className,
                         const std::string& nameSpace = "root/cimv2") {
    OperationRequest request;
    request.operation = Operation::EnumerateInstanceNames;
    request.path.nameSpace = nameSpace;
    request.path.className = className;
    return request;
}

/// The paths of an answer, or its error.
std::vector<std::string> asked(ObjectManager& manager, const OperationRequest& request) {
    std::vector<std::string> lines;
    try {
        for (const ObjectPathValue& path : manager.ask(request).paths)
            lines.push_back(toString(path));
    } catch (const CimError& wrong) {
        lines.push_back(std::to_string(wrong.code()) + ": " + wrong.what());
    }
    return lines;
}

TEST(ObjectManager, GivesPathsTheNamesOfTheSchema) {
    EXPECT_THAT(asked(shippedManager(), namesOf("cim_capabilities", "ROOT/cimv2")),
                ElementsAre("root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"Fixture "
                            "Linux\""));
    EXPECT_THAT(shippedManager().takeComplaints(), IsEmpty());
}

TEST(ObjectManager, ServesTheNamespacesOfRegistrationsAndTheInteropNamespace) {
    const struct {
        const char* registered;
        std::vector<std::string> nameSpaces;
    } rows[] = {
        {"root/cimv2", {"root/cimv2", "root/interop"}},
        {"*", {"root/cimv2", "root/interop"}},
        {"* Root/Other", {"Root/Other", "root/interop"}},
        {"root/a ROOT/A root/b", {"root/a", "root/b", "root/interop"}},
        {"ROOT/Interop root/a", {"root/a", "root/interop"}},
    };
    for (const auto& row : rows) {
        const ObjectManager& manager = newManager(
            "schema", registration("OTHER_Thing", "P", "nowhere", "instance", row.registered));
        EXPECT_EQ(manager.nameSpaces(), row.nameSpaces) << row.registered;
    }
    EXPECT_THAT(newManager("schema", "").nameSpaces(), ElementsAre("root/cimv2", "root/interop"));
}

TEST(ObjectManager, KnowsNamespacesWithoutCase) {
    const ObjectManager& manager = shippedManager();
    EXPECT_EQ(manager.nameSpace("ROOT/CimV2"), "root/cimv2");
    EXPECT_EQ(manager.nameSpace("Root/Interop"), "root/interop");
    for (const char* name : {"", "root", "root/cimv2/", "interop", "root/PG_InterOp"}) {
        EXPECT_THROW(
            try { manager.nameSpace(name); } catch (const CimError& wrong) {
                EXPECT_EQ(wrong.code(), 3U);
                EXPECT_EQ(wrong.what(), std::string(name) + ": no such namespace");
                throw;
            },
            CimError);
    }
}

TEST(ObjectManager, KnowsClassesAndTheirAncestors) {
    const ObjectManager& manager = newManager(
        "schema", registration("OTHER_Thing", "P", "nowhere", "instance", "root/other") +
                      registration("MY_Manager", "P", "nowhere", "instance", "root/interop"));
    const struct {
        const char* nameSpace;
        const char* className;
        const char* spelling;
    } known[] = {
        {"root/other", "KORVA_operatingsystem", "KORVA_OperatingSystem"},
        {"root/other", "cim_MANAGEDELEMENT", "CIM_ManagedElement"},
        {"root/other", "other_thing", "OTHER_Thing"},
        {"ROOT/interop", "cim_namespace", "CIM_Namespace"},
        {"root/interop", "my_manager", "MY_Manager"},
    };
    for (const auto& row : known) {
        EXPECT_TRUE(manager.knowsClass(row.nameSpace, row.className)) << row.className;
        EXPECT_EQ(manager.spelling(row.nameSpace, row.className), row.spelling);
        EXPECT_EQ(manager.knownClass(row.nameSpace, row.className), row.spelling);
    }
    const std::pair<const char*, const char*> unknown[] = {
        {"root/other", "CIM_Namespace"},
        {"root/other", "MY_Manager"},
        {"root/other", ""},
        {"root/interop", "KORVA_OperatingSystem"},
        {"root/interop", "OTHER_Thing"},
        {"root/nope", "KORVA_OperatingSystem"}};
    for (const auto& [nameSpace, className] : unknown) {
        EXPECT_FALSE(manager.knowsClass(nameSpace, className)) << className;
        EXPECT_EQ(manager.spelling(nameSpace, className), className);
        EXPECT_THROW(manager.knownClass(nameSpace, className), CimError) << className;
    }
    EXPECT_TRUE(manager.isA("root/other", "korva_runningos", "CIM_Dependency"));
    EXPECT_TRUE(manager.isA("root/interop", "CIM_ObjectManager", "cim_objectmanager"));
    EXPECT_FALSE(manager.isA("root/other", "CIM_Dependency", "KORVA_RunningOS"));
}

TEST(ObjectManager, AsksTheProvidersOfTheInteropNamespaceBesideItsOwnClasses) {
    // The provider answers with the class as it is registered.
    ObjectManager& manager = foreignManager(
        registration("test_SPAREpart", "Spares", "foreign_parts", "instance", "root/interop"));
    EXPECT_THAT(asked(manager, namesOf("test_sparepart", "root/interop")),
                ElementsAre("root/interop:TEST_SparePart.Id=\"spare\""));
    EXPECT_THAT(asked(manager, namesOf("TEST_Part", "root/interop")),
                ElementsAre("root/interop:TEST_SparePart.Id=\"spare\""));
    EXPECT_THAT(asked(manager, namesOf("CIM_ObjectManager", "root/interop")), SizeIs(1));
}

/// The classes of the interop namespace have a place for those of other makers.
TEST(ObjectManager, JoinsInstancesOfTheInteropNamespaceWithThoseOfOtherMakers) {
    ObjectManager& manager = newManager(
        schemaOf("class CIM_Namespace { [Key] string Id; }; class TEST_Part : CIM_Namespace {};"),
        registration("TEST_Part", "Parts", "foreign_parts", "instance", "root/interop"));
    const std::vector<std::string> names = asked(manager, namesOf("CIM_Namespace", "root/interop"));
    ASSERT_THAT(names, SizeIs(3));
    EXPECT_EQ(names.back(), "root/interop:TEST_Part.Id=\"wheel\"");
}

TEST(ObjectManager, TellsWhyALibraryDoesNotLoad) {
    ObjectManager& manager = newManager(
        "schema", registration("KORVA_RunningOS", "P", "no_such_library", "instance") +
                      registration("KORVA_InstalledOS", "P", "foreign_things", "instance"));
    EXPECT_THAT(asked(manager, namesOf("KORVA_RunningOS")),
                ElementsAre(AllOf(StartsWith("1: "), HasSubstr("libno_such_library.so"))));
    EXPECT_THAT(asked(manager, namesOf("KORVA_InstalledOS")),
                ElementsAre(AllOf(StartsWith("1: "), HasSubstr("there is no provider P in it"))));
    EXPECT_THAT(manager.takeComplaints(), ElementsAre(HasSubstr("libno_such_library.so"),
                                                      HasSubstr("there is no provider P in it")));
    EXPECT_THAT(manager.takeComplaints(), IsEmpty());
}

TEST(ObjectManager, AStatusWithoutWordsGetsWords) {
    ObjectManager& manager =
        newManager("schema", registration("KORVA_OSElementCapabilities", "OperatingSystemProvider",
                                          "cmpihost_stand_in", "instance"));
    EXPECT_THAT(asked(manager, namesOf("KORVA_OSElementCapabilities")),
                ElementsAre("2: EnumerateInstanceNames of KORVA_OSElementCapabilities: access is "
                            "denied"));
}

/// What providers are caught at must not pile up while nobody asks for it.
TEST(ObjectManager, KeepsSoManyComplaintsAndCountsTheRest) {
    ObjectManager& manager =
        newManager("schema", registration("KORVA_InstalledOS", "OperatingSystemProvider",
                                          "cmpihost_stand_in", "instance"));
    OperationRequest request = namesOf("KORVA_InstalledOS");
    request.operation = Operation::EnumerateInstances;
    for (std::size_t round = 0; round < ObjectManager::mostComplaints + 5; ++round)
        asked(manager, request);
    const std::vector<std::string> lines = manager.takeComplaints();
    ASSERT_THAT(lines, SizeIs(ObjectManager::mostComplaints + 1));
    EXPECT_THAT(lines.front(), HasSubstr("null CMPIInstance"));
    EXPECT_EQ(lines.back(), "and 5 more complaints");
    manager.complain(std::string(5000, 'x'));
    EXPECT_THAT(manager.takeComplaints(),
                ElementsAre(std::string(ObjectManager::longestComplaint, 'x')));
}

TEST(ObjectManager, TellsWhatProvidersAreCaughtAtInTheEnd) {
    ObjectManager& manager =
        newManager("schema", registration("KORVA_OSElementCapabilities", "OperatingSystemProvider",
                                          "cmpihost_stand_in", "instance"));
    asked(manager, namesOf("KORVA_OSElementCapabilities"));
    setenv("STAND_IN_CLEANUP", "fails", 1);
    manager.unload();
    unsetenv("STAND_IN_CLEANUP");
    EXPECT_THAT(manager.takeComplaints(), Contains("cleanup answered status 1"));
}

/// A provider that tells what accompanies a request.
TEST(ObjectManager, ProvidersLearnWhoAsksAndHow) {
    ObjectManager& manager = newManager(
        schemaOf("class TEST_Thing { [Key] string Name; uint16 KeyType; uint32 Flags;"
                 "  string CMPIPrincipal; string CMPIRole; string CMPIInitNameSpace; };"),
        registration("TEST_Thing", "Good", "broker_test_providers", "instance"));
    const auto gotten = [&](const char* classOrigin, const std::optional<std::string>& user) {
        const std::string path = instanceName("test_thing", {{"NAME", "one"}});
        return content(respond(
            manager,
            operation("GetInstance", parameter("InstanceName", path) + value("LocalOnly", "TRUE") +
                                         value("IncludeQualifiers", "TRUE") +
                                         value("IncludeClassOrigin", classOrigin)),
            user));
    };
    const std::string joe = gotten("TRUE", "joe");
    EXPECT_THAT(joe, HasSubstr("<PROPERTY NAME=\"KeyType\" TYPE=\"uint16\"><VALUE>5632</VALUE>"));
    EXPECT_THAT(joe, HasSubstr("<PROPERTY NAME=\"Flags\" TYPE=\"uint32\"><VALUE>8</VALUE>"));
    EXPECT_THAT(joe, HasSubstr("<PROPERTY NAME=\"CMPIPrincipal\" TYPE=\"string\"><VALUE>joe<"));
    const std::string anybody = gotten("FALSE", std::nullopt);
    EXPECT_THAT(anybody, HasSubstr("<PROPERTY NAME=\"Flags\" TYPE=\"uint32\"><VALUE>0</VALUE>"));
    EXPECT_THAT(anybody, HasSubstr("NAME=\"CMPIPrincipal\" TYPE=\"string\"><VALUE>(none)<"));
}

}  // namespace
}  // namespace cmpihost::server
