#include "host/cli/Diagnostics.h"

#include <gtest/gtest.h>

namespace {

using namespace cmpihost;

TEST(StatusText, NamesTheStatus) {
    EXPECT_EQ(statusText(CMPI_RC_ERR_FAILED), "CIM_ERR_FAILED (1)");
    EXPECT_EQ(statusText(CMPI_RC_ERR_INVALID_CLASS), "CIM_ERR_INVALID_CLASS (5)");
    EXPECT_EQ(statusText(CMPI_RC_ERR_NOT_FOUND), "CIM_ERR_NOT_FOUND (6)");
    EXPECT_EQ(statusText(CMPI_RC_ERR_NOT_SUPPORTED), "CIM_ERR_NOT_SUPPORTED (7)");
    EXPECT_EQ(statusText(CMPI_RC_ERR_METHOD_NOT_FOUND), "CIM_ERR_METHOD_NOT_FOUND (17)");
    EXPECT_EQ(statusText(CMPI_RC_DO_NOT_UNLOAD), "CMPI_RC_DO_NOT_UNLOAD (50)");
    EXPECT_EQ(statusText(static_cast<CMPIrc>(150)), "CMPI status 150");
}

TEST(FailureText, NamesTheRequestAndLeavesOutControlCharacters) {
    OperationRequest request;
    request.operation = Operation::GetInstance;
    request.path = {"root/\n", "A\tB", {}};
    OperationResult result;
    result.rc = CMPI_RC_ERR_ACCESS_DENIED;
    EXPECT_EQ(failureText(request, result),
              "GetInstance of A\\tB in root/\\n: CIM_ERR_ACCESS_DENIED (2)");
    result.message = "go\x1b[31m away";
    request = {};
    request.operation = Operation::InvokeMethod;
    request.method = "Stop";
    request.path = {"ns", "Disk", {}};
    EXPECT_EQ(requestText(request), "InvokeMethod Stop of Disk in ns");
    request = {};
    request.operation = Operation::ExecQuery;
    request.path.nameSpace = "ns";
    EXPECT_EQ(failureText(request, result),
              "ExecQuery in ns: CIM_ERR_ACCESS_DENIED (2): go\\x1b[31m away");
}

TEST(MessageLines, BearTheNameOfTheProgramEach) {
    EXPECT_EQ(messageLines("one\n  two"), "cmpihost: one\ncmpihost:   two\n");
    EXPECT_EQ(noteLine("why"), "cmpihost: note: why\n");
}

}  // namespace
