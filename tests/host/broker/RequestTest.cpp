// Requests of several threads, and threads that providers start.
#include "BrokerFixture.h"

#include <atomic>
#include <thread>

namespace cmpihost {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

TEST(Requests, SeeTheViolationsOfTheirOwnThread) {
    Broker broker;
    Request request(broker);
    std::thread([&broker] {
        Request other(broker);
        CMNewString(broker.cmpi(), nullptr, nullptr);
        EXPECT_THAT(other.violations(), ElementsAre("CMPIBrokerEncFT.newString: null text"));
    }).join();
    EXPECT_THAT(request.violations(), IsEmpty());
    EXPECT_EQ(broker.violations().size(), 1u);
}

TEST(Requests, AnOuterOneSeesTheViolationsOfInnerOnes) {
    Broker broker;
    Request outer(broker);
    CMNewString(broker.cmpi(), nullptr, nullptr);
    {
        Request inner(broker);
        CMNewInstance(broker.cmpi(), nullptr, nullptr);
        EXPECT_EQ(inner.violations().size(), 1u);
    }
    EXPECT_THAT(outer.violations(),
                ElementsAre("CMPIBrokerEncFT.newString: null text",
                            "CMPIBrokerEncFT.newInstance: null CMPIObjectPath"));
}

TEST(Requests, RunInParallelOnOneBroker) {
    Broker broker;
    const CMPIBroker* const mb = broker.cmpi();
    std::vector<std::thread> threads;
    std::atomic<int> wrong{0};
    for (int t = 0; t < 4; ++t) {
        threads.emplace_back([&, t] {
            const std::string className = "TEST_" + std::to_string(t);
            for (int round = 0; round < 200; ++round) {
                Request request(broker);
                CMPIObjectPath* const path =
                    CMNewObjectPath(mb, "root", className.c_str(), nullptr);
                CMAddKey(path, "Name", className.c_str(), CMPI_chars);
                CMPIInstance* const instance = CMNewInstance(mb, path, nullptr);
                CMSetProperty(instance, "Name", className.c_str(), CMPI_chars);
                CMPIInstance* const copy = CMClone(instance, nullptr);
                const CMPIData name = CMGetProperty(copy, "Name", nullptr);
                if (textOf(name.value.string) != className) ++wrong;
                CMRelease(copy);
            }
        });
    }
    for (std::thread& thread : threads) thread.join();
    EXPECT_EQ(wrong, 0);
    EXPECT_EQ(broker.unreleasedClones(), 0u);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST(Requests, AnAttachedThreadHasARequestOfItsOwn) {
    Broker broker;
    const CMPIBroker* const mb = broker.cmpi();
    Request request(broker);
    CMPIContext* const prepared =
        CBPrepareAttachThread(mb, request.makeContext({5, {}, {}}, "root"));
    ASSERT_NE(prepared, nullptr);
    CMPIObjectPath* path = nullptr;
    std::thread([&] {
        EXPECT_EQ(CBAttachThread(mb, prepared).rc, CMPI_RC_OK);
        EXPECT_EQ(CMGetContextEntry(prepared, CMPIInvocationFlags, nullptr).value.uint32, 5u);
        path = CMNewObjectPath(mb, "root", "TEST_Thing", nullptr);
        EXPECT_EQ(CMGetKeyCount(path, nullptr), 0u);
        EXPECT_EQ(CBDetachThread(mb, prepared).rc, CMPI_RC_OK);
    }).join();
    EXPECT_EQ(broker.unreleasedClones(), 0u);
    EXPECT_THAT(broker.violations(), IsEmpty());
    CMGetKeyCount(path, nullptr);
    EXPECT_THAT(broker.violations(), ElementsAre("CMPIObjectPathFT.getKeyCount: CMPIObjectPath of "
                                                 "TEST_Thing used after its request ended"));
}

TEST(Requests, AThreadThatIsNotAttachedCannotDetach) {
    Broker broker;
    const CMPIBroker* const mb = broker.cmpi();
    Request request(broker);
    CMPIContext* const prepared = CBPrepareAttachThread(mb, request.makeContext({}, "root"));
    EXPECT_EQ(CBDetachThread(mb, prepared).rc, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(broker.violations(), ElementsAre("detachThread on a thread that is not attached"));
    CMRelease(prepared);
}

TEST(Requests, DetachingWithTheContextOfTheRequestIsAViolation) {
    Broker broker;
    const CMPIBroker* const mb = broker.cmpi();
    Request request(broker);
    CMPIContext* const context = request.makeContext({}, "root");
    std::thread([&] {
        CBAttachThread(mb, context);
        EXPECT_EQ(CBDetachThread(mb, context).rc, CMPI_RC_ERR_INVALID_HANDLE);
    }).join();
    EXPECT_THAT(broker.violations(),
                ElementsAre("detachThread with a context that is none of prepareAttachThread"));
    EXPECT_EQ(CMGetContextEntryCount(context, nullptr), 4u);
}

TEST(Requests, MakeAndReadBackPathsAndInstances) {
    Broker broker;
    Request request(broker);
    const InstanceValue thing = {{"root", "TEST_Thing", {{"Name", "x"}}},
                                 {{"Name", "x"}, {"Size", Value::fromUnsigned(3, CMPI_uint16)}}};
    EXPECT_EQ(valueOf(request.makeInstance(thing)), thing);
    EXPECT_EQ(valueOf(request.makePath(thing.path)), thing.path);
    EXPECT_EQ(textOf(request.makeString("text")), "text");
}

TEST(Requests, ReadingADeadOrNullObjectThrows) {
    Broker broker;
    Request request(broker);
    CMPIObjectPath* const path = request.makePath({"root", "TEST_Thing"});
    request.end();
    EXPECT_THROW(valueOf(path), std::invalid_argument);
    EXPECT_THROW(valueOf(static_cast<CMPIInstance*>(nullptr)), std::invalid_argument);
}

TEST(Requests, AKeyGivenAsCharsReachesTheProviderAsChars) {
    Broker broker;
    Request request(broker);
    const CMPIObjectPath* const path = request.makePath(
        {"root", "TEST_Thing", {{"Name", Value::fromText("plain characters here", CMPI_chars)}}});
    const CMPIData key = CMGetKey(path, "Name", nullptr);
    EXPECT_EQ(key.type, CMPI_chars);
    EXPECT_STREQ(key.value.chars, "plain characters here");
}

}  // namespace
}  // namespace cmpihost
