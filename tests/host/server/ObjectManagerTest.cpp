#include "host/server/ObjectManager.h"

#include <gmock/gmock.h>

#include "host/server/CimError.h"
#include "host/server/ServerFixture.h"

namespace cmpihost::server {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

OperationRequest enumeration(const std::string& className,
                             const std::string& nameSpace = "root/cimv2") {
    OperationRequest request;
    request.operation = Operation::EnumerateInstanceNames;
    request.path.nameSpace = nameSpace;
    request.path.className = className;
    return request;
}

std::vector<std::string> shown(const OperationResult& result) {
    std::vector<std::string> lines;
    for (const ObjectPathValue& path : result.paths) lines.push_back(toString(path));
    return lines;
}

TEST(ObjectManager, AsksTheShippedProviders) {
    ObjectManager& manager = fixture::shippedManager();
    EXPECT_THAT(shown(manager.ask(enumeration("cim_operatingsystem", "ROOT/cimv2"))),
                ElementsAre("root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_"
                            "ComputerSystem\",CSName=\"fixture.example\",CreationClassName="
                            "\"KORVA_OperatingSystem\",Name=\"Fixture Linux\""));
    EXPECT_THAT(manager.takeComplaints(), IsEmpty());
}

}  // namespace
}  // namespace cmpihost::server
