#include "host/server/Interop.h"

#include <gtest/gtest.h>

namespace cmpihost::server {
namespace {

OperationRequest interopRequest(Operation operation, const std::string& className) {
    OperationRequest request;
    request.operation = operation;
    request.path.nameSpace = "root/interop";
    request.path.className = className;
    return request;
}

class TheInteropNamespace : public testing::Test {
  protected:
    std::vector<std::string> paths(const std::string& className) const {
        std::vector<std::string> texts;
        const OperationRequest request =
            interopRequest(Operation::EnumerateInstanceNames, className);
        for (const ObjectPathValue& path : interop_.ask(request).paths)
            texts.push_back(toString(path));
        return texts;
    }

    Statistics statistics_;
    const Interop interop_{"vm", {"root/cimv2", "root/interop"}, statistics_};
};

TEST_F(TheInteropNamespace, HasOneObjectManager) {
    const std::vector<std::string> one = {
        "root/interop:KORVA_ObjectManager.SystemCreationClassName=\"KORVA_ComputerSystem\","
        "SystemName=\"vm\",CreationClassName=\"KORVA_ObjectManager\",Name=\"cmpihost\""};
    EXPECT_EQ(paths("CIM_ObjectManager"), one);
}

}  // namespace
}  // namespace cmpihost::server
