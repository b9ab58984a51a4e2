// What the tables of both shapes of a broker hold, and the platform services among them.
#include "BrokerFixture.h"

#include "host/broker/FaultPlan.h"
#include "host/broker/ResultCollector.h"

#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <cstring>
#include <ctime>

namespace cmpihost {
namespace {

TEST(CompleteBroker, FillsEveryTableAtLevel200) {
    Broker broker;
    const CMPIBroker* const mb = broker.cmpi();
    EXPECT_EQ(mb->bft->brokerVersion, 200u);
    EXPECT_STREQ(mb->bft->brokerName, "cmpihost");
    EXPECT_EQ(mb->bft->brokerCapabilities & CMPI_MB_InstanceManipulation,
              static_cast<unsigned>(CMPI_MB_InstanceManipulation));
    EXPECT_EQ(mb->eft->ftVersion, 200);
    EXPECT_EQ(mb->xft->ftVersion, 200);
    ASSERT_NE(mb->mft, nullptr);
    EXPECT_EQ(mb->mft->ftVersion, 200);
    EXPECT_FALSE(CMIsNullObject(mb));
}

/// The function pointers of a table after its front, as far as they are null.
template <class Table>
std::size_t nullSlots(const Table& table, std::size_t front) {
    std::vector<const void*> words(sizeof(Table) / sizeof(void*));
    std::memcpy(words.data(), &table, sizeof(Table));
    const auto first = words.begin() + static_cast<std::ptrdiff_t>(front / sizeof(void*));
    return static_cast<std::size_t>(std::count(first, words.end(), nullptr));
}

/// How many slots of the table of an object are null.
template <class Edt>
std::size_t nullSlotsOf(const Edt* object) {
    return nullSlots(*object->ft, sizeof(void*));
}

TEST(CompleteBroker, LeavesNoSlotEmptyInLiveOrDeadObjects) {
    Broker broker;
    RequestScope request(broker);
    const CMPIBroker* const mb = broker.cmpi();
    EXPECT_EQ(nullSlots(*mb->bft, offsetof(CMPIBrokerFT, prepareAttachThread)), 0u);
    EXPECT_EQ(nullSlots(*mb->eft, sizeof(void*)), 0u);
    EXPECT_EQ(nullSlots(*mb->xft, sizeof(void*)), 0u);
    EXPECT_EQ(nullSlots(*mb->mft, sizeof(void*)), 0u);
    ResultCollector collector(request);
    CMPIObjectPath* const path = CMNewObjectPath(mb, "", "TEST_Thing", nullptr);
    CMPIInstance* const instance = CMNewInstance(mb, path, nullptr);
    CMPIString* const string = CMNewString(mb, "", nullptr);
    CMPIArray* const array = CMNewArray(mb, 0, CMPI_uint8, nullptr);
    CMPIArgs* const args = CMNewArgs(mb, nullptr);
    CMPIDateTime* const date = CMNewDateTime(mb, nullptr);
    CMPIContext* const context = request.makeContext({}, "");
    for (const bool dead : {false, true}) {
        EXPECT_EQ(nullSlotsOf(path), 0u) << dead;
        EXPECT_EQ(nullSlotsOf(instance), 0u) << dead;
        EXPECT_EQ(nullSlotsOf(string), 0u) << dead;
        EXPECT_EQ(nullSlotsOf(array), 0u) << dead;
        EXPECT_EQ(nullSlotsOf(args), 0u) << dead;
        EXPECT_EQ(nullSlotsOf(date), 0u) << dead;
        EXPECT_EQ(nullSlotsOf(context), 0u) << dead;
        EXPECT_EQ(nullSlotsOf(collector.cmpi()), 0u) << dead;
        request.end();
    }
}

class SparseBroker : public ::testing::Test {
  protected:
    Broker broker{nullptr, BrokerOptions::sparse()};
    RequestScope request{broker};
    const CMPIBroker* mb = broker.cmpi();
    CMPIObjectPath* path = CMNewObjectPath(mb, "", "TEST_Thing", nullptr);
};

TEST_F(SparseBroker, AnnouncesLowVersionsAndLacksJustWhatMayBeMissing) {
    EXPECT_EQ(mb->bft->brokerVersion, 0u);
    EXPECT_EQ(mb->eft->ftVersion, 1);
    EXPECT_EQ(mb->xft->ftVersion, 200);
    EXPECT_EQ(path->ft->ftVersion, 1);
    EXPECT_EQ(mb->mft, nullptr);

    CMPIBrokerEncFT* const eft = mb->eft;
    EXPECT_FALSE(eft->newCMPIError || eft->openMessageFile || eft->closeMessageFile ||
                 eft->getMessage2);
    EXPECT_EQ(nullSlots(*eft, sizeof(void*)), 4u);
    CMPIBrokerExtFT* const xft = mb->xft;
    EXPECT_FALSE(xft->joinThread || xft->exitThread || xft->cancelThread || xft->threadSleep ||
                 xft->signalCondition);
    EXPECT_EQ(nullSlots(*xft, sizeof(void*)), 5u);
    CMPIObjectPathFT* const ft = path->ft;
    EXPECT_FALSE(ft->getClassQualifier || ft->getPropertyQualifier || ft->getMethodQualifier ||
                 ft->getParameterQualifier);
    EXPECT_EQ(nullSlotsOf(path), 4u);
    CMPIInstance* const instance = CMNewInstance(mb, path, nullptr);
    EXPECT_FALSE(instance->ft->setPropertyWithOrigin);
    EXPECT_EQ(nullSlotsOf(instance), 1u);
    ResultCollector collector(request);
    EXPECT_FALSE(collector.cmpi()->ft->returnError);
    EXPECT_EQ(nullSlotsOf(collector.cmpi()), 1u);
}

TEST_F(SparseBroker, TellsKeysAndMissingItemsInItsOwnWay) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    EXPECT_EQ(shown(CMGetKey(path, "Name", &status)), "missing");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    CMAddKey(path, "Name", "x", CMPI_chars);
    EXPECT_EQ(shown(CMGetKey(path, "Name", &status)), "string x");
    EXPECT_EQ(valueOf(CMNewInstance(mb, path, nullptr)).properties.size(), 1u);
    EXPECT_EQ(valueOf(CMNewInstance(mb, path, nullptr)).property("Name")->text(), "x");
    const CMPIContext* const context = request.makeContext({}, "root");
    EXPECT_EQ(CMGetContextEntryCount(context, nullptr), 2u);
    EXPECT_EQ(shown(CMGetContextEntry(context, "CMPIInitNameSpace", &status)), "missing");
}

TEST_F(SparseBroker, SharesObjectsWithACompleteOneAndRecognisesDeadOnes) {
    Broker complete;
    {
        RequestScope other(complete);
        CMPIInstance* const instance = CMNewInstance(complete.cmpi(), path, nullptr);
        ASSERT_NE(instance, nullptr);
        EXPECT_EQ(valueOf(instance).path.className, "TEST_Thing");
    }
    EXPECT_THAT(complete.violations(), IsEmpty());
    request.end();
    CMGetKeyCount(path, nullptr);
    EXPECT_EQ(broker.violations().size(), 1u);
}

class ThreadTable : public ::testing::Test {
  protected:
    Broker broker;
    CMPIBrokerExtFT* xft = broker.cmpi()->xft;

