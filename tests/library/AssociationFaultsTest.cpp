// Associations under a broker whose calls fail: a computer system that the broker does not deliver
// must end or thin out a walk, and never crash the object manager.
#include "library/AssociationsFixture.h"

namespace {

using namespace associations;
using testing::ElementsAre;
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
        expectDone(outcome);
        EXPECT_THAT(outcome.instances, IsEmpty());
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

/// Computer systems that the broker fails to deliver.
class ComputerSystems : public Associations {
  protected:
    // The pairs of an enumeration whose paths may lack a reference; checks that names and instances
    // agree.
    Texts pairsWithGaps(const Association& association) {
        recording::clear();
        const Outcome names = enumerateNames(association.className);
        expectEnd(names, "");
        Texts result;
        for (const ObjectPathValue& path : names.paths)
            result.push_back(brief(path.key(association.first)) + "+" +
                             brief(path.key(association.second)));
        const Outcome instances = enumerate(association.className);
        expectEnd(instances, "");
        EXPECT_EQ(pairsOf(instances, association), result);
        return result;
    }
};

TEST_F(ComputerSystems, FailedEnumerationOrFirstElementEndsWithAMessage) {
    computers.failEnumerations(CMPI_RC_ERR_FAILED);
    EXPECT_THAT(pairs(installed, noComputerSystem), IsEmpty());
    EXPECT_THAT(farEnds(operatingSystemPath("host1", "Linux"), running, noComputerSystem),
                IsEmpty());
    computers.failEnumerations(CMPI_RC_OK);
    computers.failAtNext(1);
    EXPECT_THAT(pairs(running, noComputerSystem), IsEmpty());
    EXPECT_THAT(farEnds(operatingSystemPath("host1", "Linux"), installed, noComputerSystem),
                IsEmpty());
}

TEST_F(ComputerSystems, FailedLaterElementEndsTheWalkOfTheOperatingSystemsEnd) {
    populate(1, 4);
    computers.failAtNext(2);
    // The element that failed is null: no further result, and done.
    EXPECT_THAT(farEnds(operatingSystemPath("host1", "os1"), running), ElementsAre("cs1"));
}

TEST_F(ComputerSystems, FailedLaterElementLeavesItsReferenceOut) {
    populate(3, 4);
    computers.failAtNext(2);
    // The element that failed comes with the next call.
    EXPECT_THAT(pairsWithGaps(installed), ElementsAre("cs1+os1", "(absent)+os2", "cs2+os3"));
    EXPECT_EQ(broker.takeViolations(),
              Texts(2, "path of KORVA_InstalledOS without key GroupComponent"));
    EXPECT_THAT(pairsWithGaps(running), ElementsAre("os1+cs1", "os2+(absent)", "os3+cs2"));
    EXPECT_EQ(broker.takeViolations(), Texts(2, "path of KORVA_RunningOS without key Dependent"));
}

TEST_F(ComputerSystems, StatusBesideTheirEnumerationEndsWithAMessage) {
    FaultPlan plan(Fault{"enumerateInstances", 1, 0, CMPI_RC_ERR_FAILED, true});
    broker.setFaultPlan(&plan);
    EXPECT_THAT(pairs(installed, noComputerSystem), IsEmpty());
    EXPECT_THAT(farEnds(operatingSystemPath("host1", "Linux"), running, noComputerSystem),
                IsEmpty());
    broker.setFaultPlan(nullptr);
    EXPECT_EQ(plan.fired(), 4U);
}

TEST_F(ComputerSystems, StatusBesideTheirPathLeavesTheirReferenceOut) {
    FaultPlan plan(Fault{"getObjectPath", 1, 0, CMPI_RC_ERR_FAILED, true});
    broker.setFaultPlan(&plan);
    EXPECT_THAT(pairsWithGaps(running), ElementsAre("Linux+(absent)"));
    broker.setFaultPlan(nullptr);
    EXPECT_EQ(broker.takeViolations(), Texts(2, "path of KORVA_RunningOS without key Dependent"));
}

TEST_F(ComputerSystems, AreDeliveredAsTheBrokerHasThem) {
    const Outcome outcome = associators(operatingSystemPath("host1", "Linux"), "KORVA_InstalledOS");
    ASSERT_EQ(outcome.instances.size(), 1U);
    EXPECT_EQ(toString(outcome.instances[0].path),
              "root/cimv2:KORVA_ComputerSystem.CreationClassName=\"KORVA_ComputerSystem\",Name="
              "\"host1\"");
}

TEST_F(ComputerSystems, WithoutAPathForThemTheBrokerIsNotAsked) {
    for (const CMPIrc rc : {CMPI_RC_OK, CMPI_RC_ERR_FAILED}) {
        FaultPlan plan(Fault{"newObjectPath", 1, 0, rc});
        broker.setFaultPlan(&plan);
        EXPECT_THAT(pairs(installed, noComputerSystem), IsEmpty());
        EXPECT_EQ(plan.calls("CMPIBrokerFT.enumerateInstances"), 0U);
        broker.setFaultPlan(nullptr);
    }
}

}  // namespace
