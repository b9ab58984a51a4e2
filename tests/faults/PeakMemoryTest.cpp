// What the provider and the framework have in use at once for a request, whatever the number of
// nodes: a walk holds one node at a time.
#include "faults/Allocations.h"
#include "faults/FaultFixture.h"

namespace {

using namespace cmpihost;
using VA::SimulatedHost;

constexpr std::size_t counts[] = {1, 1000, 10000};

const NamedRequest rows[] = {
    {"EnumerateInstances", "",
     requestFor(Operation::EnumerateInstances, path("KORVA_OperatingSystem"))},
    {"EnumerateInstanceNames", "",
     requestFor(Operation::EnumerateInstanceNames, path("KORVA_OperatingSystem"))},
    {"AssociatorsOfComputer", "",
     requestFor(Operation::Associators, computerSystemPath("host1"), "KORVA_InstalledOS")},
};

class PeakMemory : public LibraryFixture, public testing::WithParamInterface<NamedRequest> {
  protected:
    PeakMemory() { recording::setRecording(false); }
    ~PeakMemory() override { allocations::measured(); }

    allocations::Usage usageFor(std::size_t nodes) {
        SimulatedHost::Node node = SimulatedHost::plausibleNode();
        node.properties[VA::NodeLexicon::Name] = std::string("Linux");
        host->clearNodes();
        host->addNodes(node, nodes);
        allocations::measure();
        const Outcome outcome = invoke(GetParam().request);
        const allocations::Usage usage = allocations::measured();
        EXPECT_EQ(outcome.rc, CMPI_RC_OK);
        EXPECT_EQ(outcome.paths.size() + outcome.instances.size(), nodes);
        return usage;
    }
};

TEST_P(PeakMemory, IsTheSameForAnyNumberOfNodesAndNothingIsLeft) {
    usageFor(1);  // after it the log keeps the buffers that a request needs
    const allocations::Usage one = usageFor(1);
    EXPECT_GT(one.peak, 0U);
    for (const std::size_t nodes : counts) {
        SCOPED_TRACE(testing::Message() << nodes << " nodes");
        const allocations::Usage usage = usageFor(nodes);
        EXPECT_EQ(usage.peak, one.peak);
        EXPECT_EQ(usage.left, 0U);
        EXPECT_GE(usage.allocations, nodes);
    }
}

INSTANTIATE_TEST_SUITE_P(Of, PeakMemory, testing::ValuesIn(rows),
                         [](const auto& row) { return row.param.name; });

}  // namespace
