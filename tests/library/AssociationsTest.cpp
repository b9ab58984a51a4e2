// The three associations, from every end and for every number of nodes and computer systems: what
// comes looks odd where the two walks go in step, and is kept so.
#include <iterator>

#include "library/AssociationsFixture.h"
#include "support/Properties.h"

namespace {

using namespace associations;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr const char* capabilitiesWithoutKey =
    "path of KORVA_OperatingSystemCapabilities without key InstanceID";

// The path of an association of the computer without keys, with one and with both references.
std::vector<ObjectPathValue> pathsOf(const Association& association) {
    const KeyBinding first = {association.first, Value::fromReference(computerSystemPath("other"))};
    const KeyBinding second = {association.second,
                               Value::fromReference(operatingSystemPath("x", "y"))};
    return {path(association.className), path(association.className, {first}),
            path(association.className, {first, second})};
}

// Enumerated, and by GetInstance: with whatever keys, it gives the pairs of an enumeration.
TEST_F(Associations, OfComputerAndSystemAreGivenInStepUntilEitherEndRunsOut) {
    struct Row {
        unsigned int nodes;
        unsigned int computerSystems;
        Texts installedPairs;
    };
    // Of n > 1 computer systems the last is never reported.
    const Row rows[] = {
        {0, 1, {}},          {0, 2, {}},          {0, 3, {}},
        {1, 1, {"cs1+os1"}}, {1, 2, {"cs1+os1"}}, {1, 3, {"cs1+os1"}},
        {2, 1, {"cs1+os1"}}, {2, 2, {"cs1+os1"}}, {2, 3, {"cs1+os1", "cs2+os2"}},
        {3, 1, {"cs1+os1"}}, {3, 2, {"cs1+os1"}}, {3, 3, {"cs1+os1", "cs2+os2"}},
    };
    for (const Row& row : rows) {
        populate(row.nodes, row.computerSystems);
        EXPECT_EQ(pairs(installed), row.installedPairs) << row.nodes << row.computerSystems;
        for (const ObjectPathValue& asked : pathsOf(installed))
            EXPECT_EQ(gotten(asked, installed), row.installedPairs)
                << row.nodes << row.computerSystems;
        Texts swapped;
        for (const std::string& pair : row.installedPairs)
            swapped.push_back(pair.substr(4) + "+" + pair.substr(0, 3));
        EXPECT_EQ(pairs(running), swapped) << row.nodes << row.computerSystems;
        for (const ObjectPathValue& asked : pathsOf(running))
            EXPECT_EQ(gotten(asked, running), swapped) << row.nodes << row.computerSystems;
    }
}

TEST_F(Associations, WithoutAComputerSystemEnumerationAndGetEndWithAMessage) {
    for (const unsigned int nodes : {0U, 1U, 2U, 3U}) {
        populate(nodes, 0);
        for (const Association& association : {installed, running})
            for (const ObjectPathValue& asked : pathsOf(association))
                EXPECT_THAT(gotten(asked, association, noComputerSystem), IsEmpty());
        EXPECT_THAT(pairs(installed, noComputerSystem), IsEmpty());
        EXPECT_THAT(pairs(running, noComputerSystem), IsEmpty());
    }
}

TEST_F(Associations, FromAnOperatingSystemToItsComputers) {
    const Texts byCount[] = {{}, {"cs1"}, {"cs1"}, {"cs1", "cs2"}};
    for (const unsigned int nodes : {0U, 1U, 2U, 3U}) {
        for (const unsigned int count : {1U, 2U, 3U}) {
            populate(nodes, count);
            for (const Association& association : {installed, running})
                for (const ObjectPathValue& source :
                     {operatingSystemPath("host1", "os1"), path("KORVA_OperatingSystem"),
                      operatingSystemPath("elsewhere", "unknown")})
                    EXPECT_EQ(farEnds(source, association), byCount[count]) << nodes << count;
        }
        populate(nodes, 0);
        EXPECT_THAT(farEnds(operatingSystemPath("host1", "os1"), installed, noComputerSystem),
                    IsEmpty());
        EXPECT_THAT(farEnds(operatingSystemPath("host1", "os1"), running, noComputerSystem),
                    IsEmpty());
    }
}

TEST_F(Associations, FromAComputerToItsOperatingSystems) {
    const Texts byCount[] = {{}, {"os1"}, {"os1", "os2"}, {"os1", "os2", "os3"}};
    for (const unsigned int nodes : {0U, 1U, 2U, 3U}) {
        for (const unsigned int count : {0U, 1U, 2U, 3U}) {
            populate(nodes, count);
            for (const Association& association : {installed, running}) {
                EXPECT_EQ(farEnds(computerSystemPath("HOST1"), association), byCount[nodes]);
                EXPECT_EQ(farEnds(path("KORVA_ComputerSystem"), association), byCount[nodes]);
                EXPECT_EQ(farEnds(computerSystemPath("host2"), association), Texts{});
            }
            EXPECT_EQ(associatorNames(computerSystemPath("host1"), "korva_RUNNINGos").paths.size(),
                      nodes);
            recording::clear();
        }
    }
}

// Enumerated, and by GetInstance without keys.
TEST_F(Associations, OfCapabilitiesAreGivenWithoutRestartingTheInnerWalk) {
    const ObjectPathValue keyless = path("KORVA_OSElementCapabilities");
    populate(1, 1);
    EXPECT_THAT(pairs(capabilities), ElementsAre("os1+os1"));
    EXPECT_THAT(gotten(keyless, capabilities), ElementsAre("os1+os1"));
    EXPECT_THAT(broker.takeViolations(), IsEmpty());
    // Once the capabilities are spent, the remaining operating systems are paired with a reference
    // that has no key, which the strict broker notes.
    populate(2, 1);
    EXPECT_THAT(pairs(capabilities), ElementsAre("os1+os1", "os1+os2", "os2+-"));
    EXPECT_THAT(gotten(keyless, capabilities), ElementsAre("os1+os1", "os1+os2", "os2+-"));
    EXPECT_EQ(broker.takeViolations(), Texts(3, capabilitiesWithoutKey));
    populate(3, 1);
    EXPECT_THAT(pairs(capabilities),
                ElementsAre("os1+os1", "os1+os2", "os1+os3", "os2+-", "os3+-"));
    EXPECT_THAT(gotten(keyless, capabilities),
                ElementsAre("os1+os1", "os1+os2", "os1+os3", "os2+-", "os3+-"));
    EXPECT_EQ(broker.takeViolations(), Texts(6, capabilitiesWithoutKey));
}

TEST_F(Associations, OfCapabilitiesWithoutANodeEndWithAMessage) {
    populate(0, 1);
    EXPECT_THAT(pairs(capabilities, "Object Not Found."), IsEmpty());
    EXPECT_THAT(gotten(path("KORVA_OSElementCapabilities"), capabilities, "Object Not Found."),
                IsEmpty());
}

TEST_F(Associations, FromAnOperatingSystemToEveryCapabilities) {
    const Texts byCount[] = {{"-"}, {"os1"}, {"os1", "os2"}, {"os1", "os2", "os3"}};
    for (const unsigned int nodes : {0U, 1U, 2U, 3U}) {
        populate(nodes, 1);
        for (const ObjectPathValue& source :
             {operatingSystemPath("host1", "os1"), operatingSystemPath("host1", "unknown"),
              path("KORVA_OperatingSystem")})
            EXPECT_EQ(farEnds(source, capabilities), byCount[nodes]) << nodes;
        // Without a node the one result lacks its key, which the strict broker notes.
        EXPECT_EQ(broker.takeViolations(), Texts(nodes == 0 ? 6 : 0, capabilitiesWithoutKey));
    }
}

TEST_F(Associations, FromCapabilitiesToTheOperatingSystemOfThatName) {
    for (const unsigned int nodes : {1U, 2U, 3U}) {
        populate(nodes, 1);
        EXPECT_THAT(farEnds(capabilitiesPath("OS1"), capabilities), ElementsAre("os1"));
    }
    populate(3, 1);
    EXPECT_THAT(farEnds(path("KORVA_OperatingSystemCapabilities"), capabilities),
                ElementsAre("os1", "os2", "os3"));
    setNodes({"a", "b", "a"});
    EXPECT_THAT(farEnds(capabilitiesPath("a"), capabilities), ElementsAre("a", "a"));
}

TEST_F(Associations, FirstResultFromAnEndIsGivenEvenWhereNoneExists) {
    populate(1, 1);
    EXPECT_THAT(farEnds(capabilitiesPath("unknown"), capabilities), ElementsAre("-"));
    populate(0, 1);
    EXPECT_THAT(farEnds(capabilitiesPath("os1"), capabilities), ElementsAre("-"));
    EXPECT_EQ(broker.takeViolations(), Texts(4, "path of KORVA_OperatingSystem without key Name"));
}

TEST_F(Associations, SourceWithKeysButNotTheOneSoughtEndsWithAMessage) {
    const std::vector<KeyBinding> keys = {{"csname", "host1"}, {"NAME", "x"}, {"Other", "x"}};
    for (const Association& association : {installed, running}) {
        EXPECT_THAT(farEnds(path("KORVA_OperatingSystem", keys), association,
                            "Could not find 'CSName' or 'Name' Key in Moniker"),
                    IsEmpty());
        EXPECT_THAT(farEnds(path("KORVA_ComputerSystem", keys), association,
                            "Could not find 'Name' Key in Moniker"),
                    IsEmpty());
    }
    EXPECT_THAT(farEnds(path("KORVA_OperatingSystem", keys), capabilities,
                        "Could not find 'Name' Key in Moniker"),
                IsEmpty());
    EXPECT_THAT(farEnds(path("KORVA_OperatingSystemCapabilities", keys), capabilities,
                        "Could not find 'InstanceID' Key in Moniker"),
                IsEmpty());
}

TEST_F(Associations, KeysOfOtherTypesAreMappedAsText) {
    setNodes({"17", "true"});
    EXPECT_THAT(farEnds(path("KORVA_OperatingSystemCapabilities",
                             {{"InstanceID", Value::fromUnsigned(17)}}),
                        capabilities),
                ElementsAre("17"));
    EXPECT_THAT(farEnds(path("KORVA_OperatingSystemCapabilities",
                             {{"InstanceID", Value::fromBoolean(true)}}),
                        capabilities),
                ElementsAre("true"));
    host->setComputerName("42");
    EXPECT_THAT(farEnds(path("KORVA_ComputerSystem", {{"Name", Value::fromSigned(42)}}), running),
                ElementsAre("17", "true"));
    // A reference is no text: the key counts as missing.
    EXPECT_THAT(farEnds(path("KORVA_ComputerSystem",
                             {{"Name", Value::fromReference(computerSystemPath("42"))}}),
                        running, "Could not find 'Name' Key in Moniker"),
                IsEmpty());
}

TEST_F(Associations, SourceOfTheAssociationItselfEndsWithTheMessageOfItsWalk) {
    populate(1, 0);
    EXPECT_THAT(farEnds(path("KORVA_RunningOS"), running, noComputerSystem), IsEmpty());
    populate(0, 1);
    EXPECT_THAT(farEnds(path("KORVA_OSElementCapabilities"), capabilities, "Object Not Found."),
                IsEmpty());
}

TEST_F(Associations, ClassThatIsNoAssociationIsInvalid) {
    const std::optional<std::string> wrong[] = {std::nullopt,
                                                "",
                                                "KORVA_OperatingSystem",
                                                "KORVA_OperatingSystemCapabilities",
                                                "KORVA_ComputerSystem",
                                                "CIM_RunningOS"};
    for (const std::optional<std::string>& className : wrong) {
        for (const ObjectPathValue& source :
             {operatingSystemPath("host1", "Linux"), capabilitiesPath("Linux"),
              computerSystemPath("host1"), path("KORVA_RunningOS"), path("KORVA_Unknown")}) {
            for (const Outcome& outcome :
                 {associatorNames(source, className), associators(source, className)}) {
                EXPECT_EQ(outcome.rc, CMPI_RC_ERR_INVALID_CLASS);
                EXPECT_EQ(outcome.doneCount, 0U);
                EXPECT_TRUE(outcome.paths.empty() && outcome.instances.empty());
            }
        }
    }
}

TEST_F(Associations, PropertyListReachesTheFarEndAndIsNotApplied) {
    OperationRequest request =
        requestFor(Operation::Associators, computerSystemPath("host1"), "KORVA_InstalledOS");
    request.properties = std::vector<std::string>{"Name"};
    const Outcome listed = invoke(request);
    ASSERT_EQ(listed.instances.size(), 1U);
    EXPECT_EQ(listed.instances[0].properties.size(), std::size(operatingSystemProperties));
    EXPECT_THAT(recording::takeRendered(), HasSubstr("getCMPIInstance() in CMPIOperatingSystem.cpp "
                                                     "[Line: #],Parameters List:  properties=0x*"));
    request.properties = std::nullopt;
    invoke(request);
    EXPECT_THAT(recording::takeRendered(), HasSubstr("getCMPIInstance() in CMPIOperatingSystem.cpp "
                                                     "[Line: #],Parameters List:  properties=0\n"));
}

TEST_F(Associations, ReferencesOmittedFromThePropertyListAreSetAllTheSame) {
    for (const Association& association : {installed, running, capabilities}) {
        OperationRequest request =
            requestFor(Operation::EnumerateInstances, path(association.className));
        request.properties = std::vector<std::string>{"PrimaryOS"};
        const Outcome outcome = invoke(request);
        ASSERT_EQ(outcome.instances.size(), 1U);
        EXPECT_NE(outcome.instances[0].property(association.first), nullptr);
        EXPECT_NE(outcome.instances[0].property(association.second), nullptr);
        EXPECT_EQ(outcome.instances[0].property("PrimaryOS"), nullptr);
    }
}

}  // namespace
