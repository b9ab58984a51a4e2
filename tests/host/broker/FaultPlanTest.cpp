// Faults on demand have to hit the planned call and no other: the fault tests of the libraries
// count on it.
#include "host/broker/FaultPlan.h"

#include "BrokerFixture.h"

#include "host/broker/ResultCollector.h"
#include "support/ComputerSystemService.h"

#include <algorithm>
#include <atomic>
#include <thread>

namespace cmpihost {
namespace {

class Faults : public BrokerTest {
  protected:
    Faults() { broker.setFaultPlan(&plan); }
    ~Faults() override { broker.setFaultPlan(nullptr); }

    FaultPlan plan;
};

TEST_F(Faults, CallsOfTheProviderAreCountedByEntryAndTable) {
    EXPECT_NE(request.makePath({"root", "TEST_Thing"}), nullptr);
    CMPIInstance* const instance = newInstance();
    CMSetProperty(instance, "A", "x", CMPI_chars);
    CMSetProperty(instance, "B", "x", CMPI_chars);
    CBSetProperty(mb, request.makeContext({}, ""), newPath(), "A", "x", CMPI_chars);
    EXPECT_EQ(plan.calls("setProperty"), 3u);
    EXPECT_EQ(plan.calls("CMPIInstanceFT.setProperty"), 2u);
    EXPECT_EQ(plan.calls("CMPIBrokerFT.setProperty"), 1u);
    EXPECT_EQ(plan.calls("Property"), 0u);
    EXPECT_EQ(plan.calls(), 6u);
    EXPECT_EQ(plan.callsByEntry().at("CMPIBrokerEncFT.newObjectPath"), 2u);
    EXPECT_EQ(plan.fired(), 0u);
}

TEST_F(Faults, AFaultBeginsWithItsNthCallAndLastsForOneForSeveralOrForEver) {
    // Which of six calls fail.
    const std::pair<Fault, const char*> rows[] = {
        {{"newObjectPath", 2, 1, CMPI_RC_ERR_ACCESS_DENIED}, "-x----"},
        {{"newObjectPath", 1, 1}, "x-----"},
        {{"newObjectPath", 2, 2}, "-xx---"},
        {{"newObjectPath", 3, 0}, "--xxxx"}};
    for (const auto& [fault, expected] : rows) {
        plan.clear();
        EXPECT_EQ(plan.calls() + plan.fired(), 0u);
        plan.add(fault);
        std::string calls;
        for (int i = 0; i < 6; ++i) {
            calls += newPath() == nullptr ? 'x' : '-';
            EXPECT_EQ(status.rc, calls.back() == 'x' ? fault.rc : CMPI_RC_OK) << expected;
        }
        EXPECT_EQ(calls, expected);
        EXPECT_EQ(plan.fired(), static_cast<unsigned>(std::count(calls.begin(), calls.end(), 'x')));
    }
}

TEST_F(Faults, AnyEntryMayBeMeant) {
    plan.add({"", 3});
    CMPIObjectPath* const path = newPath();
    EXPECT_EQ(CMAddKey(path, "Name", "x", CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(shown(CMGetKey(path, "Name", &status)), "bad");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(CMGetKeyCount(path, &status), 1u);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(Faults, ACallMayReturnNullAndReportSuccess) {
    plan.add({"newInstance", 1, 1, CMPI_RC_OK});
    plan.add({"addKey", 1, 1, CMPI_RC_OK});
    EXPECT_EQ(newInstance(), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(CMAddKey(newPath(), "Name", "x", CMPI_chars).rc, CMPI_RC_ERR_FAILED);
}

TEST_F(Faults, ACallMayHandItsValueOutBesideAFailure) {
    ComputerSystemService computers(std::string("host1"));
    broker.route(ComputerSystemService::className, computers);
    for (const char* entry : {"enumerateInstances", "getNext", "getObjectPath", "addKey", "getKey",
                              "getMessage", "freeInstance"})
        plan.add({entry, 1, 1, CMPI_RC_ERR_ACCESS_DENIED, true});
    const auto deniedBeside = [this](const auto& value) {
        EXPECT_EQ(status.rc, CMPI_RC_ERR_ACCESS_DENIED);
        return value;
    };

    const CMPIContext* const context = request.makeContext({}, "");
    const CMPIEnumeration* const found = deniedBeside(
        CBEnumInstances(mb, context, newPath(ComputerSystemService::className), nullptr, &status));
    ASSERT_NE(found, nullptr);
    const CMPIData next = deniedBeside(CMGetNext(found, &status));
    ASSERT_EQ(next.type, CMPI_instance);
    EXPECT_FALSE(CMHasNext(found, &status));
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    CMPIObjectPath* const path = deniedBeside(CMGetObjectPath(next.value.inst, &status));
    ASSERT_NE(path, nullptr);
    EXPECT_EQ(CMAddKey(path, "Extra", "x", CMPI_chars).rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(shown(deniedBeside(CMGetKey(path, "Extra", &status))), "key string x");
    EXPECT_EQ(textOf(deniedBeside(mb->eft->getMessage(mb, "", "text", &status, 0))), "text");
    mb->mft->freeInstance(mb, next.value.inst);
    EXPECT_EQ(plan.fired(), 7u);
    EXPECT_EQ(CMGetPropertyCount(next.value.inst, &status), 0u);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(Faults, EveryShapeOfResultCanFail) {
    CMPIString* const string = CMNewString(mb, "x", nullptr);
    CMPIObjectPath* const path = newPath();
    ResultCollector collector(request);
    plan.add({"", 1, 0, CMPI_RC_ERR_FAILED});
    EXPECT_EQ(CMGetCharsPtr(string, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(CMGetKeyCount(path, &status), 0u);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(CMClone(path, &status), nullptr);
    EXPECT_EQ(CMGetClassName(path, nullptr), nullptr);
    EXPECT_FALSE(CDIsOfType(mb, path, "CMPIObjectPath", &status));
    EXPECT_EQ(mb->eft->getMessage(mb, "", "text", &status, 0), nullptr);
    EXPECT_EQ(CMReturnObjectPath(collector.cmpi(), path).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(CMReturnDone(collector.cmpi()).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(mb->mft->cmpiMalloc(mb, 1), nullptr);
    mb->mft->freeObjectPath(mb, path);
    EXPECT_EQ(mb->xft->newMutex(0), nullptr);
    EXPECT_EQ(CBEnumInstances(mb, nullptr, nullptr, nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);

    broker.setFaultPlan(nullptr);
    EXPECT_EQ(CMGetKeyCount(path, &status), 0u);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(collector.take().doneCount, 0u);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(Faults, ExactlyOneOfTheCallsOfAllThreadsIsTheNth) {
    plan.add({"newObjectPath", 100});
    std::atomic<int> failures{0};
    std::vector<std::thread> threads;
    for (int t = 0; t < 4; ++t) {
        threads.emplace_back([&] {
            RequestScope own(broker);
            for (int i = 0; i < 50; ++i) {
                if (CMNewObjectPath(mb, "root", "TEST_Thing", nullptr) == nullptr) ++failures;
            }
        });
    }
    for (std::thread& thread : threads) thread.join();
    EXPECT_EQ(failures, 1);
    EXPECT_EQ(plan.calls("newObjectPath"), 200u);
}

}  // namespace
}  // namespace cmpihost
