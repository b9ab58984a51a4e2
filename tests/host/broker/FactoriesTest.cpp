// What a provider may ask of the broker about objects and texts, and what the broker does not
// offer.
#include "BrokerFixture.h"

#include "host/broker/ResultCollector.h"

namespace cmpihost {
namespace {

using MissingServices = BrokerTest;

TEST_F(MissingServices, ErrorsAndQueriesAreNotMade) {
    CMPIArray* names = newArray(CMPI_string);
    EXPECT_EQ(CMNewSelectExp(mb, "SELECT * FROM A", "WQL", &names, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(names, nullptr);
    EXPECT_EQ(
        CMNewCMPIError(mb, "", "", "", ErrorSevLow, ErrorProbCauseUnknown, CMPI_RC_OK, &status),
        nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

using Messages = BrokerTest;

TEST_F(Messages, TakeArgumentsOfEveryKind) {
    CMPIString* const string = CMNewString(mb, "string", nullptr);
    CMPIString* const text = mb->eft->getMessage(
        mb, "ID", "$0 $1 $2 $3 $4 $5 $6 $7 $8", &status, 9, CMPI_sint32, -1, CMPI_uint32,
        4294967295u, CMPI_sint64, -2LL, CMPI_uint64, 18446744073709551615ULL, CMPI_real64, 0.5,
        CMPI_boolean, 1, CMPI_chars, "chars", CMPI_string, string, CMPI_chars,
        static_cast<const char*>(nullptr));
    EXPECT_EQ(textOf(text), "-1 4294967295 -2 18446744073709551615 0.5 true chars string NULL");
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(Messages, TakeTenArguments) {
    CMPIString* const text = mb->eft->getMessage(
        mb, "ID", "$0$1$2$3$4$5$6 $7 $8 $9", &status, 10, CMPI_uint8, 1, CMPI_sint8, -2,
        CMPI_uint16, 3, CMPI_sint16, -4, CMPI_char16, 5, CMPI_real32, 0.5, CMPI_boolean, 0,
        CMPI_uint8, 7, CMPI_uint8, 8, CMPI_uint8, 9);
    EXPECT_EQ(textOf(text), "1-23-450.5false 7 8 9");
}

TEST_F(Messages, LeaveAloneWhatIsNoArgument) {
    CMPIString* const text =
        mb->eft->getMessage(mb, "ID", "$1 costs 5$, $$0 $", &status, 1, CMPI_chars, "x");
    EXPECT_EQ(textOf(text), "$1 costs 5$, $x $");
}

TEST_F(Messages, RefuseMoreThanTenArgumentsAndStrangeTypes) {
    EXPECT_EQ(mb->eft->getMessage(mb, "ID", "$0", &status, 11), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(mb->eft->getMessage(mb, "ID", "$0", &status, 1, CMPI_instance, nullptr), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
}

TEST_F(Messages, HaveNoFiles) {
    CMPIMsgFileHandle handle = &status;
    EXPECT_EQ(CMOpenMessageFile(mb, "texts", &handle).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(handle, nullptr);
    EXPECT_EQ(CMCloseMessageFile(mb, handle).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(
        textOf(mb->eft->getMessage2(mb, "ID", handle, "default $0", &status, 1, CMPI_sint32, 3)),
        "default 3");
}

TEST_F(Messages, LoggedAndTracedOnesAreTaken) {
    CMPIString* const string = CMNewString(mb, "from a string", nullptr);
    EXPECT_EQ(CMLogMessage(mb, CMPI_SEV_WARNING, "ID", "text", string).rc, CMPI_RC_OK);
    EXPECT_EQ(CMTraceMessage(mb, CMPI_LEV_VERBOSE, "component", nullptr, string).rc, CMPI_RC_OK);
    EXPECT_EQ(CMLogMessage(mb, CMPI_SEV_INFO, nullptr, nullptr, nullptr).rc, CMPI_RC_OK);
    EXPECT_THAT(broker.violations(), IsEmpty());
    mb->mft->freeString(mb, string);
    EXPECT_EQ(CMLogMessage(mb, CMPI_SEV_INFO, "ID", nullptr, string).rc,
              CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(broker.violations().size(), 1u);
}

using ObjectQuestions = BrokerTest;

TEST_F(ObjectQuestions, EveryKindKnowsItsTypeAndHasAText) {
    CMPIInstance* const instance = newInstance();
    CMSetProperty(instance, "Name", "x", CMPI_chars);
    const CMPIUint16 number = 3;
    CMSetProperty(instance, "Size", &number, CMPI_uint16);
    CMPIArgs* const args = CMNewArgs(mb, nullptr);
    CMAddArg(args, "A", "b", CMPI_chars);
    ResultCollector collector(request);
    const struct {
        const void* object;
        const char* type;
        const char* text;
    } rows[] = {
        {CMNewString(mb, "plain", nullptr), "CMPIString", "plain"},
        {newPath(), "CMPIObjectPath", "root/cimv2:TEST_Thing"},
        {instance, "CMPIInstance", "root/cimv2:TEST_Thing {Name=\"x\", Size=3}"},
        {newArray(CMPI_uint8, 2), "CMPIArray", "{NULL, NULL}"},
        {args, "CMPIArgs", "{A=\"b\"}"},
        {request.makeContext({}, "n"), "CMPIContext",
         "{CMPIInvocationFlags=0, CMPIPrincipal=NULL, CMPIInitNameSpace=\"n\", CMPIRole=NULL}"},
        {CMNewDateTimeFromBinary(mb, 0, 0, nullptr), "CMPIDateTime", "19700101000000.000000+000"},
        {collector.cmpi(), "CMPIResult", "CMPIResult"}};
    for (const auto& row : rows) {
        EXPECT_EQ(textOf(CDGetType(mb, row.object, &status)), row.type);
        EXPECT_EQ(textOf(CDToString(mb, row.object, &status)), row.text);
        EXPECT_TRUE(CDIsOfType(mb, row.object, row.type, &status)) << row.type;
        EXPECT_FALSE(CDIsOfType(mb, row.object, "CMPIError", &status)) << row.type;
    }
}

TEST_F(ObjectQuestions, WhatIsNoObjectIsAViolation) {
    struct {
        void* hdl = nullptr;
        void* ft = nullptr;
    } stranger;
    EXPECT_EQ(CDGetType(mb, &stranger, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(CDToString(mb, nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_THAT(broker.violations(), ElementsAre("CMPIBrokerEncFT.getType: no object of this host",
                                                 "CMPIBrokerEncFT.toString: null object"));
}

TEST_F(ObjectQuestions, ClassesDescendAsTheCatalogueSays) {
    const TestCatalogue catalogue = testClasses();
    Broker schooled(&catalogue);
    RequestScope scope(schooled);
    const CMPIBroker* const other = schooled.cmpi();
    const CMPIObjectPath* const small = CMNewObjectPath(other, "", "TEST_SmallThing", nullptr);
    for (const char* const ancestor : {"test_smallthing", "TEST_Thing", "CIM_Thing"}) {
        EXPECT_TRUE(CMClassPathIsA(other, small, ancestor, &status)) << ancestor;
    }
    EXPECT_FALSE(CMClassPathIsA(other, small, "TEST_Other", &status));
    EXPECT_FALSE(CMClassPathIsA(mb, newPath("TEST_SmallThing"), "TEST_Thing", &status));
}

}  // namespace
}  // namespace cmpihost
