// Macros that do more than call a slot: they return or fill a status, examine values, and pass
// variable lists.
#include <cmpi/cmpimacs.h>

#include <cstdarg>

#include "RecordingTables.h"

namespace {

using cmpi_test::CmpiMacros;
using cmpi_test::encode;
using cmpi_test::lastCall;

CMPIStatus returnCode(CMPIrc code) {
    CMReturn(code);
}

CMPIStatus returnString(CMPIrc code, CMPIString* message) {
    CMReturnWithString(code, message);
}

CMPIStatus returnChars(const CMPIBroker* mb, CMPIrc code, const char* text) {
    CMReturnWithChars(mb, code, text);
}

TEST_F(CmpiMacros, ReturnMacrosMakeAStatus) {
    const CMPIStatus plain = returnCode(CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(plain.rc, 7u);
    EXPECT_EQ(plain.msg, nullptr);

    const CMPIStatus withString = returnString(CMPI_RC_ERR_NOT_FOUND, &stringObject);
    EXPECT_EQ(withString.rc, 6u);
    EXPECT_EQ(withString.msg, &stringObject);
}

TEST_F(CmpiMacros, ReturnWithCharsMakesAStringThroughTheBroker) {
    const CMPIStatus status = returnChars(mb, CMPI_RC_ERR_FAILED, text);
    EXPECT_EQ(status.rc, 1u);
    expectCall("CMPIBrokerEncFT.newString", status.msg, mb, text, nullptr);
}

TEST_F(CmpiMacros, SetStatusOverwritesCodeAndMessage) {
    CMPIStatus status = {CMPI_RC_ERROR, &stringObject};
    CMSetStatus(&status, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(status.rc, 2u);
    EXPECT_EQ(status.msg, nullptr);

    CMSetStatusWithString(&status, CMPI_RC_ERR_INVALID_CLASS, &stringObject);
    EXPECT_EQ(status.rc, 5u);
    EXPECT_EQ(status.msg, &stringObject);

    CMSetStatusWithChars(mb, &status, CMPI_RC_ERR_FAILED, text);
    EXPECT_EQ(status.rc, 1u);
    expectCall("CMPIBrokerEncFT.newString", status.msg, mb, text, nullptr);
}

TEST_F(CmpiMacros, SetStatusFitsAnIfWithoutBraces) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    if (status.rc != CMPI_RC_OK)
        CMSetStatus(&status, CMPI_RC_ERROR);
    else
        CMSetStatus(&status, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(status.rc, 6u);
}

TEST_F(CmpiMacros, ANullObjectIsANullPointerOrANullHandle) {
    const CMPIInstance* nothing = nullptr;
    const CMPIInstance dead = {nullptr, table<CMPIInstanceFT>()};
    const CMPIInstance* const deadPointer = &dead;
    EXPECT_TRUE(CMIsNullObject(nothing));
    EXPECT_TRUE(CMIsNullObject(deadPointer));
    EXPECT_FALSE(CMIsNullObject(inst));
}

TEST_F(CmpiMacros, TestsOfDataYieldTheRawBit) {
    const CMPIData missing = {CMPI_string, CMPI_nullValue, {0}};
    const CMPIData keys_ = {CMPI_uint16A, CMPI_keyValue, {0}};
    EXPECT_EQ(CMIsNullValue(missing), 0x100);
    EXPECT_EQ(CMIsKeyValue(missing), 0);
    EXPECT_EQ(CMIsArray(missing), 0);
    EXPECT_EQ(CMIsNullValue(keys_), 0);
    EXPECT_EQ(CMIsKeyValue(keys_), 0x200);
    EXPECT_EQ(CMIsArray(keys_), 0x2000);
}

TEST_F(CmpiMacros, GetCharPtrReadsTheHandleWithoutACall) {
    char characters[] = "debian";
    const CMPIString string = {characters, nullptr};
    EXPECT_EQ(CMGetCharPtr(&string), characters);
    EXPECT_EQ(lastCall.slot, "");
}

// Reads the arguments of a message as an object manager does, by the types in the list.
void recordList(CMPICount count, va_list list) {
    lastCall.arguments.push_back(count);
    for (CMPICount i = 0; i < count; ++i) {
        const int type = va_arg(list, int);
        lastCall.arguments.push_back(encode(type));
        switch (type) {
            case CMPI_boolean:
            case CMPI_sint32:
                lastCall.arguments.push_back(encode(va_arg(list, int)));
                break;
            case CMPI_uint32:
                lastCall.arguments.push_back(va_arg(list, CMPIUint32));
                break;
            case CMPI_sint64:
            case CMPI_uint64:
                lastCall.arguments.push_back(va_arg(list, CMPIUint64));
                break;
            case CMPI_real64:
                lastCall.arguments.push_back(encode(va_arg(list, double)));
                break;
            default:
                lastCall.arguments.push_back(encode(va_arg(list, void*)));
        }
    }
}

CMPIString* recordMessage(const CMPIBroker* mb, const char* id, const char* text, CMPIStatus* rc,
                          CMPICount count, ...) {
    lastCall = {"getMessage", {encode(mb), encode(id), encode(text), encode(rc)}};
    va_list list;
    va_start(list, count);
    recordList(count, list);
    va_end(list);
    return cmpi_test::cannedResult<CMPIString*>();
}

CMPIString* recordMessage2(const CMPIBroker* mb, const char* id, CMPIMsgFileHandle file,
                           const char* text, CMPIStatus* rc, CMPICount count, ...) {
    lastCall = {"getMessage2", {encode(mb), encode(id), encode(file), encode(text), encode(rc)}};
    va_list list;
    va_start(list, count);
    recordList(count, list);
    va_end(list);
    return cmpi_test::cannedResult<CMPIString*>();
}

TEST_F(CmpiMacros, AMessagePassesItsListOfTypesAndValues) {
    brokerObject.eft->getMessage = recordMessage;
    expectCall("getMessage", CMGetMessage(mb, name, text, rc, CMFmtArgs0()), mb, name, text, rc, 0);
    expectCall("getMessage", CMGetMessage(mb, name, text, rc, 1, CMPI_chars, ns), mb, name, text,
               rc, 1, 0x1700, ns);
    expectCall("getMessage",
               CMGetMessage(mb, name, text, rc, CMFmtArgs2(CMFmtChars(ns), CMFmtUint(4000000000U))),
               mb, name, text, rc, 2, 0x1700, ns, 0xA0, 4000000000U);
}

TEST_F(CmpiMacros, AMessageFromAFilePassesItsListOfTypesAndValues) {
    brokerObject.eft->getMessage2 = recordMessage2;
    CMPIMsgFileHandle const file = &number;
    expectCall("getMessage2",
               CMGetMessage2(mb, name, file, text, rc,
                             CMFmtArgs3(CMFmtSint(-1), CMFmtSint64(1LL << 40), CMFmtReal(8.0))),
               mb, name, &number, text, rc, 3, 0xE0, -1, 0xF0, 1LL << 40, 12, 8);
    expectCall("getMessage2",
               CMGetMessage2(mb, name, file, text, rc,
                             CMFmtArgs3(CMFmtBoolean(&number), CMFmtUint64(~0ULL),
                                        CMFmtString(&stringObject))),
               mb, name, &number, text, rc, 3, 2, 1, 0xB0, ~0ULL, 0x1600, &stringObject);
}

template <class... Arguments>
bool startsWithItsLength(int count, Arguments...) {
    return count == sizeof...(Arguments);
}

TEST_F(CmpiMacros, AListStartsWithTheNumberOfItsPairs) {
    EXPECT_TRUE(startsWithItsLength(CMFmtArgs0()));
    EXPECT_TRUE(startsWithItsLength(CMFmtArgs1(1)));
    EXPECT_TRUE(startsWithItsLength(CMFmtArgs2(1, 2)));
    EXPECT_TRUE(startsWithItsLength(CMFmtArgs3(1, 2, 3)));
    EXPECT_TRUE(startsWithItsLength(CMFmtArgs4(1, 2, 3, 4)));
    EXPECT_TRUE(startsWithItsLength(CMFmtArgs5(1, 2, 3, 4, 5)));
    EXPECT_TRUE(startsWithItsLength(CMFmtArgs6(1, 2, 3, 4, 5, 6)));
    EXPECT_TRUE(startsWithItsLength(CMFmtArgs7(1, 2, 3, 4, 5, 6, 7)));
    EXPECT_TRUE(startsWithItsLength(CMFmtArgs8(1, 2, 3, 4, 5, 6, 7, 8)));
    EXPECT_TRUE(startsWithItsLength(CMFmtArgs9(1, 2, 3, 4, 5, 6, 7, 8, 9)));
    EXPECT_TRUE(startsWithItsLength(CMFmtArgs10(1, 2, 3, 4, 5, 6, 7, 8, 9, 10)));
}

TEST_F(CmpiMacros, AListTakesTenPairs) {
    brokerObject.eft->getMessage = recordMessage;
    CMGetMessage(
        mb, name, text, rc,
        CMFmtArgs10(CMFmtUint(1), CMFmtUint(2), CMFmtUint(3), CMFmtUint(4), CMFmtUint(5),
                    CMFmtUint(6), CMFmtUint(7), CMFmtUint(8), CMFmtUint(9), CMFmtUint(10)));
    ASSERT_EQ(lastCall.arguments.size(), 4u + 1u + 20u);
    EXPECT_EQ(lastCall.arguments[4], 10u);
    EXPECT_EQ(lastCall.arguments[24], 10u);
}

}  // namespace
