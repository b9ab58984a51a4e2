#include "BrokerFixture.h"

#include <algorithm>
#include <cstring>

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

TEST(CompleteBroker, LeavesNoSlotEmpty) {
    Broker broker;
    Request request(broker);
    const CMPIBroker* const mb = broker.cmpi();
    const std::size_t front = sizeof(void*);
    EXPECT_EQ(nullSlots(*mb->bft, offsetof(CMPIBrokerFT, prepareAttachThread)), 0u);
    EXPECT_EQ(nullSlots(*mb->eft, front), 0u);
    EXPECT_EQ(nullSlots(*mb->xft, front), 0u);
    EXPECT_EQ(nullSlots(*mb->mft, front), 0u);
    CMPIObjectPath* const path = CMNewObjectPath(mb, "", "TEST_Thing", nullptr);
    EXPECT_EQ(nullSlots(*path->ft, front), 0u);
    EXPECT_EQ(nullSlots(*CMNewInstance(mb, path, nullptr)->ft, front), 0u);
    EXPECT_EQ(nullSlots(*CMNewString(mb, "", nullptr)->ft, front), 0u);
    EXPECT_EQ(nullSlots(*CMNewArray(mb, 0, CMPI_uint8, nullptr)->ft, front), 0u);
    EXPECT_EQ(nullSlots(*CMNewArgs(mb, nullptr)->ft, front), 0u);
    EXPECT_EQ(nullSlots(*CMNewDateTime(mb, nullptr)->ft, front), 0u);
    EXPECT_EQ(nullSlots(*request.makeContext({}, "")->ft, front), 0u);
}

TEST(CompleteBroker, LeavesNoSlotEmptyInDeadObjects) {
    Broker broker;
    Request request(broker);
    const CMPIBroker* const mb = broker.cmpi();
    CMPIObjectPath* const path = CMNewObjectPath(mb, "", "TEST_Thing", nullptr);
    CMPIInstance* const instance = CMNewInstance(mb, path, nullptr);
    CMPIString* const string = CMNewString(mb, "", nullptr);
    request.end();
    EXPECT_EQ(nullSlots(*path->ft, sizeof(void*)), 0u);
    EXPECT_EQ(nullSlots(*instance->ft, sizeof(void*)), 0u);
    EXPECT_EQ(nullSlots(*string->ft, sizeof(void*)), 0u);
}

TEST(SparseBroker, AnnouncesLowVersionsAndLacksWhatMayBeMissing) {
    Broker broker(nullptr, BrokerOptions::sparse());
    Request request(broker);
    const CMPIBroker* const mb = broker.cmpi();
    EXPECT_EQ(mb->bft->brokerVersion, 0u);
    EXPECT_EQ(mb->eft->ftVersion, 1);
    EXPECT_EQ(mb->xft->ftVersion, 200);
    EXPECT_EQ(mb->mft, nullptr);
    EXPECT_EQ(mb->eft->newCMPIError, nullptr);
    EXPECT_EQ(mb->eft->openMessageFile, nullptr);
    EXPECT_EQ(mb->eft->closeMessageFile, nullptr);
    EXPECT_EQ(mb->eft->getMessage2, nullptr);
    EXPECT_EQ(mb->xft->joinThread, nullptr);
    EXPECT_EQ(mb->xft->exitThread, nullptr);
    EXPECT_EQ(mb->xft->cancelThread, nullptr);
    EXPECT_EQ(mb->xft->threadSleep, nullptr);
    EXPECT_EQ(mb->xft->signalCondition, nullptr);
    EXPECT_NE(mb->xft->newMutex, nullptr);

    CMPIObjectPath* const path = CMNewObjectPath(mb, "", "TEST_Thing", nullptr);
    EXPECT_EQ(path->ft->ftVersion, 1);
    EXPECT_EQ(path->ft->getClassQualifier, nullptr);
    EXPECT_EQ(path->ft->getPropertyQualifier, nullptr);
    EXPECT_EQ(path->ft->getMethodQualifier, nullptr);
    EXPECT_EQ(path->ft->getParameterQualifier, nullptr);
    EXPECT_EQ(CMNewInstance(mb, path, nullptr)->ft->setPropertyWithOrigin, nullptr);
}

TEST(SparseBroker, TellsMissingItemsAndKeysInItsOwnWay) {
    Broker broker(nullptr, BrokerOptions::sparse());
    Request request(broker);
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIObjectPath* const path = CMNewObjectPath(broker.cmpi(), "", "TEST_Thing", nullptr);
    EXPECT_EQ(CMGetKey(path, "Name", &status).state, CMPI_notFound);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    CMAddKey(path, "Name", "x", CMPI_chars);
    EXPECT_EQ(CMGetKey(path, "Name", &status).state, CMPI_goodValue);
    const CMPIContext* const context = request.makeContext({}, "root");
    EXPECT_EQ(CMGetContextEntryCount(context, nullptr), 2u);
    EXPECT_EQ(CMGetContextEntry(context, "CMPIInitNameSpace", &status).state, CMPI_notFound);
}

TEST(SparseBroker, RecognisesDeadObjectsAllTheSame) {
    Broker broker(nullptr, BrokerOptions::sparse());
    CMPIObjectPath* path = nullptr;
    {
        Request request(broker);
        path = CMNewObjectPath(broker.cmpi(), "", "TEST_Thing", nullptr);
    }
    CMGetKeyCount(path, nullptr);
    EXPECT_EQ(broker.violations().size(), 1u);
}

TEST(BrokersOfSeveralKinds, UnderstandEachOthersObjects) {
    Broker complete;
    Broker sparse(nullptr, BrokerOptions::sparse());
    Request first(complete);
    Request second(sparse);
    CMPIObjectPath* const path = CMNewObjectPath(complete.cmpi(), "", "TEST_Thing", nullptr);
    CMPIInstance* const instance = CMNewInstance(sparse.cmpi(), path, nullptr);
    ASSERT_NE(instance, nullptr);
    EXPECT_EQ(valueOf(instance).path.className, "TEST_Thing");
}

TEST(SparseBroker, SetsTheKeysOfAPathAsProperties) {
    Broker broker(nullptr, BrokerOptions::sparse());
    Request request(broker);
    CMPIObjectPath* const path = CMNewObjectPath(broker.cmpi(), "", "TEST_Thing", nullptr);
    CMAddKey(path, "Name", "x", CMPI_chars);
    const InstanceValue made = valueOf(CMNewInstance(broker.cmpi(), path, nullptr));
    ASSERT_EQ(made.properties.size(), 1u);
    EXPECT_EQ(made.property("Name")->text(), "x");
}

}  // namespace
}  // namespace cmpihost
