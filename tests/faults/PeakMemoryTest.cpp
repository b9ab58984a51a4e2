// What the provider and the framework have in use at once for a request, whatever the number of
// nodes: a walk holds one node at a time.
#include "faults/Allocations.h"
#include "faults/FaultFixture.h"

namespace {

using namespace cmpihost;
using VA::SimulatedHost;

constexpr std::size_t counts[] = {1, 1000, 10000};

struct Row {
    const char* name;
    Operation operation;
    ObjectPathValue path;
    std::optional<std::string> assocClass;
};

std::ostream& operator<<(std::ostream& out, const Row& row) {
    return out << row.name;
}

const Row rows[] = {
    {"EnumerateInstances", Operation::EnumerateInstances, path("KORVA_OperatingSystem"), {}},
    {"EnumerateInstanceNames",
     Operation::EnumerateInstanceNames,
     path("KORVA_OperatingSystem"),
     {}},
    {"AssociatorsOfComputer", Operation::Associators, computerSystemPath("host1"),
     "KORVA_InstalledOS"},
};

class PeakMemory : public LibraryFixture, public testing::WithParamInterface<Row> {
  protected:
    PeakMemory() { recording::setRecording(false); }
    ~PeakMemory() override { allocations::measured(); }

    allocations::Usage usageFor(std::size_t nodes) {
        SimulatedHost::Node node = SimulatedHost::plausibleNode();
        node.properties[VA::NodeLexicon::Name] = std::string("Linux");
        host->clearNodes();
        host->addNodes(node, nodes);
        allocations::measure();
        answer(nodes);
        return allocations::measured();
    }

  private:
    void answer(std::size_t nodes) {
        OperationRequest request;
        request.operation = GetParam().operation;
        request.path = GetParam().path;
        request.assocClass = GetParam().assocClass;
        const Outcome outcome = invoke(request);
        EXPECT_EQ(outcome.rc, CMPI_RC_OK);
        EXPECT_EQ(outcome.paths.size() + outcome.instances.size(), nodes);
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

std::string nameOfRow(const testing::TestParamInfo<Row>& info) {
    return info.param.name;
}

INSTANTIATE_TEST_SUITE_P(Of, PeakMemory, testing::ValuesIn(rows), nameOfRow);

}  // namespace
