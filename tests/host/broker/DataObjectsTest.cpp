#include "BrokerFixture.h"

#include "host/broker/ComputerSystemService.h"

#include <ctime>

namespace cmpihost {
namespace {

using ArrayObject = BrokerTest;

TEST_F(ArrayObject, StartsWithNullElements) {
    CMPIArray* const array = newArray(CMPI_uint16, 3);
    EXPECT_EQ(CMGetArrayCount(array, &status), 3u);
    EXPECT_EQ(CMGetArrayType(array, &status), CMPI_uint16);
    EXPECT_EQ(CMGetArrayElementAt(array, 2, &status).state, CMPI_nullValue);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(ArrayObject, TextElementsComeBackAsStrings) {
    CMPIArray* const array = newArray(CMPI_chars, 2);
    CMPIString* const text = CMNewString(mb, "two", nullptr);
    EXPECT_EQ(CMSetArrayElementAt(array, 0, "one", CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(CMSetArrayElementAt(array, 1, &text, CMPI_string).rc, CMPI_RC_OK);
    EXPECT_EQ(CMGetArrayType(array, nullptr), CMPI_string);
    EXPECT_EQ(textOf(CMGetArrayElementAt(array, 0, nullptr).value.string), "one");
    EXPECT_EQ(CMGetArrayElementAt(array, 1, nullptr).type, CMPI_string);
}

TEST_F(ArrayObject, AnElementOfAnotherTypeIsAViolation) {
    CMPIArray* const array = newArray(CMPI_uint16);
    const CMPIUint32 value = 1;
    EXPECT_EQ(CMSetArrayElementAt(array, 0, &value, CMPI_uint32).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(CMGetArrayElementAt(array, 0, nullptr).state, CMPI_nullValue);
    EXPECT_THAT(broker.violations(), ElementsAre("element of an array of uint16 set to a uint32"));
}

TEST_F(ArrayObject, HasNoElementBeyondItsEnd) {
    CMPIArray* const array = newArray(CMPI_uint16);
    const CMPIUint16 value = 1;
    EXPECT_EQ(CMSetArrayElementAt(array, 1, &value, CMPI_uint16).rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(CMGetArrayElementAt(array, 1, &status).state, CMPI_notFound);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

TEST_F(ArrayObject, IsNotMadeOfArraysNorOfAbsurdSize) {
    EXPECT_EQ(CMNewArray(mb, 1, CMPI_uint16A, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(CMNewArray(mb, 4000000000u, CMPI_uint16, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_NE(CMNewArray(mb, 0, CMPI_uint16, &status), nullptr);
}

using ArgsObject = BrokerTest;

TEST_F(ArgsObject, KeepsArgumentsByNameAndOrder) {
    CMPIArgs* const args = CMNewArgs(mb, &status);
    const CMPIUint32 number = 5;
    EXPECT_EQ(CMAddArg(args, "First", &number, CMPI_uint32).rc, CMPI_RC_OK);
    EXPECT_EQ(CMAddArg(args, "Second", "two", CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(CMGetArgCount(args, &status), 2u);
    EXPECT_EQ(CMGetArg(args, "FIRST", &status).value.uint32, 5u);
    CMPIString* name = nullptr;
    EXPECT_EQ(textOf(CMGetArgAt(args, 1, &name, &status).value.string), "two");
    EXPECT_EQ(textOf(name), "Second");
    EXPECT_EQ(CMGetArg(args, "Third", &status).state, CMPI_notFound);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

using ContextObject = BrokerTest;

TEST_F(ContextObject, HoldsTheStandardEntries) {
    const CMPIContext* const context = request.makeContext({9, "operator", "admin"}, "root/cimv2");
    EXPECT_EQ(CMGetContextEntryCount(context, nullptr), 4u);
    const CMPIData flags = CMGetContextEntry(context, "CMPIInvocationFlags", &status);
    EXPECT_EQ(flags.type, CMPI_uint32);
    EXPECT_EQ(flags.value.uint32, 9u);
    for (const auto& [name, text] : {std::pair("CMPIPrincipal", "operator"),
                                     {"CMPIRole", "admin"},
                                     {"CMPIInitNameSpace", "root/cimv2"}}) {
        EXPECT_EQ(textOf(CMGetContextEntry(context, name, nullptr).value.string), text) << name;
    }
}

TEST_F(ContextObject, AnUnknownPrincipalIsAStringWithoutCharacters) {
    const CMPIContext* const context = request.makeContext({}, "root/cimv2");
    const CMPIData principal = CMGetContextEntry(context, "CMPIPrincipal", &status);
    EXPECT_EQ(principal.type, CMPI_string);
    EXPECT_EQ(principal.state, CMPI_goodValue);
    EXPECT_EQ(textOf(principal.value.string), "(no characters)");
    CMPIString* name = nullptr;
    EXPECT_EQ(textOf(CMGetContextEntryAt(context, 1, &name, nullptr).value.string),
              "(no characters)");
    EXPECT_EQ(textOf(name), "CMPIPrincipal");
}

TEST_F(ContextObject, TakesNewEntries) {
    const CMPIContext* const context = request.makeContext({}, "root/cimv2");
    int payload = 3;
    CMPIValuePtr pointer = {&payload, sizeof payload};
    EXPECT_EQ(CMAddContextEntry(context, "Payload", &pointer, CMPI_ptr).rc, CMPI_RC_OK);
    const CMPIData data = CMGetContextEntry(context, "Payload", &status);
    EXPECT_EQ(data.value.dataPtr.ptr, &payload);
    EXPECT_EQ(data.value.dataPtr.length, sizeof payload);
    EXPECT_EQ(CMGetContextEntry(context, "Unknown", &status).state, CMPI_notFound);
}

class EnumerationObject : public BrokerTest {
  protected:
    EnumerationObject() { broker.route("KORVA_ComputerSystem", service); }

    CMPIEnumeration* enumerate() {
        return CBEnumInstances(mb, request.makeContext({}, "root/cimv2"),
                               newPath("KORVA_ComputerSystem"), nullptr, &status);
    }
    static std::string nameOf(const CMPIData& item) {
        return textOf(CMGetProperty(item.value.inst, "Name", nullptr).value.string);
    }

    ComputerSystemService service{std::vector<std::string>{"one", "two"}};
};

TEST_F(EnumerationObject, HandsItsItemsOutOnce) {
    CMPIEnumeration* const items = enumerate();
    ASSERT_NE(items, nullptr);
    EXPECT_TRUE(CMHasNext(items, &status));
    const CMPIData first = CMGetNext(items, &status);
    EXPECT_EQ(first.type, CMPI_instance);
    EXPECT_EQ(nameOf(first), "one");
    EXPECT_EQ(nameOf(CMGetNext(items, &status)), "two");
    EXPECT_FALSE(CMHasNext(items, &status));
    EXPECT_EQ(CMGetNext(items, &status).state, CMPI_notFound);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(EnumerationObject, GivesAllItemsAsAnArray) {
    CMPIEnumeration* const items = enumerate();
    CMGetNext(items, nullptr);
    CMPIArray* const array = CMToArray(items, &status);
    EXPECT_EQ(CMGetArrayType(array, nullptr), CMPI_instance);
    ASSERT_EQ(CMGetArrayCount(array, nullptr), 2u);
    EXPECT_EQ(nameOf(CMGetArrayElementAt(array, 0, nullptr)), "one");
}

TEST_F(EnumerationObject, ACloneStandsWhereTheOriginalStood) {
    CMPIEnumeration* const items = enumerate();
    CMGetNext(items, nullptr);
    CMPIEnumeration* const copy = CMClone(items, &status);
    EXPECT_EQ(nameOf(CMGetNext(copy, &status)), "two");
    EXPECT_TRUE(CMHasNext(items, nullptr));
    EXPECT_EQ(CMRelease(copy).rc, CMPI_RC_OK);
}

using DateTimeObject = BrokerTest;

TEST_F(DateTimeObject, KeepsTheTextThatItWasMadeOf) {
    CMPIDateTime* const date = CMNewDateTimeFromChars(mb, "20000229133456.000007+060", &status);
    EXPECT_EQ(textOf(CMGetStringFormat(date, nullptr)), "20000229133456.000007+060");
    EXPECT_EQ(CMGetBinaryFormat(date, &status), 951827696000007u);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_FALSE(CMIsInterval(date, nullptr));
}

TEST_F(DateTimeObject, IsMadeOfMicroseconds) {
    CMPIDateTime* const date = CMNewDateTimeFromBinary(mb, 951827696000007u, 0, &status);
    EXPECT_EQ(textOf(CMGetStringFormat(date, nullptr)), "20000229123456.000007+000");
    CMPIDateTime* const interval = CMNewDateTimeFromBinary(mb, 93784000005u, 1, &status);
    EXPECT_EQ(textOf(CMGetStringFormat(interval, nullptr)), "00000001020304.000005:000");
    EXPECT_TRUE(CMIsInterval(interval, nullptr));
}

TEST_F(DateTimeObject, IsNotMadeOfWhatIsNone) {
    EXPECT_EQ(CMNewDateTimeFromChars(mb, "yesterday", &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(CMNewDateTimeFromBinary(mb, 253402300800000000u, 0, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(DateTimeObject, AnInstantBefore1970HasNoMicroseconds) {
    CMPIDateTime* const date = CMNewDateTimeFromChars(mb, "19691231235959.999999+000", &status);
    EXPECT_EQ(CMGetBinaryFormat(date, &status), 0u);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
}

TEST_F(DateTimeObject, TheNewestOneIsNow) {
    CMPIDateTime* const date = CMNewDateTime(mb, &status);
    const auto seconds = static_cast<long long>(CMGetBinaryFormat(date, nullptr) / 1000000);
    EXPECT_NEAR(static_cast<double>(seconds), static_cast<double>(std::time(nullptr)), 60.0);
}

}  // namespace
}  // namespace cmpihost
