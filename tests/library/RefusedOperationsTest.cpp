#include "library/LibraryFixture.h"

namespace {

using namespace cmpihost;

class RefusedOperations : public LibraryFixture {
  protected:
    void expectRefusal(const CMPIStatus& status, const std::string& handler) {
        EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
        EXPECT_EQ(status.msg, nullptr);
        EXPECT_EQ(recording::takeRendered(),
                  "both " + handler +
                      " OperatingSystemProvider.cpp:# Zumbrel.OperatingSystemProvider 4000 null 0 "
                      "0 | METHOD: " +
                      handler + "() was invoked in OperatingSystemProvider.cpp [Line: #]\n");
    }
};

TEST_F(RefusedOperations, EachLeavesOneMethodRecordAndCallsNothingOnTheResult) {
    const std::pair<Operation, const char*> rows[] = {
        {Operation::CreateInstance, "OperatingSystem_CreateInstance"},
        {Operation::ModifyInstance, "OperatingSystem_ModifyInstance"},
        {Operation::DeleteInstance, "OperatingSystem_DeleteInstance"},
        {Operation::ExecQuery, "OperatingSystem_ExecQuery"},
        {Operation::References, "OperatingSystem_References"},
        {Operation::ReferenceNames, "OperatingSystem_ReferenceNames"},
    };
    FaultPlan calls;
    for (const auto& [operation, handler] : rows) {
        OperationRequest request;
        request.operation = operation;
        request.path = operatingSystemPath("host1", "Linux");
        request.instance.path = request.path;
        request.query = "SELECT * FROM KORVA_OperatingSystem";
        request.resultClass = "KORVA_RunningOS";
        calls.clear();
        broker.setFaultPlan(&calls);
        const Outcome outcome = invoke(request);
        broker.setFaultPlan(nullptr);
        EXPECT_EQ(outcome.rc, CMPI_RC_ERR_NOT_SUPPORTED) << handler;
        EXPECT_FALSE(outcome.message.has_value()) << handler;
        EXPECT_TRUE(outcome.paths.empty() && outcome.instances.empty()) << handler;
        EXPECT_EQ(outcome.doneCount, 0U) << handler;
        EXPECT_EQ(calls.calls(), 0U) << handler;
        expectRefusal({CMPI_RC_ERR_NOT_SUPPORTED, nullptr}, handler);
    }
}

TEST_F(RefusedOperations, ArgumentsAreNotLookedAt) {
    const CMPIInstanceMIFT& instance = *library.instanceMI()->ft;
    const CMPIAssociationMIFT& association = *library.associationMI()->ft;
    expectRefusal(instance.createInstance(nullptr, nullptr, nullptr, nullptr, nullptr),
                  "OperatingSystem_CreateInstance");
    expectRefusal(instance.modifyInstance(nullptr, nullptr, nullptr, nullptr, nullptr, nullptr),
                  "OperatingSystem_ModifyInstance");
    expectRefusal(instance.deleteInstance(nullptr, nullptr, nullptr, nullptr),
                  "OperatingSystem_DeleteInstance");
    expectRefusal(instance.execQuery(nullptr, nullptr, nullptr, nullptr, nullptr, nullptr),
                  "OperatingSystem_ExecQuery");
    expectRefusal(
        association.references(nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr),
        "OperatingSystem_References");
    expectRefusal(association.referenceNames(nullptr, nullptr, nullptr, nullptr, nullptr, nullptr),
                  "OperatingSystem_ReferenceNames");
}

}  // namespace
