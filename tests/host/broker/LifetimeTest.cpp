// How long objects live, and what happens to a pointer that is kept too long.
#include "BrokerFixture.h"

#include "host/broker/ResultCollector.h"

#include <algorithm>

namespace cmpihost {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class Lifetime : public ::testing::Test {
  protected:
    Broker broker;
    const CMPIBroker* mb = broker.cmpi();
    CMPIStatus status = {CMPI_RC_OK, nullptr};

    CMPIObjectPath* newPath() { return CMNewObjectPath(mb, "root/cimv2", "TEST_Thing", &status); }
};

TEST_F(Lifetime, APathUsedAfterItsRequestIsRecognised) {
    CMPIObjectPath* kept = nullptr;
    {
        Request request(broker);
        kept = newPath();
    }
    EXPECT_EQ(CMGetKeyCount(kept, &status), 0u);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(CMGetClassName(kept, &status), nullptr);
    EXPECT_EQ(CMGetKey(kept, "Name", &status).state, CMPI_badValue);
    EXPECT_EQ(CMAddKey(kept, "Name", "x", CMPI_chars).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_THAT(
        broker.violations(),
        ElementsAre(
            "CMPIObjectPathFT.getKeyCount: CMPIObjectPath of TEST_Thing used after its request "
            "ended",
            "CMPIObjectPathFT.getClassName: CMPIObjectPath of TEST_Thing used after its request "
            "ended",
            "CMPIObjectPathFT.getKey: CMPIObjectPath of TEST_Thing used after its request ended",
            "CMPIObjectPathFT.addKey: CMPIObjectPath of TEST_Thing used after its request ended"));
}

TEST_F(Lifetime, AStringUsedAfterItsRequestShowsThatItIsDead) {
    CMPIString* kept = nullptr;
    {
        Request request(broker);
        kept = CMNewString(mb, "Linux", nullptr);
    }
    EXPECT_STREQ(CMGetCharPtr(kept), "(object of a request that ended)");
    EXPECT_STREQ(CMGetCharsPtr(kept, &status), "(object of a request that ended)");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_THAT(
        broker.violations(),
        ElementsAre("CMPIStringFT.getCharPtr: CMPIString \"Linux\" used after its request ended"));
}

TEST_F(Lifetime, EveryKindOfObjectIsRecognisedAfterItsRequest) {
    CMPIInstance* instance = nullptr;
    CMPIArray* array = nullptr;
    CMPIArgs* args = nullptr;
    CMPIDateTime* date = nullptr;
    CMPIContext* context = nullptr;
    const CMPIResult* result = nullptr;
    {
        Request request(broker);
        ResultCollector collector(request);
        instance = CMNewInstance(mb, newPath(), nullptr);
        array = CMNewArray(mb, 1, CMPI_uint8, nullptr);
        args = CMNewArgs(mb, nullptr);
        date = CMNewDateTimeFromBinary(mb, 0, 0, nullptr);
        context = request.makeContext({}, "");
        result = collector.cmpi();
    }
    CMGetPropertyCount(instance, nullptr);
    CMGetArrayCount(array, nullptr);
    CMGetArgCount(args, nullptr);
    CMIsInterval(date, nullptr);
    CMGetContextEntryCount(context, nullptr);
    EXPECT_EQ(CMReturnDone(result).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_THAT(
        broker.violations(),
        ElementsAre(
            "CMPIInstanceFT.getPropertyCount: CMPIInstance of TEST_Thing used after its request "
            "ended",
            "CMPIArrayFT.getSize: CMPIArray used after its request ended",
            "CMPIArgsFT.getArgCount: CMPIArgs used after its request ended",
            "CMPIDateTimeFT.isInterval: CMPIDateTime \"19700101000000.000000+000\" used after its "
            "request ended",
            "CMPIContextFT.getEntryCount: CMPIContext used after its request ended",
            "CMPIResultFT.returnDone: CMPIResult used after its request ended"));
}

TEST_F(Lifetime, ADeadObjectHandedToALiveOneIsRecognised) {
    CMPIObjectPath* kept = nullptr;
    {
        Request request(broker);
        kept = newPath();
    }
    Request request(broker);
    EXPECT_EQ(CMNewInstance(mb, kept, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    CMPIObjectPath* const path = newPath();
    EXPECT_EQ(CMAddKey(path, "Ref", &kept, CMPI_ref).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(CDGetType(mb, kept, &status), nullptr);
    EXPECT_THAT(
        broker.violations(),
        ElementsAre(
            "CMPIBrokerEncFT.newInstance: CMPIObjectPath of TEST_Thing used after its request "
            "ended",
            "CMPIObjectPathFT.addKey: CMPIObjectPath of TEST_Thing used after its request ended",
            "CMPIBrokerEncFT.getType: CMPIObjectPath of TEST_Thing used after its request ended"));
}

TEST_F(Lifetime, ObjectsThatGettersHandOutEndWithTheRequestToo) {
    CMPIString* name = nullptr;
    {
        Request request(broker);
        name = CMGetClassName(newPath(), nullptr);
    }
    CMGetCharsPtr(name, nullptr);
    EXPECT_THAT(
        broker.violations(),
        ElementsAre(
            "CMPIStringFT.getCharPtr: CMPIString \"TEST_Thing\" used after its request ended"));
}

TEST_F(Lifetime, ObjectsOfANestedRequestLiveUntilTheOuterOneEnds) {
    Request outer(broker);
    CMPIObjectPath* path = nullptr;
    {
        Request inner(broker);
        path = newPath();
    }
    EXPECT_EQ(textOf(CMGetClassName(path, nullptr)), "TEST_Thing");
    EXPECT_THAT(broker.violations(), IsEmpty());
    outer.end();
    EXPECT_EQ(CMGetClassName(path, nullptr), nullptr);
    EXPECT_EQ(broker.violations().size(), 1u);
}

TEST_F(Lifetime, EndingARequestTwiceIsHarmless) {
    Request request(broker);
    newPath();
    request.end();
    request.end();
    EXPECT_EQ(broker.quarantined(), 1u);
}

TEST_F(Lifetime, AnObjectMadeOutsideARequestIsAViolationButWorks) {
    CMPIObjectPath* const path = newPath();
    ASSERT_NE(path, nullptr);
    EXPECT_EQ(CMGetKeyCount(path, nullptr), 0u);
    EXPECT_THAT(
        broker.violations(),
        ElementsAre("CMPIObjectPath of TEST_Thing made while no request is open on the thread"));
}

TEST_F(Lifetime, ARequestOfAnotherBrokerDoesNotCount) {
    Broker other;
    Request request(other);
    newPath();
    EXPECT_EQ(broker.violations().size(), 1u);
    EXPECT_THAT(request.violations(), IsEmpty());
}

TEST_F(Lifetime, BrokersKeepTheirRequestsApartOnOneThread) {
    Broker other;
    Request first(broker);
    CMPIObjectPath* const mine = newPath();
    {
        Request second(other);
        CMPIObjectPath* const nested = newPath();
        EXPECT_NE(nested, nullptr);
        EXPECT_EQ(CMAddKey(nested, "Ref", &mine, CMPI_ref).rc, CMPI_RC_OK);
    }
    EXPECT_EQ(CMGetKeyCount(mine, &status), 0u);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_THAT(broker.violations(), IsEmpty());
    EXPECT_THAT(other.violations(), IsEmpty());
}

TEST_F(Lifetime, ACloneLivesUntilItIsReleased) {
    CMPIObjectPath* copy = nullptr;
    {
        Request request(broker);
        CMPIObjectPath* const path = newPath();
        CMAddKey(path, "Name", "x", CMPI_chars);
        copy = CMClone(path, &status);
        CMAddKey(path, "Name", "changed", CMPI_chars);
    }
    EXPECT_EQ(broker.unreleasedClones(), 1u);
    EXPECT_EQ(toString(valueOf(copy)), "root/cimv2:TEST_Thing.Name=\"x\"");
    EXPECT_EQ(CMRelease(copy).rc, CMPI_RC_OK);
    EXPECT_EQ(broker.unreleasedClones(), 0u);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(Lifetime, EveryKindOfObjectCanBeCloned) {
    Request request(broker);
    CMPIInstance* const instance = CMClone(CMNewInstance(mb, newPath(), nullptr), &status);
    CMPIString* const string = CMClone(CMNewString(mb, "x", nullptr), &status);
    CMPIArray* const array = CMClone(CMNewArray(mb, 2, CMPI_uint8, nullptr), &status);
    CMPIDateTime* const date = CMClone(CMNewDateTimeFromBinary(mb, 0, 0, nullptr), &status);
    CMPIArgs* const args = CMClone(CMNewArgs(mb, nullptr), &status);
    CMPIContext* const context = CMClone(request.makeContext({}, ""), &status);
    request.end();
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 0u);
    EXPECT_EQ(textOf(string), "x");
    EXPECT_EQ(CMGetArrayCount(array, nullptr), 2u);
    EXPECT_FALSE(CMIsInterval(date, nullptr));
    EXPECT_EQ(CMGetArgCount(args, nullptr), 0u);
    EXPECT_EQ(CMGetContextEntryCount(context, nullptr), 4u);
    CMRelease(instance);
    CMRelease(string);
    CMRelease(array);
    CMRelease(date);
    CMRelease(args);
    CMRelease(context);
    EXPECT_EQ(broker.unreleasedClones(), 0u);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(Lifetime, AResultCannotBeCloned) {
    Request request(broker);
    ResultCollector collector(request);
    EXPECT_EQ(CMClone(collector.cmpi(), &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(Lifetime, ACloneUsedOrReleasedAfterItsReleaseIsRecognised) {
    Request request(broker);
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

TEST_F(Lifetime, ReleasingAnObjectOfTheRequestIsAViolationAndLeavesItAlive) {
    Request request(broker);
    CMPIObjectPath* const path = newPath();
    EXPECT_EQ(CMRelease(path).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(CMGetKeyCount(path, &status), 0u);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_THAT(
        request.violations(),
        ElementsAre("CMPIObjectPath of TEST_Thing released that belongs to the object manager"));
}

TEST_F(Lifetime, TheQuarantineKeepsTheYoungestShellsUpToItsLimit) {
    BrokerOptions options;
    options.quarantine = 10;
    Broker small(nullptr, options);
    CMPIObjectPath* last = nullptr;
    {
        Request request(small);
        for (int i = 0; i < 25; ++i) {
            last =
                CMNewObjectPath(small.cmpi(), "", ("TEST_" + std::to_string(i)).c_str(), nullptr);
        }
    }
    EXPECT_EQ(small.quarantined(), 10u);
    CMGetKeyCount(last, nullptr);
    EXPECT_THAT(small.violations(), ElementsAre("CMPIObjectPathFT.getKeyCount: CMPIObjectPath of "
                                                "TEST_24 used after its request ended"));
}

TEST_F(Lifetime, AnObjectGivenBackEarlyTakesOnePlaceOfTheQuarantine) {
    BrokerOptions options;
    options.quarantine = 3;
    Broker small(nullptr, options);
    {
        Request request(small);
        CMPIObjectPath* paths[3];
        for (CMPIObjectPath*& path : paths)
            path = CMNewObjectPath(small.cmpi(), "", "TEST_Thing", nullptr);
        small.cmpi()->mft->freeObjectPath(small.cmpi(), paths[0]);
        EXPECT_EQ(small.quarantined(), 1u);
    }
    EXPECT_EQ(small.quarantined(), 3u);
}

TEST_F(Lifetime, AQuarantineOfNoSizeKeepsNothing) {
    BrokerOptions options;
    options.quarantine = 0;
    Broker none(nullptr, options);
    {
        Request request(none);
        CMNewObjectPath(none.cmpi(), "", "TEST_Thing", nullptr);
    }
    EXPECT_EQ(none.quarantined(), 0u);
}

TEST_F(Lifetime, AVeryLongNameIsCutInTheReport) {
    CMPIString* kept = nullptr;
    {
        Request request(broker);
        kept = CMNewString(mb, std::string(1000, 'x').c_str(), nullptr);
    }
    CMGetCharsPtr(kept, nullptr);
    EXPECT_THAT(broker.violations(),
                ElementsAre("CMPIStringFT.getCharPtr: CMPIString \"" + std::string(47, 'x') +
                            "\" used after its request ended"));
}

class Memory : public BrokerTest {};

TEST_F(Memory, AMarkIsReleasedWithEverythingMadeSince) {
    CMPIObjectPath* const before = newPath();
    CMPIGcStat* const outer = mb->mft->mark(mb, &status);
    CMPIGcStat* const inner = mb->mft->mark(mb, &status);
    CMPIObjectPath* const after = newPath();
    EXPECT_EQ(mb->mft->release(mb, outer).rc, CMPI_RC_OK);
    EXPECT_EQ(CMGetKeyCount(before, &status), 0u);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    CMGetKeyCount(after, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(mb->mft->release(mb, inner).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_THAT(
        broker.violations(),
        ElementsAre(
            "CMPIObjectPathFT.getKeyCount: CMPIObjectPath of TEST_Thing used after it was released",
            "CMPIBrokerMemFT.release without its mark"));
}

TEST_F(Memory, BlocksBelongToTheRequest) {
    CMPIBrokerMemFT* const mft = mb->mft;
    char* const text = mft->cmpiStrDup(mb, "copied");
    EXPECT_STREQ(text, "copied");
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
}

TEST_F(Memory, FreeingWhatIsNoBlockIsAViolation) {
    int stranger = 0;
    mb->mft->cmpiFree(mb, &stranger);
    EXPECT_EQ(mb->mft->cmpiRealloc(mb, &stranger, 10), nullptr);
    EXPECT_THAT(broker.violations(),
                ElementsAre("CMPIBrokerMemFT.cmpiFree of memory that is none of the request"));
}

TEST_F(Memory, ObjectsCanBeFreedEarly) {
    CMPIObjectPath* const path = newPath();
    CMPIInstance* const instance = newInstance();
    CMPIBrokerMemFT* const mft = mb->mft;
    mft->freeInstance(mb, instance);
    mft->freeObjectPath(mb, path);
    mft->freeString(mb, CMNewString(mb, "x", nullptr));
    mft->freeArray(mb, CMNewArray(mb, 1, CMPI_uint8, nullptr));
    mft->freeArgs(mb, CMNewArgs(mb, nullptr));
    mft->freeDateTime(mb, CMNewDateTime(mb, nullptr));
    EXPECT_THAT(broker.violations(), IsEmpty());
    mft->freeObjectPath(mb, path);
    EXPECT_THAT(broker.violations(), ElementsAre("CMPIBrokerMemFT.freeObjectPath: CMPIObjectPath "
                                                 "of TEST_Thing used after it was released"));
}

}  // namespace
}  // namespace cmpihost
