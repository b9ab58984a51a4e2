// The objects that only carry data, as a provider sees them through their tables.
#include "BrokerFixture.h"

#include "support/ComputerSystemService.h"

#include <ctime>

namespace cmpihost {
namespace {

using ArrayObject = BrokerTest;

TEST_F(ArrayObject, HasElementsOfItsTypeOrNull) {
    CMPIArray* const array = newArray(CMPI_chars, 3);
    CMPIString* const text = CMNewString(mb, "two", nullptr);
    EXPECT_EQ(CMSetArrayElementAt(array, 0, "one", CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(CMSetArrayElementAt(array, 1, &text, CMPI_string).rc, CMPI_RC_OK);
    EXPECT_EQ(CMGetArrayCount(array, &status), 3u);
    EXPECT_EQ(CMGetArrayType(array, nullptr), CMPI_string);
    EXPECT_EQ(shown(CMGetArrayElementAt(array, 0, nullptr)), "string one");
    EXPECT_EQ(shown(CMGetArrayElementAt(array, 1, nullptr)), "string two");
    EXPECT_EQ(shown(CMGetArrayElementAt(array, 2, &status)), "null string");
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(ArrayObject, RefusesAnElementOfAnotherTypeOrBeyondItsEnd) {
    CMPIArray* const array = newArray(CMPI_uint16);
    const CMPIUint32 value = 1;
    EXPECT_EQ(CMSetArrayElementAt(array, 0, &value, CMPI_uint32).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(shown(CMGetArrayElementAt(array, 0, nullptr)), "null uint16");
    EXPECT_EQ(CMSetArrayElementAt(array, 1, &value, CMPI_uint16).rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(shown(CMGetArrayElementAt(array, 1, &status)), "missing");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_THAT(broker.violations(), ElementsAre("element of an array of uint16 set to a uint32"));
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
    EXPECT_EQ(shown(CMGetArg(args, "FIRST", &status)), "uint32 5");
    CMPIString* name = nullptr;
    EXPECT_EQ(shown(CMGetArgAt(args, 1, &name, &status)), "string two");
    EXPECT_EQ(textOf(name), "Second");
    EXPECT_EQ(shown(CMGetArg(args, "Third", &status)), "missing");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

class ContextObject : public BrokerTest {
  protected:
    std::vector<std::string> entries(const CMPIContext* context) {
        std::vector<std::string> result;
        for (CMPICount i = 0; i < CMGetContextEntryCount(context, nullptr); ++i) {
            CMPIString* name = nullptr;
            const std::string value = shown(CMGetContextEntryAt(context, i, &name, nullptr));
            EXPECT_EQ(shown(CMGetContextEntry(context, textOf(name).c_str(), &status)), value);
            result.push_back(textOf(name) + '=' + value);
        }
        return result;
    }
};

TEST_F(ContextObject, HoldsTheStandardEntriesWithoutCharactersForWhatIsNotKnown) {
    EXPECT_THAT(entries(request.makeContext({9, "operator", "admin"}, "root/cimv2")),
                ElementsAre("CMPIInvocationFlags=uint32 9", "CMPIPrincipal=string operator",
                            "CMPIInitNameSpace=string root/cimv2", "CMPIRole=string admin"));
    EXPECT_THAT(
        entries(request.makeContext({}, "root/cimv2")),
        ElementsAre("CMPIInvocationFlags=uint32 0", "CMPIPrincipal=string (no characters)",
                    "CMPIInitNameSpace=string root/cimv2", "CMPIRole=string (no characters)"));
}

TEST_F(ContextObject, TakesNewEntries) {
    const CMPIContext* const context = request.makeContext({}, "root/cimv2");
    int payload = 3;
    CMPIValuePtr pointer = {&payload, sizeof payload};
    EXPECT_EQ(CMAddContextEntry(context, "Payload", &pointer, CMPI_ptr).rc, CMPI_RC_OK);
    const CMPIData data = CMGetContextEntry(context, "Payload", &status);
    EXPECT_EQ(data.value.dataPtr.ptr, &payload);
    EXPECT_EQ(data.value.dataPtr.length, sizeof payload);
    EXPECT_EQ(shown(CMGetContextEntry(context, "Unknown", &status)), "missing");
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
