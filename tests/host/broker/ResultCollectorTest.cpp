#include "host/broker/ResultCollector.h"

#include "BrokerFixture.h"

namespace cmpihost {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class Results : public BrokerTest {
  protected:
    ResultCollector collector{request};
    const CMPIResult* result = collector.cmpi();
};

TEST_F(Results, KeepWhatIsReturnedInOrder) {
    EXPECT_EQ(CMReturnObjectPath(result, newPath("TEST_A")).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnObjectPath(result, newPath("TEST_B")).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnInstance(result, newInstance("TEST_C")).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnDone(result).rc, CMPI_RC_OK);
    ASSERT_EQ(collector.pathCount(), 2u);
    EXPECT_EQ(collector.path(0).className, "TEST_A");
    EXPECT_EQ(collector.path(1).className, "TEST_B");
    ASSERT_EQ(collector.instanceCount(), 1u);
    EXPECT_EQ(collector.instance(0).path.className, "TEST_C");
    EXPECT_EQ(collector.doneCount(), 1u);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(Results, AreNotChangedByWhatTheProviderDoesLater) {
    CMPIInstance* const instance = newInstance();
    CMPIObjectPath* const path = newPath();
    CMReturnInstance(result, instance);
    CMReturnObjectPath(result, path);
    CMSetProperty(instance, "Later", "x", CMPI_chars);
    CMAddKey(path, "Later", "x", CMPI_chars);
    CMReturnInstance(result, instance);
    EXPECT_EQ(collector.instance(0).properties.size(), 0u);
    EXPECT_EQ(collector.instance(1).properties.size(), 1u);
    EXPECT_EQ(collector.path(0).keys.size(), 0u);
}

TEST_F(Results, OutliveTheRequest) {
    CMPIInstance* const instance = newInstance();
    CMSetProperty(instance, "Name", "a text that does not fit into a small string", CMPI_chars);
    CMReturnInstance(result, instance);
    CMReturnObjectPath(result, newPath());
    request.end();
    const std::vector<InstanceValue> instances = collector.takeInstances();
    ASSERT_EQ(instances.size(), 1u);
    EXPECT_EQ(instances[0].property("Name")->text(),
              "a text that does not fit into a small string");
    EXPECT_EQ(collector.takePaths().size(), 1u);
    EXPECT_EQ(collector.instanceCount(), 0u);
    EXPECT_EQ(collector.pathCount(), 0u);
}

TEST_F(Results, MayBeTakenWhileTheRequestIsOpen) {
    CMPIInstance* const instance = newInstance();
    CMSetProperty(instance, "Name", "x", CMPI_chars);
    CMReturnInstance(result, instance);
    EXPECT_EQ(collector.takeInstances().at(0).properties.size(), 1u);
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 1u);
}

TEST_F(Results, ANullObjectIsRefused) {
    EXPECT_EQ(CMReturnInstance(result, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(CMReturnObjectPath(result, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(collector.instanceCount() + collector.pathCount(), 0u);
    EXPECT_THAT(broker.violations(),
                ElementsAre("CMPIResultFT.returnInstance: null CMPIInstance",
                            "CMPIResultFT.returnObjectPath: null CMPIObjectPath"));
}

TEST_F(Results, NothingMayFollowReturnDone) {
    CMReturnDone(result);
    EXPECT_EQ(CMReturnInstance(result, newInstance()).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(CMReturnObjectPath(result, newPath()).rc, CMPI_RC_ERR_FAILED);
    const CMPIUint32 number = 1;
    EXPECT_EQ(CMReturnData(result, &number, CMPI_uint32).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(CMReturnDone(result).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(collector.instanceCount() + collector.pathCount() + collector.data().size(), 0u);
    EXPECT_EQ(collector.doneCount(), 2u);
    EXPECT_THAT(broker.violations(),
                ElementsAre("CMPIInstance of TEST_Thing returned after returnDone",
                            "CMPIObjectPath of TEST_Thing returned after returnDone",
                            "data returned after returnDone", "returnDone called twice"));
}

TEST_F(Results, TakeDataOfMethods) {
    const CMPIUint32 number = 5;
    EXPECT_EQ(CMReturnData(result, &number, CMPI_uint32).rc, CMPI_RC_OK);
    ASSERT_EQ(collector.data().size(), 1u);
    EXPECT_EQ(collector.data()[0], Value::fromUnsigned(5, CMPI_uint32));
}

TEST_F(Results, DoNotTakeErrors) {
    CMPIError stranger = {nullptr, nullptr};
    EXPECT_EQ(CMReturnError(result, &stranger).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(CMReturnError(result, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_THAT(broker.violations(),
                ElementsAre("CMPIResultFT.returnError: no CMPIError of this host",
                            "CMPIResultFT.returnError: null CMPIError"));
}

TEST_F(Results, CanBeMadeToRefuseInstancesFromTheSecondOn) {
    collector.failReturnInstance(2, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(CMReturnInstance(result, newInstance("TEST_A")).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnInstance(result, newInstance("TEST_B")).rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(CMReturnInstance(result, newInstance("TEST_C")).rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(CMReturnObjectPath(result, newPath()).rc, CMPI_RC_OK);
    EXPECT_EQ(collector.instanceCount(), 1u);
    const std::vector<InstanceValue> refused = collector.takeRefusedInstances();
    ASSERT_EQ(refused.size(), 2u);
    EXPECT_EQ(refused[0].path.className, "TEST_B");
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(Results, CanBeMadeToRefusePathsAndTheEnd) {
    collector.failReturnObjectPath(1, CMPI_RC_ERR_FAILED);
    collector.failReturnDone(1, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(CMReturnObjectPath(result, newPath()).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(CMReturnDone(result).rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(collector.pathCount(), 0u);
    EXPECT_EQ(collector.takeRefusedPaths().size(), 1u);
    EXPECT_EQ(collector.doneCount(), 1u);
}

}  // namespace
}  // namespace cmpihost
