#include "host/broker/ResultCollector.h"
#include "library/AssociationsFixture.h"

// Associations under a broker whose calls fail.

namespace {

using namespace associations;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

class BrokerFaults : public Associations {
  protected:
    // The records of an enumeration of instances in which no instance can be made.
    std::string recordsWithoutInstance(const Association& association, CMPIrc rc) {
        populate(3, 3);
        FaultPlan plan(Fault{"newInstance", 1, 0, rc});
        broker.setFaultPlan(&plan);
        recording::clear();
        const Outcome outcome = enumerate(association.className);
        broker.setFaultPlan(nullptr);
        EXPECT_EQ(outcome.rc, CMPI_RC_OK);
        EXPECT_THAT(outcome.instances, IsEmpty());
        EXPECT_EQ(outcome.doneCount, 1U);
        // The walk ends with the first.
        EXPECT_EQ(plan.fired(), 1U);
        return recording::takeRendered();
    }
};

TEST_F(BrokerFaults, InstanceThatTheBrokerDoesNotMakeEndsTheEnumeration) {
    for (const CMPIrc rc : {CMPI_RC_OK, CMPI_RC_ERR_FAILED}) {
        EXPECT_THAT(recordsWithoutInstance(installed, rc),
                    HasSubstr("EXITING: getCMPIInstance() in CMPIInstalledOS.cpp"));
        EXPECT_THAT(recordsWithoutInstance(running, rc),
                    HasSubstr("EXITING: getCMPIInstance() in CMPIRunningOS.cpp"));
        // The capabilities' association leaves without that record.
        const std::string records = recordsWithoutInstance(capabilities, rc);
        EXPECT_THAT(records,
                    HasSubstr("ENTERING: getCMPIInstance() in CMPIElementCapabilities.cpp"));
        EXPECT_THAT(records, Not(HasSubstr("EXITING: getCMPIInstance() in")));
    }
}

TEST_F(BrokerFaults, NodeWithoutANameHasNoPairWithCapabilities) {
    host->clearNodes();
    host->addNode({});
    EXPECT_THAT(pairs(capabilities, "Could not find 'Name' Key in Moniker"), IsEmpty());
    EXPECT_THAT(gotten(path("KORVA_OSElementCapabilities"), capabilities,
                       "Could not find 'Name' Key in Moniker"),
                IsEmpty());
}

TEST_F(BrokerFaults, FailingResultStillReceivesEveryFarEndAndOneDone) {
    populate(3, 4);
    struct Case {
        ObjectPathValue source;
        Association association;
    };
    const Case cases[] = {{computerSystemPath("host1"), installed},
                          {computerSystemPath("host1"), running},
                          {operatingSystemPath("host1", "os1"), installed},
                          {operatingSystemPath("host1", "os1"), running},
                          {operatingSystemPath("host1", "os1"), capabilities},
                          {path("KORVA_OperatingSystemCapabilities"), capabilities}};
    for (const Case& each : cases) {
        OperationRequest request;
        request.path = each.source;
        request.assocClass = each.association.className;
        request.operation = Operation::Associators;
        const Outcome instances = invoke(request, [](ResultCollector& collector) {
            collector.failReturnInstance(1, CMPI_RC_ERR_FAILED);
            collector.failReturnDone(1, CMPI_RC_ERR_FAILED);
        });
        EXPECT_EQ(instances.rc, CMPI_RC_OK);
        EXPECT_THAT(instances.instances, IsEmpty());
        EXPECT_EQ(instances.refusedInstances.size(), 3U) << toString(each.source);
        EXPECT_EQ(instances.doneCount, 1U);
        request.operation = Operation::AssociatorNames;
        const Outcome names = invoke(request, [](ResultCollector& collector) {
            collector.failReturnObjectPath(2, CMPI_RC_ERR_FAILED);
        });
        EXPECT_EQ(names.rc, CMPI_RC_OK);
        EXPECT_EQ(names.paths.size(), 1U);
        EXPECT_EQ(names.refusedPaths.size(), 2U) << toString(each.source);
        EXPECT_EQ(names.doneCount, 1U);
    }
}

// The handler and the adapter each ask for the class of the path; a broker that fails in between
// must not make the walk endless.
TEST_F(BrokerFaults, PathThatLosesItsClassOnTheWayEndsTheWalk) {
    for (const bool names : {false, true}) {
        FaultPlan plan(Fault{"getClassName", 2, 1, CMPI_RC_ERR_FAILED});
        broker.setFaultPlan(&plan);
        const Outcome outcome =
            names ? enumerateNames(capabilities.className) : enumerate(capabilities.className);
        broker.setFaultPlan(nullptr);
        EXPECT_EQ(plan.fired(), 1U);
        EXPECT_EQ(outcome.rc, CMPI_RC_OK);
        EXPECT_THAT(outcome.paths, IsEmpty());
        EXPECT_THAT(outcome.instances, IsEmpty());
        EXPECT_EQ(outcome.doneCount, 1U);
    }
}

}  // namespace
