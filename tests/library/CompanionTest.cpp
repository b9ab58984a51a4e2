// The companion is the other end of every association where no other provider serves computer
// systems.
#include <stdexcept>

#include "framework/instrumentation/HostSource.h"
#include "library/LibraryFixture.h"

namespace {

using namespace cmpihost;
using testing::ElementsAre;
using testing::IsEmpty;

/// The built companion under a strict broker with the schema, on a simulated computer "host1".
class Companion : public testing::Test {
  protected:
    Companion() {
        host->setComputerName("host1");
        VA::setHostSource(host);
    }
    ~Companion() override { VA::setHostSource(nullptr); }
    void TearDown() override { EXPECT_THAT(broker.takeViolations(), IsEmpty()); }

    Outcome run(Operation operation, const ObjectPathValue& asked) {
        return invoke(library, broker, requestFor(operation, asked));
    }

    std::shared_ptr<VA::SimulatedHost> host = std::make_shared<VA::SimulatedHost>();
    Broker broker{&schemaCatalogue()};
    ProviderLibrary library{KORVA_BINARY_DIR "/lib/libkorvacomputersystemprovider.so.1",
                            broker,
                            {"ComputerSystemProvider", true, true, false}};
};

const std::string host1 =
    "root/cimv2:KORVA_ComputerSystem.CreationClassName=\"KORVA_ComputerSystem\",Name=\"host1\"";

TEST_F(Companion, ServesTheOneComputerSystemByTheFrameworksName) {
    const Outcome names = run(Operation::EnumerateInstanceNames, path("KORVA_ComputerSystem"));
    expectDone(names);
    EXPECT_THAT(texts(names.paths), ElementsAre(host1));
    const Outcome instances = run(Operation::EnumerateInstances, path("KORVA_ComputerSystem"));
    EXPECT_EQ(instances.doneCount, 1U);
    ASSERT_EQ(instances.instances.size(), 1U);
    std::string properties;
    for (const PropertyValue& property : instances.instances[0].properties)
        properties += property.name + "=" + property.value.toText() + ";";
    EXPECT_EQ(
        properties,
        "CreationClassName=KORVA_ComputerSystem;Name=host1;ElementName=host1;NameFormat=Other;");
}

TEST_F(Companion, GetsTheInstanceThatThePathNames) {
    EXPECT_THAT(texts(run(Operation::GetInstance, computerSystemPath("host1")).instances),
                ElementsAre(host1));
    EXPECT_THAT(texts(run(Operation::GetInstance, path("KORVA_ComputerSystem", {{"Name", "host1"}}))
                          .instances),
                ElementsAre(host1));
    EXPECT_EQ(run(Operation::GetInstance, computerSystemPath("host2")).rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(run(Operation::GetInstance,
                  path("KORVA_ComputerSystem", {{"Name", "host1"}, {"CreationClassName", "x"}}))
                  .rc,
              CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(run(Operation::GetInstance, path("KORVA_ComputerSystem")).rc, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(Companion, ServesTheOneWhateverTheEnvironmentHolds) {
    setenv("KORVA_COMPUTER_SYSTEMS", "3", 1);
    const Outcome names = run(Operation::EnumerateInstanceNames, path("KORVA_ComputerSystem"));
    unsetenv("KORVA_COMPUTER_SYSTEMS");
    EXPECT_THAT(texts(names.paths), ElementsAre(host1));
}

TEST_F(Companion, WithoutAComputerNameServesNone) {
    host->setComputerName(std::nullopt);
    const Outcome outcome = run(Operation::EnumerateInstances, path("KORVA_ComputerSystem"));
    expectDone(outcome);
    EXPECT_THAT(outcome.instances, IsEmpty());
}

TEST_F(Companion, RefusesToWriteAndToQuery) {
    for (const Operation operation : {Operation::CreateInstance, Operation::ModifyInstance,
                                      Operation::DeleteInstance, Operation::ExecQuery})
        EXPECT_EQ(run(operation, computerSystemPath("host1")).rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(Companion, FailsCleanlyWhenBrokerOrHostDo) {
    for (const Operation operation : {Operation::EnumerateInstanceNames,
                                      Operation::EnumerateInstances, Operation::GetInstance}) {
        FaultPlan first(Fault{"newObjectPath", 1, 0, CMPI_RC_OK});
        broker.setFaultPlan(&first);
        EXPECT_EQ(run(operation, computerSystemPath("host1")).rc, CMPI_RC_ERR_FAILED);
        broker.setFaultPlan(nullptr);
        host->throwFromCall(1, std::runtime_error("x"));
        EXPECT_EQ(run(operation, computerSystemPath("host1")).rc, CMPI_RC_ERR_FAILED);
        host->setHook({});
    }
}

}  // namespace
