// The platform services of the broker.
#include "BrokerFixture.h"

#include "host/broker/FaultPlan.h"

#include <unistd.h>

#include <cerrno>
#include <ctime>

namespace cmpihost {
namespace {

class ThreadTable : public ::testing::Test {
  protected:
    Broker broker;
    CMPIBrokerExtFT* xft = broker.cmpi()->xft;
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
    void* const thread = xft->newThread(raiseValue, &shared, 0);
    ASSERT_NE(thread, nullptr);
    while (shared.value == 0) xft->condWait(shared.condition, shared.mutex);
    xft->unlockMutex(shared.mutex);
    void* result = nullptr;
    EXPECT_EQ(xft->joinThread(thread, &result), 0);
    EXPECT_EQ(result, &shared);
    xft->destroyCondition(shared.condition);
    xft->destroyMutex(shared.mutex);
}

TEST_F(ThreadTable, AWaitEndsWithItsTime) {
    void* const mutex = xft->newMutex(0);
    void* const condition = xft->newCondition(0);
    timespec until{};
    clock_gettime(CLOCK_REALTIME, &until);
    until.tv_sec -= 1;
    xft->lockMutex(mutex);
    EXPECT_EQ(xft->timedCondWait(condition, mutex, &until), ETIMEDOUT);
    xft->unlockMutex(mutex);
    xft->destroyCondition(condition);
    xft->destroyMutex(mutex);
    xft->destroyCondition(nullptr);
    xft->destroyMutex(nullptr);
}

void* leaveEarly(void* parm) {
    static_cast<CMPIBrokerExtFT*>(parm)->exitThread(parm);
    return nullptr;
}

TEST_F(ThreadTable, AThreadMayLeaveWithAResult) {
    void* const thread = xft->newThread(leaveEarly, xft, 0);
    void* result = nullptr;
    EXPECT_EQ(xft->joinThread(thread, &result), 0);
    EXPECT_EQ(result, xft);
}

void* waitForEver(void* parm) {
    for (;;) pause();
    return parm;
}

TEST_F(ThreadTable, AWaitingThreadCanBeCancelled) {
    void* const thread = xft->newThread(waitForEver, xft, 0);
    EXPECT_EQ(xft->cancelThread(thread), 0);
    void* result = nullptr;
    EXPECT_EQ(xft->joinThread(thread, &result), 0);
    EXPECT_NE(result, xft);
}

TEST_F(ThreadTable, SleepingTakesItsMilliseconds) {
    timespec before{};
    timespec after{};
    clock_gettime(CLOCK_MONOTONIC, &before);
    EXPECT_EQ(xft->threadSleep(20), 0);
    clock_gettime(CLOCK_MONOTONIC, &after);
    const double seconds = static_cast<double>(after.tv_sec - before.tv_sec) +
                           static_cast<double>(after.tv_nsec - before.tv_nsec) / 1e9;
    EXPECT_GE(seconds, 0.02);
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
    Request request(broker);
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
