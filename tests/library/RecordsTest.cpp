// The whole sequence of records, in both channels with all nine arguments, that a request leaves.
// Others read these records by program, so no word of them may change unnoticed: the expected ones
// stand in records/, a file a sequence.
#include <stdexcept>

#include "library/LibraryFixture.h"
#include "support/GoldenFile.h"

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

std::vector<Sequence> sequences() {
    std::vector<Sequence> all;
    for (const NamedRequest& each : servedRequests({"host1", "Linux", "Linux"}))
        all.push_back({each.name, each.request});

    const Operation names = Operation::EnumerateInstanceNames;
    const Operation instances = Operation::EnumerateInstances;
    const ObjectPathValue system = operatingSystemPath("host1", "Linux");
    const ObjectPathValue ofSystems = path("KORVA_OperatingSystem");
    all.push_back(
        {"GetInstanceOfPairWithoutManagedElement",
         requestFor(Operation::GetInstance,
                    path("KORVA_OSElementCapabilities",
                         {{"Capabilities", Value::fromReference(capabilitiesPath("Linux"))}}))});
    all.push_back({"EnumInstanceNamesOfTwoNodes", requestFor(names, ofSystems), {"a", "b"}});
    all.push_back({"EnumInstanceNamesOfTwoPairsWithCapabilities",
                   requestFor(names, path("KORVA_OSElementCapabilities")),
                   {"a", "b"},
                   {"host1"},
                   false,
                   {"path of KORVA_OperatingSystemCapabilities without key InstanceID"}});
    all.push_back({"EnumInstanceNamesOfTwoPairsOfThree",
                   requestFor(names, path("KORVA_InstalledOS")),
                   {"a", "b"},
                   {"cs1", "cs2", "cs3"}});
    all.push_back({"EnumInstancesWithoutComputerSystem",
                   requestFor(instances, path("KORVA_RunningOS")),
                   {"Linux"},
                   {}});
    all.push_back({"EnumInstancesWithoutNode", requestFor(instances, ofSystems), {}});
    all.push_back(
        {"EnumInstancesOfInvalidClass", requestFor(instances, path("KORVA_ComputerSystem"))});
    all.push_back({"AssociatorsThroughInvalidClass",
                   requestFor(Operation::Associators, system, "KORVA_OperatingSystem")});
    all.push_back({"EnumInstancesOfThrowingAdapter",
                   requestFor(instances, ofSystems),
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
    expectGolden(KORVA_TEST_DATA "/records/" + sequence.name + ".txt", recording::takeRendered());
    EXPECT_EQ(broker.takeViolations(), sequence.violations);
}

}  // namespace
