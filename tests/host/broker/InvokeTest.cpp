#include "host/broker/Invoke.h"

#include "BrokerFixture.h"

#include "host/broker/ResultCollector.h"

#include <atomic>
#include <thread>

namespace cmpihost {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class Invocation : public ::testing::Test {
  protected:
    Broker broker;
    ProviderLibrary library{KORVA_BINARY_DIR "/lib/libbroker_test_good.so", broker, {"Good"}};

    static OperationRequest request(Operation operation, std::vector<KeyBinding> keys = {}) {
        OperationRequest result;
        result.operation = operation;
        result.path = {"root/cimv2", "TEST_Thing", std::move(keys)};
        return result;
    }
    Outcome run(const OperationRequest& given, const CollectorSetup& setup = {}) {
        return invoke(library, broker, given, setup);
    }
    std::string property(const Outcome& outcome, const char* name) {
        const Value* const value = outcome.instances.at(0).property(name);
        return value == nullptr ? "(absent)" : value->toText();
    }
};

TEST_F(Invocation, CollectsPathsInstancesAndTheEnd) {
    const Outcome names = run(request(Operation::EnumerateInstanceNames));
    EXPECT_EQ(names.rc, CMPI_RC_OK);
    EXPECT_FALSE(names.message);
    EXPECT_EQ(names.doneCount, 1u);
    ASSERT_EQ(names.paths.size(), 2u);
    EXPECT_EQ(toString(names.paths[0]), "root/cimv2:TEST_Thing.Name=\"one\"");
    EXPECT_THAT(names.violations, IsEmpty());

    const Outcome instances = run(request(Operation::EnumerateInstances));
    ASSERT_EQ(instances.instances.size(), 2u);
    EXPECT_EQ(property(instances, "Name"), "one");
    EXPECT_EQ(property(instances, "Properties"), "(null)");
}

TEST_F(Invocation, HandsThePropertyListOver) {
    OperationRequest given = request(Operation::EnumerateInstances);
    given.properties = {{"A", "B"}};
    EXPECT_EQ(property(run(given), "Properties"), "AB");
    given.properties = std::vector<std::string>{};
    EXPECT_EQ(property(run(given), "Properties"), "");
}

TEST_F(Invocation, KeysArriveWithTheirTypes) {
    const auto typeOf = [this](const Value& key) {
        return property(run(request(Operation::GetInstance, {{"Name", key}})), "KeyType");
    };
    EXPECT_EQ(typeOf("text"), std::to_string(CMPI_string));
    EXPECT_EQ(typeOf(Value::fromText("text", CMPI_chars)), std::to_string(CMPI_chars));
    EXPECT_EQ(typeOf(Value::fromUnsigned(5)), std::to_string(CMPI_uint64));
    EXPECT_EQ(typeOf(Value::fromBoolean(true)), std::to_string(CMPI_boolean));
    EXPECT_EQ(typeOf(Value::fromReference({"", "TEST_Other"})), std::to_string(CMPI_ref));
}

TEST_F(Invocation, TheContextTellsAboutTheRequest) {
    OperationRequest given = request(Operation::GetInstance);
    Outcome outcome = run(given);
    EXPECT_EQ(property(outcome, "Flags"), "0");
    EXPECT_EQ(property(outcome, "CMPIPrincipal"), "(none)");
    EXPECT_EQ(property(outcome, "CMPIRole"), "(none)");
    EXPECT_EQ(property(outcome, "CMPIInitNameSpace"), "root/cimv2");

    given.context = {CMPI_FLAG_LocalOnly, "operator", "admin"};
    outcome = run(given);
    EXPECT_EQ(property(outcome, "Flags"), "1");
    EXPECT_EQ(property(outcome, "CMPIPrincipal"), "operator");
    EXPECT_EQ(property(outcome, "CMPIRole"), "admin");
}

TEST_F(Invocation, WriteOperationsReachTheirSlots) {
    OperationRequest create = request(Operation::CreateInstance);
    create.instance = {{"root/cimv2", "TEST_Thing"}, {{"Name", "new"}}};
    const Outcome created = run(create);
    ASSERT_EQ(created.paths.size(), 1u);
    EXPECT_EQ(toString(created.paths[0]), "root/cimv2:TEST_Thing.Name=\"new\"");

    EXPECT_EQ(run(request(Operation::ModifyInstance)).rc, CMPI_RC_ERR_ACCESS_DENIED);
    const Outcome deleted = run(request(Operation::DeleteInstance));
    EXPECT_EQ(deleted.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(deleted.message, "It has gone");
    EXPECT_EQ(deleted.doneCount, 0u);
}

TEST_F(Invocation, AssociationFiltersArriveAsGiven) {
    OperationRequest given = request(Operation::Associators);
    given.assocClass = "TEST_Link";
    given.resultRole = "Right";
    Outcome outcome = run(given);
    EXPECT_EQ(property(outcome, "AssocClass"), "TEST_Link");
    EXPECT_EQ(property(outcome, "ResultClass"), "(null)");
    EXPECT_EQ(property(outcome, "Role"), "(null)");
    EXPECT_EQ(property(outcome, "ResultRole"), "Right");

    given.operation = Operation::References;
    given.resultClass = "TEST_Link";
    given.role = "Left";
    outcome = run(given);
    EXPECT_EQ(property(outcome, "Name"), "references");
    EXPECT_EQ(property(outcome, "ResultClass"), "TEST_Link");
    EXPECT_EQ(property(outcome, "Role"), "Left");

    EXPECT_EQ(run(request(Operation::AssociatorNames)).paths.at(0).key("Name")->text(),
              "associatorNames");
    EXPECT_EQ(run(request(Operation::ReferenceNames)).paths.at(0).key("Name")->text(),
              "referenceNames");
}

TEST_F(Invocation, AnExceptionOfTheProviderGoesOnOnceTheRequestHasEnded) {
    OperationRequest given = request(Operation::ExecQuery);
    given.query = "SELECT * FROM TEST_Thing";
    try {
        run(given);
        FAIL() << "nothing was thrown";
    } catch (const std::runtime_error& error) {
        EXPECT_STREQ(error.what(), "SELECT * FROM TEST_Thing in WQL");
    }
    const std::size_t ended = broker.quarantined();
    EXPECT_GT(ended, 0u);
    EXPECT_EQ(run(request(Operation::EnumerateInstanceNames)).paths.size(), 2u);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(Invocation, TheCollectorCanBePreparedToRefuse) {
    const Outcome outcome = run(
        request(Operation::EnumerateInstances),
        [](ResultCollector& collector) { collector.failReturnInstance(2, CMPI_RC_ERR_FAILED); });
    EXPECT_EQ(outcome.instances.size(), 1u);
    ASSERT_EQ(outcome.refusedInstances.size(), 1u);
    EXPECT_EQ(outcome.refusedInstances[0].property("Name")->text(), "two");
    EXPECT_EQ(outcome.doneCount, 1u);
}

TEST_F(Invocation, TellsTheViolationsOfItsOwnRequestOnly) {
    const TestCatalogue catalogue = testClasses();
    Broker schooled(&catalogue);
    ProviderLibrary other(library.file(), schooled, {"Good"});
    const Outcome outcome = invoke(other, schooled, request(Operation::EnumerateInstances));
    EXPECT_THAT(outcome.violations, ElementsAre("TEST_Thing has no property Properties"));
    EXPECT_THAT(invoke(other, schooled, request(Operation::EnumerateInstanceNames)).violations,
                IsEmpty());
    EXPECT_EQ(schooled.violations().size(), 1u);
}

TEST_F(Invocation, AMissingInterfaceOrSlotIsNotSupported) {
    Outcome outcome =
        invoke(ManagementInterfaces{}, broker, request(Operation::EnumerateInstances));
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_THAT(outcome.violations, IsEmpty());
    EXPECT_EQ(invoke(ManagementInterfaces{}, broker, request(Operation::Associators)).rc,
              CMPI_RC_ERR_NOT_SUPPORTED);

    CMPIAssociationMIFT table{};
    CMPIAssociationMI mi = {nullptr, &table};
    outcome = invoke({nullptr, &mi}, broker, request(Operation::ReferenceNames));
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_THAT(outcome.violations, ElementsAre("no function for ReferenceNames"));
}

TEST_F(Invocation, RunsOnSeveralThreadsAtOnce) {
    std::vector<std::thread> threads;
    std::atomic<int> good{0};
    for (int t = 0; t < 4; ++t) {
        threads.emplace_back([&] {
            for (int round = 0; round < 50; ++round) {
                if (run(request(Operation::EnumerateInstances)).instances.size() == 2) ++good;
            }
        });
    }
    for (std::thread& thread : threads) thread.join();
    EXPECT_EQ(good, 200);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST(Operations, HaveTheNamesOfTheirKind) {
    EXPECT_STREQ(operationName(Operation::EnumerateInstances), "EnumerateInstances");
    EXPECT_STREQ(operationName(Operation::ReferenceNames), "ReferenceNames");
}

}  // namespace
}  // namespace cmpihost