    /// What a thread that runs `start` leaves behind.
    void* resultOf(void* (*start)(void*), void* parm, bool cancel = false) {
        void* const thread = xft->newThread(start, parm, 0);
        if (cancel) {
            EXPECT_EQ(xft->cancelThread(thread), 0);
        }
        void* result = nullptr;
        EXPECT_EQ(xft->joinThread(thread, &result), 0);
        return result;
    }
};

struct Shared {
    CMPIBrokerExtFT* xft;
    void* mutex;
    void* condition;
    int value;
};

void* raiseValue(void* parm) {
    auto* const shared = static_cast<Shared*>(parm);
    shared->xft->lockMutex(shared->mutex);
    shared->value = 5;
    shared->xft->signalCondition(shared->condition);
    shared->xft->unlockMutex(shared->mutex);
    return shared;
}

TEST_F(ThreadTable, ThreadsMeetAtAConditionAndAreJoined) {
    Shared shared = {xft, xft->newMutex(0), xft->newCondition(0), 0};
    xft->lockMutex(shared.mutex);
    timespec past{};
    EXPECT_EQ(xft->timedCondWait(shared.condition, shared.mutex, &past), ETIMEDOUT);
    void* const thread = xft->newThread(raiseValue, &shared, 0);
    ASSERT_NE(thread, nullptr);
    while (shared.value == 0) xft->condWait(shared.condition, shared.mutex);
    xft->unlockMutex(shared.mutex);
    void* result = nullptr;
    EXPECT_EQ(xft->joinThread(thread, &result), 0);
    EXPECT_EQ(result, &shared);
    for (void* const each : {shared.condition, static_cast<void*>(nullptr)})
        xft->destroyCondition(each);
    for (void* const each : {shared.mutex, static_cast<void*>(nullptr)}) xft->destroyMutex(each);
}

void* leaveEarly(void* parm) {
    static_cast<CMPIBrokerExtFT*>(parm)->exitThread(parm);
    return nullptr;
}

void* waitForEver(void* parm) {
    for (;;) pause();
    return parm;
}

TEST_F(ThreadTable, AThreadMayLeaveEarlyOrBeCancelled) {
    EXPECT_EQ(resultOf(leaveEarly, xft), xft);
    EXPECT_NE(resultOf(waitForEver, xft, true), xft);
}

TEST_F(ThreadTable, SleepingTakesItsMilliseconds) {
    const auto before = std::chrono::steady_clock::now();
    EXPECT_EQ(xft->threadSleep(20), 0);
    EXPECT_GE(std::chrono::steady_clock::now() - before, std::chrono::milliseconds(20));
}

int timesInitialised = 0;
void initialise() {
    ++timesInitialised;
}

TEST_F(ThreadTable, InitialisesOnce) {
    int once = 0;
    EXPECT_EQ(xft->threadOnce(&once, initialise), 0);
    EXPECT_EQ(xft->threadOnce(&once, initialise), 0);
    EXPECT_EQ(timesInitialised, 1);
}

TEST_F(ThreadTable, KeepsDataOfAThread) {
    unsigned long key = ~0ul;
    int data = 0;
    EXPECT_EQ(xft->createThreadKey(&key, nullptr), 0);
    EXPECT_EQ(xft->getThreadSpecific(key), nullptr);
    EXPECT_EQ(xft->setThreadSpecific(key, &data), 0);
    EXPECT_EQ(xft->getThreadSpecific(key), &data);
    EXPECT_EQ(xft->destroyThreadKey(key), 0);
}

TEST_F(ThreadTable, SpellsTheFileOfALibrary) {
    char* const file = xft->resolveFileName("thing");
    EXPECT_STREQ(file, "libthing.so");
    free(file);
    EXPECT_EQ(xft->resolveFileName(nullptr), nullptr);
}

TEST_F(ThreadTable, CallsOfARequestCountForItsFaults) {
    FaultPlan plan({"newThread", 1});
    broker.setFaultPlan(&plan);
    RequestScope request(broker);
    EXPECT_EQ(xft->newThread(leaveEarly, xft, 0), nullptr);
    void* const mutex = xft->newMutex(0);
    xft->lockMutex(mutex);
    xft->unlockMutex(mutex);
    xft->destroyMutex(mutex);
    xft->destroyCondition(nullptr);
    EXPECT_EQ(plan.calls("CMPIBrokerExtFT.lockMutex"), 1u);
    EXPECT_EQ(plan.calls(), 6u);
    broker.setFaultPlan(nullptr);
}

}  // namespace
}  // namespace cmpihost
