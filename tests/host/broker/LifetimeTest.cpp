// How long objects live, on which thread, and what happens to a pointer that is kept too long.
#include "BrokerFixture.h"

#include "host/broker/ResultCollector.h"

#include <algorithm>
#include <atomic>
#include <thread>
#include <utility>

namespace cmpihost {
namespace {

class Lifetimes : public ::testing::Test {
  protected:
    Broker broker;
    const CMPIBroker* mb = broker.cmpi();
    CMPIStatus status = {CMPI_RC_OK, nullptr};

    CMPIObjectPath* newPath() { return CMNewObjectPath(mb, "root/cimv2", "TEST_Thing", &status); }

    /// What `make` made in a request that has ended.
    template <class Make>
    auto afterItsRequest(Make make) {
        RequestScope request(broker);
        return make();
    }
};

const std::string deadPath = "CMPIObjectPath of TEST_Thing used after its request ended";

TEST_F(Lifetimes, APathUsedAfterItsRequestIsRecognised) {
    CMPIObjectPath* const kept = afterItsRequest([this] { return newPath(); });
    EXPECT_EQ(CMGetKeyCount(kept, &status), 0u);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(CMGetClassName(kept, &status), nullptr);
    EXPECT_EQ(CMGetKey(kept, "Name", &status).state, CMPI_badValue);
    EXPECT_EQ(CMAddKey(kept, "Name", "x", CMPI_chars).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_THAT(broker.violations(), ElementsAre("CMPIObjectPathFT.getKeyCount: " + deadPath,
                                                 "CMPIObjectPathFT.getClassName: " + deadPath,
                                                 "CMPIObjectPathFT.getKey: " + deadPath,
                                                 "CMPIObjectPathFT.addKey: " + deadPath));
}

TEST_F(Lifetimes, AStringUsedAfterItsRequestShowsThatItIsDead) {
    CMPIString* const kept = afterItsRequest([this] { return CMNewString(mb, "Linux", nullptr); });
    EXPECT_STREQ(CMGetCharPtr(kept), "(object of a request that ended)");
    EXPECT_STREQ(CMGetCharsPtr(kept, &status), "(object of a request that ended)");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_THAT(
        broker.violations(),
        ElementsAre("CMPIStringFT.getCharPtr: CMPIString \"Linux\" used after its request ended"));
}

TEST_F(Lifetimes, EveryKindOfObjectIsRecognisedAfterItsRequest) {
    CMPIInstance* instance = nullptr;
    CMPIArray* array = nullptr;
    CMPIArgs* args = nullptr;
    CMPIDateTime* date = nullptr;
    CMPIContext* context = nullptr;
    const CMPIResult* result = nullptr;
    CMPIString* className = nullptr;
    {
        RequestScope request(broker);
        ResultCollector collector(request);
        instance = CMNewInstance(mb, newPath(), nullptr);
        array = CMNewArray(mb, 1, CMPI_uint8, nullptr);
        args = CMNewArgs(mb, nullptr);
        date = CMNewDateTimeFromBinary(mb, 0, 0, nullptr);
        context = request.makeContext({}, "");
        result = collector.cmpi();
        className = CMGetClassName(newPath(), nullptr);
    }
    CMGetPropertyCount(instance, nullptr);
    CMGetArrayCount(array, nullptr);
    CMGetArgCount(args, nullptr);
    CMIsInterval(date, nullptr);
    CMGetContextEntryCount(context, nullptr);
    EXPECT_EQ(CMReturnDone(result).rc, CMPI_RC_ERR_INVALID_HANDLE);
    CMGetCharsPtr(className, nullptr);
    const std::string ended = " used after its request ended";
    EXPECT_THAT(
        broker.violations(),
        ElementsAre("CMPIInstanceFT.getPropertyCount: CMPIInstance of TEST_Thing" + ended,
                    "CMPIArrayFT.getSize: CMPIArray" + ended,
                    "CMPIArgsFT.getArgCount: CMPIArgs" + ended,
                    "CMPIDateTimeFT.isInterval: CMPIDateTime \"19700101000000.000000+000\"" + ended,
                    "CMPIContextFT.getEntryCount: CMPIContext" + ended,
                    "CMPIResultFT.returnDone: CMPIResult" + ended,
                    "CMPIStringFT.getCharPtr: CMPIString \"TEST_Thing\"" + ended));
}

TEST_F(Lifetimes, ADeadObjectHandedToALiveOneIsRecognised) {
    CMPIObjectPath* kept = afterItsRequest([this] { return newPath(); });
    RequestScope request(broker);
    EXPECT_EQ(CMNewInstance(mb, kept, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(CMAddKey(newPath(), "Ref", &kept, CMPI_ref).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(CDGetType(mb, kept, &status), nullptr);
    EXPECT_THAT(broker.violations(), ElementsAre("CMPIBrokerEncFT.newInstance: " + deadPath,
                                                 "CMPIObjectPathFT.addKey: " + deadPath,
                                                 "CMPIBrokerEncFT.getType: " + deadPath));
}

TEST_F(Lifetimes, ObjectsOfANestedRequestLiveUntilTheOuterOneEnds) {
    RequestScope outer(broker);
    CMPIObjectPath* const path = afterItsRequest([this] { return newPath(); });
    EXPECT_EQ(textOf(CMGetClassName(path, nullptr)), "TEST_Thing");
    EXPECT_THAT(broker.violations(), IsEmpty());
    outer.end();
    outer.end();
    EXPECT_EQ(broker.quarantined(), 2u) << "the path and its class name, once";
    EXPECT_EQ(CMGetClassName(path, nullptr), nullptr);
    EXPECT_EQ(broker.violations().size(), 1u);
}

TEST_F(Lifetimes, AnObjectMadeOutsideARequestOfItsBrokerIsAViolationButWorks) {
    Broker other;
    RequestScope request(other);
    CMPIObjectPath* const path = newPath();
    ASSERT_NE(path, nullptr);
    EXPECT_EQ(CMGetKeyCount(path, nullptr), 0u);
    EXPECT_THAT(request.violations(), IsEmpty());
    EXPECT_THAT(
        broker.violations(),
        ElementsAre("CMPIObjectPath of TEST_Thing made while no request is open on the thread"));
}

TEST_F(Lifetimes, BrokersKeepTheirRequestsApartOnOneThread) {
    Broker other;
    RequestScope first(broker);
    CMPIObjectPath* const mine = newPath();
    {
        RequestScope second(other);
        CMPIObjectPath* const nested = newPath();
        EXPECT_EQ(CMAddKey(nested, "Ref", &mine, CMPI_ref).rc, CMPI_RC_OK);
    }
    EXPECT_EQ(CMGetKeyCount(mine, &status), 0u);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_THAT(broker.violations(), IsEmpty());
    EXPECT_THAT(other.violations(), IsEmpty());
}

TEST_F(Lifetimes, ACloneLivesUntilItIsReleased) {
    CMPIObjectPath* const copy = afterItsRequest([this] {
        CMPIObjectPath* const path = newPath();
        CMAddKey(path, "Name", "x", CMPI_chars);
        CMPIObjectPath* const made = CMClone(path, &status);
        CMAddKey(path, "Name", "changed", CMPI_chars);
        return made;
    });
    EXPECT_EQ(broker.unreleasedClones(), 1u);
    EXPECT_EQ(toString(valueOf(copy)), "root/cimv2:TEST_Thing.Name=\"x\"");
    EXPECT_EQ(CMRelease(copy).rc, CMPI_RC_OK);
    EXPECT_EQ(broker.unreleasedClones(), 0u);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(Lifetimes, EveryKindOfObjectButAResultCanBeCloned) {
    RequestScope request(broker);
    CMPIInstance* const instance = CMClone(CMNewInstance(mb, newPath(), nullptr), &status);
    CMPIString* const string = CMClone(CMNewString(mb, "x", nullptr), &status);
    CMPIArray* const array = CMClone(CMNewArray(mb, 2, CMPI_uint8, nullptr), &status);
    CMPIDateTime* const date = CMClone(CMNewDateTimeFromBinary(mb, 0, 0, nullptr), &status);
    CMPIArgs* const args = CMClone(CMNewArgs(mb, nullptr), &status);
    CMPIContext* const context = CMClone(request.makeContext({}, ""), &status);
    ResultCollector collector(request);
    EXPECT_EQ(CMClone(collector.cmpi(), &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    request.end();
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 0u);
    EXPECT_EQ(textOf(string), "x");
    EXPECT_EQ(CMGetArrayCount(array, nullptr), 2u);
    EXPECT_FALSE(CMIsInterval(date, nullptr));
    EXPECT_EQ(CMGetArgCount(args, nullptr), 0u);
    EXPECT_EQ(CMGetContextEntryCount(context, nullptr), 4u);
    EXPECT_EQ(broker.unreleasedClones(), 6u);
    const auto releaseAll = [](auto*... clones) {
        const CMPIrc results[] = {CMRelease(clones).rc...};
        for (const CMPIrc rc : results) EXPECT_EQ(rc, CMPI_RC_OK);
    };
    releaseAll(instance, string, array, date, args, context);
    EXPECT_EQ(broker.unreleasedClones(), 0u);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(Lifetimes, ACloneUsedOrReleasedAfterItsReleaseIsRecognised) {
    RequestScope request(broker);
    CMPIObjectPath* const copy = CMClone(newPath(), nullptr);
    CMRelease(copy);
    EXPECT_EQ(CMGetKeyCount(copy, nullptr), 0u);
    EXPECT_EQ(CMRelease(copy).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_THAT(
        request.violations(),
        ElementsAre(
            "CMPIObjectPathFT.getKeyCount: CMPIObjectPath of TEST_Thing used after it was released",
            "CMPIObjectPathFT.release: CMPIObjectPath of TEST_Thing used after it was released"));
}

TEST_F(Lifetimes, ReleasingAnObjectOfTheRequestIsAViolationAndLeavesItAlive) {
    RequestScope request(broker);
    CMPIObjectPath* const path = newPath();
    EXPECT_EQ(CMRelease(path).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(CMGetKeyCount(path, &status), 0u);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_THAT(
        request.violations(),
        ElementsAre("CMPIObjectPath of TEST_Thing released that belongs to the object manager"));
}

BrokerOptions withQuarantine(std::size_t limit) {
    BrokerOptions options;
    options.quarantine = limit;
    return options;
}

TEST(QuarantineOfObjects, KeepsTheYoungestUpToItsLimit) {
    for (const std::size_t limit : {0u, 1u, 10u}) {
        Broker small(nullptr, withQuarantine(limit));
        CMPIObjectPath* last = nullptr;
        {
            RequestScope request(small);
            for (int i = 0; i < 25; ++i) {
                const std::string name = "TEST_" + std::to_string(i);
                last = CMNewObjectPath(small.cmpi(), "", name.c_str(), nullptr);
            }
        }
        EXPECT_EQ(small.quarantined(), limit);
        if (limit == 0) continue;
        CMGetKeyCount(last, nullptr);
        EXPECT_THAT(small.violations(), ElementsAre("CMPIObjectPathFT.getKeyCount: CMPIObjectPath "
                                                    "of TEST_24 used after its request ended"));
    }
}

TEST(QuarantineOfObjects, GivesAnObjectFreedEarlyOnePlace) {
    Broker small(nullptr, withQuarantine(3));
    {
        RequestScope request(small);
        CMPIObjectPath* paths[3];
        for (CMPIObjectPath*& path : paths)
            path = CMNewObjectPath(small.cmpi(), "", "TEST_Thing", nullptr);
        small.cmpi()->mft->freeObjectPath(small.cmpi(), paths[0]);
        EXPECT_EQ(small.quarantined(), 1u);
    }
    EXPECT_EQ(small.quarantined(), 3u);
}

TEST_F(Lifetimes, AVeryLongNameIsCutInTheReport) {
    CMPIString* const kept = afterItsRequest(
        [this] { return CMNewString(mb, std::string(1000, 'x').c_str(), nullptr); });
    CMGetCharsPtr(kept, nullptr);
    EXPECT_THAT(broker.violations(),
                ElementsAre("CMPIStringFT.getCharPtr: CMPIString \"" + std::string(47, 'x') +
                            "\" used after its request ended"));
}

TEST_F(Lifetimes, RequestsSeeTheViolationsOfTheirOwnThreadAndOfInnerOnes) {
    RequestScope outer(broker);
    EXPECT_EQ(CMNewString(mb, nullptr, &status), nullptr);
    EXPECT_EQ(std::exchange(status.rc, CMPI_RC_OK), CMPI_RC_ERR_INVALID_PARAMETER);
    std::thread([this] {
        RequestScope other(broker);
        CMNewObjectPath(mb, nullptr, nullptr, nullptr);
        EXPECT_EQ(other.violations().size(), 1u);
    }).join();
    {
        RequestScope inner(broker);
        EXPECT_EQ(CMNewInstance(mb, nullptr, &status), nullptr);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
        EXPECT_EQ(inner.violations().size(), 1u);
    }
    EXPECT_THAT(outer.violations(),
                ElementsAre("CMPIBrokerEncFT.newString: null text",
                            "CMPIBrokerEncFT.newInstance: null CMPIObjectPath"));
    EXPECT_EQ(broker.violations().size(), 3u);
}

TEST_F(Lifetimes, RequestsRunInParallelOnOneBroker) {
    std::vector<std::thread> threads;
    std::atomic<int> wrong{0};
    for (int t = 0; t < 4; ++t) {
        threads.emplace_back([&, t] {
            const std::string className = "TEST_" + std::to_string(t);
            for (int round = 0; round < 200; ++round) {
                RequestScope request(broker);
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

TEST_F(Lifetimes, AnAttachedThreadHasARequestOfItsOwn) {
    RequestScope request(broker);
    CMPIContext* const prepared =
        CBPrepareAttachThread(mb, request.makeContext({5, {}, {}}, "root"));
    ASSERT_NE(prepared, nullptr);
    CMPIObjectPath* path = nullptr;
    std::thread([&] {
        EXPECT_EQ(CBAttachThread(mb, prepared).rc, CMPI_RC_OK);
        EXPECT_EQ(CMGetContextEntry(prepared, CMPIInvocationFlags, nullptr).value.uint32, 5u);
        path = newPath();
        EXPECT_EQ(CMGetKeyCount(path, nullptr), 0u);
        EXPECT_EQ(CBDetachThread(mb, prepared).rc, CMPI_RC_OK);
    }).join();
    EXPECT_EQ(broker.unreleasedClones(), 0u);
    EXPECT_THAT(broker.violations(), IsEmpty());
    CMGetKeyCount(path, nullptr);
    EXPECT_THAT(broker.violations(), ElementsAre("CMPIObjectPathFT.getKeyCount: " + deadPath));
}

TEST_F(Lifetimes, AThreadDetachesOnlyWhenItIsAttachedAndWithAPreparedContext) {
    RequestScope request(broker);
    CMPIContext* const context = request.makeContext({}, "root");
    CMPIContext* const prepared = CBPrepareAttachThread(mb, context);
    EXPECT_EQ(CBDetachThread(mb, prepared).rc, CMPI_RC_ERR_FAILED);
    CMRelease(prepared);
    std::thread([&] {
        CBAttachThread(mb, context);
        EXPECT_EQ(CBDetachThread(mb, context).rc, CMPI_RC_ERR_INVALID_HANDLE);
    }).join();
    EXPECT_THAT(broker.violations(),
                ElementsAre("detachThread on a thread that is not attached",
                            "detachThread with a context that is none of prepareAttachThread"));
    EXPECT_EQ(CMGetContextEntryCount(context, nullptr), 4u);
}

TEST_F(Lifetimes, ARequestMakesAndReadsBackPathsAndInstances) {
    RequestScope request(broker);
    const InstanceValue thing = {{"root", "TEST_Thing", {{"Name", "x"}}},
                                 {{"Name", "x"}, {"Size", Value::fromUnsigned(3, CMPI_uint16)}}};
    CMPIObjectPath* const path = request.makePath(thing.path);
    EXPECT_EQ(valueOf(request.makeInstance(thing)), thing);
    EXPECT_EQ(valueOf(path), thing.path);
    EXPECT_EQ(textOf(request.makeString("text")), "text");
    const CMPIData key = CMGetKey(
        request.makePath({"", "T", {{"Name", Value::fromText("characters here", CMPI_chars)}}}),
        "Name", nullptr);
    EXPECT_EQ(key.type, CMPI_chars);
    EXPECT_STREQ(key.value.chars, "characters here");

    request.end();
    EXPECT_THROW(valueOf(path), std::invalid_argument);
    EXPECT_THROW(valueOf(static_cast<CMPIInstance*>(nullptr)), std::invalid_argument);
}

class Memory : public BrokerTest {
  protected:
    CMPIBrokerMemFT* mft = mb->mft;
};

TEST_F(Memory, AMarkIsReleasedWithEverythingMadeSince) {
    CMPIObjectPath* const before = newPath();
    CMPIGcStat* const outer = mft->mark(mb, &status);
    CMPIGcStat* const inner = mft->mark(mb, &status);
    CMPIObjectPath* const after = newPath();
    EXPECT_EQ(mft->release(mb, outer).rc, CMPI_RC_OK);
    EXPECT_EQ(CMGetKeyCount(before, &status), 0u);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    CMGetKeyCount(after, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(mft->release(mb, inner).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_THAT(
        broker.violations(),
        ElementsAre(
            "CMPIObjectPathFT.getKeyCount: CMPIObjectPath of TEST_Thing used after it was released",
            "CMPIBrokerMemFT.release without its mark"));
}

TEST_F(Memory, BlocksBelongToTheRequest) {
    EXPECT_STREQ(mft->cmpiStrDup(mb, "copied"), "copied");
    auto* block = static_cast<unsigned char*>(mft->cmpiCalloc(mb, 4, 8));
    EXPECT_EQ(std::count(block, block + 32, 0), 32);
    block[31] = 9;
    block = static_cast<unsigned char*>(mft->cmpiRealloc(mb, block, 100000));
    EXPECT_EQ(block[31], 9);
    mft->cmpiFree(mb, block);
    mft->cmpiFree(mb, nullptr);
    EXPECT_NE(mft->cmpiMalloc(mb, 0), nullptr);
    EXPECT_NE(mft->cmpiRealloc(mb, nullptr, 10), nullptr);
    EXPECT_NE(mft->cmpiCalloc(mb, 4, 0), nullptr);
    EXPECT_EQ(mft->cmpiCalloc(mb, ~std::size_t{0}, 2), nullptr);
    EXPECT_THAT(broker.violations(), IsEmpty());

    int stranger = 0;
    mft->cmpiFree(mb, &stranger);
    EXPECT_EQ(mft->cmpiRealloc(mb, &stranger, 10), nullptr);
    EXPECT_THAT(broker.violations(),
                ElementsAre("CMPIBrokerMemFT.cmpiFree of memory that is none of the request"));
}

TEST_F(Memory, ObjectsCanBeFreedEarlyAndOnce) {
    CMPIObjectPath* const path = newPath();
    mft->freeInstance(mb, newInstance());
    mft->freeObjectPath(mb, path);
    mft->freeString(mb, CMNewString(mb, "x", nullptr));
    mft->freeArray(mb, newArray(CMPI_uint8));
    mft->freeArgs(mb, CMNewArgs(mb, nullptr));
    mft->freeDateTime(mb, CMNewDateTime(mb, nullptr));
    EXPECT_THAT(broker.violations(), IsEmpty());

    CMPISelectExp stranger = {nullptr, nullptr};
    mft->freeObjectPath(mb, path);
    mft->freeSelectExp(mb, nullptr);
    mft->freeSelectExp(mb, &stranger);
    EXPECT_THAT(broker.violations(),
                ElementsAre("CMPIBrokerMemFT.freeObjectPath: CMPIObjectPath of TEST_Thing used "
                            "after it was released",
                            "CMPIBrokerMemFT.freeSelectExp: null CMPISelectExp",
                            "CMPIBrokerMemFT.freeSelectExp: no CMPISelectExp of this host"));
}

}  // namespace
}  // namespace cmpihost
