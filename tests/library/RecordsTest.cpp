#include <fstream>
#include <sstream>
#include <stdexcept>

#include "library/LibraryFixture.h"

// The whole sequence of records, in both channels with all nine arguments, that a request leaves.
// The expected ones stand in records/, a file a sequence.

namespace {

using namespace cmpihost;

/// One request and the host that it meets.
struct Sequence {
    std::string name;  ///< of the test, and of the file
    OperationRequest request;
    std::vector<std::string> nodes = {"Linux"};
    std::vector<std::string> computerSystems = {"host1"};
    bool throwing = false;                     ///< the instrumentation throws when a text is read
    std::vector<std::string> violations = {};  ///< what the strict broker notes
};

std::ostream& operator<<(std::ostream& out, const Sequence& sequence) {
    return out << sequence.name;
}

OperationRequest operation(Operation kind, const ObjectPathValue& source,
                           const std::string& assocClass = "") {
    OperationRequest request;
    request.operation = kind;
    request.path = source;
    if (!assocClass.empty()) request.assocClass = assocClass;
    return request;
}

const Operation names = Operation::EnumerateInstanceNames;
const Operation instances = Operation::EnumerateInstances;
const Operation get = Operation::GetInstance;
const Operation farNames = Operation::AssociatorNames;
const Operation farInstances = Operation::Associators;

const ObjectPathValue system1 = operatingSystemPath("host1", "Linux");
const ObjectPathValue capabilities1 = capabilitiesPath("Linux");
const ObjectPathValue computer1 = computerSystemPath("host1");
const ObjectPathValue pair1 =
    path("KORVA_OSElementCapabilities", {{"ManagedElement", Value::fromReference(system1)},
                                         {"Capabilities", Value::fromReference(capabilities1)}});
const ObjectPathValue halfPair =
    path("KORVA_OSElementCapabilities", {{"Capabilities", Value::fromReference(capabilities1)}});
const ObjectPathValue brokenPair =
    path("KORVA_OSElementCapabilities",
         {{"ManagedElement", Value::fromReference(system1)},
          {"Capabilities", Value::fromReference(capabilitiesPath("linux"))}});

std::vector<Sequence> sequences() {
    std::vector<Sequence> all;
    for (const char* className :
         {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities", "KORVA_InstalledOS",
          "KORVA_RunningOS", "KORVA_OSElementCapabilities"}) {
        const std::string suffix = std::string(className).substr(6);
        all.push_back({"EnumInstanceNamesOf" + suffix, operation(names, path(className))});
        all.push_back({"EnumInstancesOf" + suffix, operation(instances, path(className))});
    }
    all.push_back({"GetInstanceOfOperatingSystem", operation(get, system1)});
    all.push_back({"GetInstanceOfOperatingSystemCapabilities", operation(get, capabilities1)});
    all.push_back({"GetInstanceOfInstalledOS", operation(get, path("KORVA_InstalledOS"))});
    all.push_back({"GetInstanceOfRunningOS", operation(get, path("KORVA_RunningOS"))});
    all.push_back({"GetInstanceOfOSElementCapabilities", operation(get, pair1)});
    all.push_back({"GetInstanceOfContradictingPair", operation(get, brokenPair)});
    all.push_back({"GetInstanceOfPairWithoutManagedElement", operation(get, halfPair)});
    all.push_back(
        {"GetInstanceOfUnknownName", operation(get, operatingSystemPath("host1", "unknown"))});
    for (const char* association : {"KORVA_InstalledOS", "KORVA_RunningOS"}) {
        const std::string suffix = std::string("Through") + (association + 6);
        all.push_back(
            {"AssociatorNamesOfComputer" + suffix, operation(farNames, computer1, association)});
        all.push_back(
            {"AssociatorsOfComputer" + suffix, operation(farInstances, computer1, association)});
        all.push_back(
            {"AssociatorNamesOfSystem" + suffix, operation(farNames, system1, association)});
        all.push_back(
            {"AssociatorsOfSystem" + suffix, operation(farInstances, system1, association)});
    }
    const char* const element = "KORVA_OSElementCapabilities";
    all.push_back({"AssociatorNamesOfSystemThroughOSElementCapabilities",
                   operation(farNames, system1, element)});
    all.push_back({"AssociatorsOfSystemThroughOSElementCapabilities",
                   operation(farInstances, system1, element)});
    all.push_back({"AssociatorNamesOfCapabilities", operation(farNames, capabilities1, element)});
    all.push_back({"AssociatorsOfCapabilities", operation(farInstances, capabilities1, element)});
    all.push_back({"AssociatorNamesOfUnrelatedSourceThroughOSElementCapabilities",
                   operation(farNames, computer1, element)});
    all.push_back({"AssociatorNamesOfUnrelatedSourceThroughInstalledOS",
                   operation(farNames, capabilities1, "KORVA_InstalledOS")});
    all.push_back({"EnumInstanceNamesOfTwoNodes",
                   operation(names, path("KORVA_OperatingSystem")),
                   {"a", "b"}});
    all.push_back({"EnumInstanceNamesOfTwoPairsWithCapabilities",
                   operation(names, path(element)),
                   {"a", "b"},
                   {"host1"},
                   false,
                   {"path of KORVA_OperatingSystemCapabilities without key InstanceID"}});
    all.push_back({"EnumInstanceNamesOfTwoPairsOfThree",
                   operation(names, path("KORVA_InstalledOS")),
                   {"a", "b"},
                   {"cs1", "cs2", "cs3"}});
    all.push_back({"EnumInstancesWithoutComputerSystem",
                   operation(instances, path("KORVA_RunningOS")),
                   {"Linux"},
                   {}});
    all.push_back(
        {"EnumInstancesWithoutNode", operation(instances, path("KORVA_OperatingSystem")), {}});
    all.push_back(
        {"EnumInstancesOfInvalidClass", operation(instances, path("KORVA_ComputerSystem"))});
    all.push_back({"AssociatorsThroughInvalidClass",
                   operation(farInstances, system1, "KORVA_OperatingSystem")});
    all.push_back({"EnumInstancesOfThrowingAdapter",
                   operation(instances, path("KORVA_OperatingSystem")),
                   {"Linux"},
                   {"host1"},
                   true});
    return all;
}

class Records : public LibraryFixture, public testing::WithParamInterface<Sequence> {};

INSTANTIATE_TEST_SUITE_P(Of, Records, testing::ValuesIn(sequences()),
                         [](const auto& each) { return each.param.name; });

TEST_P(Records, AreWrittenInThisSequence) {
    const Sequence& sequence = GetParam();
    setNodes(sequence.nodes);
    computers.setNames(sequence.computerSystems);
    if (sequence.throwing)
        host->throwFromCall(VA::SimulatedHost::Operation::ReadText, 1,
                            std::runtime_error("from the instrumentation"));
    recording::clear();
    invoke(sequence.request);
    const std::string actual = recording::takeRendered();
    EXPECT_EQ(broker.takeViolations(), sequence.violations);

    std::ifstream file(std::string(KORVA_TEST_DATA "/records/") + sequence.name + ".txt");
    std::ostringstream expected;
    expected << file.rdbuf();
    EXPECT_EQ(actual, expected.str());
}

}  // namespace
