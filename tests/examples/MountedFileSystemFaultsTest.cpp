// The example in a broker whose n-th call fails, or gives null, n counted up until none fails any
// more.
#include <cstdlib>

#include "faults/CountUp.h"
#include "host/broker/Broker.h"
#include "host/broker/Invoke.h"
#include "host/broker/ProviderLibrary.h"
#include "support/ComputerSystemService.h"

namespace {

using namespace cmpihost;

constexpr const char* nameSpace = "root/cimv2";

ObjectPathValue computer() {
    return {nameSpace,
            ComputerSystemService::className,
            {{"CreationClassName", ComputerSystemService::className}, {"Name", "host1"}}};
}

ObjectPathValue fileSystem() {
    return {nameSpace,
            "EXAMPLE_MountedFileSystem",
            {{"CSCreationClassName", ComputerSystemService::className},
             {"CSName", "host1"},
             {"CreationClassName", "EXAMPLE_MountedFileSystem"},
             {"Name", "/srv/old"}}};
}

OperationRequest request(Operation operation, ObjectPathValue path) {
    OperationRequest result;
    result.operation = operation;
    result.path = std::move(path);
    return result;
}

std::vector<OperationRequest> requests() {
    const ObjectPathValue hosted = {nameSpace,
                                    "EXAMPLE_HostedFileSystem",
                                    {{"GroupComponent", Value::fromReference(computer())},
                                     {"PartComponent", Value::fromReference(fileSystem())}}};
    std::vector<OperationRequest> result = {
        request(Operation::EnumerateInstanceNames, fileSystem()),
        request(Operation::EnumerateInstances, fileSystem()),
        request(Operation::GetInstance, fileSystem()),
        request(Operation::GetInstance, hosted),
        request(Operation::Associators, computer()),
        request(Operation::Associators, fileSystem()),
        request(Operation::AssociatorNames, fileSystem()),
        request(Operation::References, computer()),
        request(Operation::ReferenceNames, fileSystem()),
        request(Operation::DeleteInstance, fileSystem()),
    };
    result[1].properties = {{"Device"}};
    result[6].assocClass = "EXAMPLE_HostedFileSystem";
    return result;
}

bool sameAnswer(const Outcome& left, const Outcome& right) {
    return left.rc == right.rc && left.paths == right.paths && left.instances == right.instances;
}

// Whatever fails, the client is told, or gets the whole answer: never a wrong one that looks right.
void expectToldOrWhole(const BrokerOptions& options, CMPIrc rc) {
    ::setenv("EXAMPLE_ROOT", KORVA_SOURCE_DIR "/examples/mounted-filesystems/tests/root", 1);
    Broker broker(nullptr, options);
    ComputerSystemService computerSystems("host1");
    broker.route(ComputerSystemService::className, computerSystems);
    LoadOptions load;
    load.providerName = "MountedFileSystemProvider";
    const ProviderLibrary library(KORVA_EXAMPLE, broker, load);
    for (const OperationRequest& each : requests()) {
        SCOPED_TRACE(operationName(each.operation));
        const Outcome whole = invoke(library, broker, each);
        EXPECT_EQ(whole.paths.empty() && whole.instances.empty(),
                  each.operation == Operation::DeleteInstance);
        countUp("call", [&](std::size_t n) {
            FaultPlan plan({{}, static_cast<unsigned>(n), 1, rc});
            broker.setFaultPlan(&plan);
            const Outcome outcome = invoke(library, broker, each);
            broker.setFaultPlan(nullptr);
            const std::string fired = plan.fired() > 0 ? plan.firedCalls().front() : "none";
            // A no is an answer: nobody can see that it was meant to be a yes.
            const bool isNo = rc == CMPI_RC_OK && fired == "CMPIBrokerEncFT.classPathIsA";
            EXPECT_TRUE(isNo || outcome.rc != CMPI_RC_OK || sameAnswer(outcome, whole)) << fired;
            EXPECT_EQ(outcome.violations, std::vector<std::string>()) << fired;
            return plan.fired() > 0;
        });
    }
}

TEST(MountedFileSystemFaults, CallThatFailsIsTold) {
    expectToldOrWhole({}, CMPI_RC_ERR_FAILED);
    expectToldOrWhole(BrokerOptions::sparse(), CMPI_RC_ERR_FAILED);
}

TEST(MountedFileSystemFaults, NullThatPassesForSuccessIsTold) {
    expectToldOrWhole({}, CMPI_RC_OK);
    expectToldOrWhole(BrokerOptions::sparse(), CMPI_RC_OK);
}

}  // namespace
