#include <stdexcept>

#include "library/LibraryFixture.h"

#include "ProviderUtilities.h"

// This program answers for the framework which id a class has: its definitions of getClassId come
// before the library's when the loader binds the provider.

namespace {

unsigned short answered = 0;
bool throwing = false;

using namespace cmpihost;

class ClassIds : public LibraryFixture {};

bool isOneOf(unsigned int id, std::initializer_list<unsigned int> ids) {
    for (const unsigned int each : ids)
        if (each == id) return true;
    return false;
}

std::string rejected(const std::string& handler, unsigned int id) {
    const std::string category = "Zumbrel.OperatingSystemProvider 4000 null 0 0 | ";
    const std::string banner =
        "==============================================================================\n";
    return "both markProviderEntry include/Trace.h:336 " + category + banner +
           "both markProviderEntry include/Trace.h:337 " + category + "ENTERING: " + handler +
           "() in OperatingSystemProvider.cpp [Line: #]\n" + "both " + handler +
           " OperatingSystemProvider.cpp:# " + category + "VARIABLE: 'classId' has Value '" +
           std::to_string(id) + "' at line # in OperatingSystemProvider.cpp\n" +
           "both markProviderExit include/Trace.h:348 " + category + "EXITING: " + handler +
           "() in OperatingSystemProvider.cpp [Line: #]\n" +
           "both markProviderExit include/Trace.h:349 " + category + banner;
}

TEST_F(ClassIds, InstanceRequestsRejectEveryIdFrom0To70ButTheFiveServed) {
    for (unsigned int id = 0; id <= 70; ++id) {
        if (isOneOf(id, {55, 56, 57, 64, 65})) continue;
        answered = static_cast<unsigned short>(id);
        recording::clear();
        for (const Outcome& outcome :
             {enumerateNames("KORVA_OperatingSystem"), enumerate("KORVA_OperatingSystem"),
              get(operatingSystemPath("host1", "Linux"))}) {
            EXPECT_EQ(outcome.rc, CMPI_RC_ERR_INVALID_CLASS) << id;
            EXPECT_FALSE(outcome.message.has_value()) << id;
            EXPECT_EQ(outcome.doneCount, 0U) << id;
        }
        EXPECT_EQ(recording::takeRendered(), rejected("OperatingSystem_EnumInstanceNames", id) +
                                                 rejected("OperatingSystem_EnumInstances", id) +
                                                 rejected("OperatingSystem_GetInstance", id));
    }
}

TEST_F(ClassIds, AssociationRequestsRejectEveryIdFrom0To70ButTheThreeServed) {
    for (unsigned int id = 0; id <= 70; ++id) {
        if (isOneOf(id, {57, 64, 65})) continue;
        answered = static_cast<unsigned short>(id);
        const ObjectPathValue source = operatingSystemPath("host1", "Linux");
        recording::clear();
        for (const Outcome& outcome :
             {associatorNames(source, "KORVA_RunningOS"), associators(source, "KORVA_RunningOS")}) {
            EXPECT_EQ(outcome.rc, CMPI_RC_ERR_INVALID_CLASS) << id;
            EXPECT_FALSE(outcome.message.has_value()) << id;
            EXPECT_EQ(outcome.doneCount, 0U) << id;
        }
        EXPECT_EQ(recording::takeRendered(), rejected("OperatingSystem_AssociatorNames", id) +
                                                 rejected("OperatingSystem_Associators", id));
    }
}

TEST_F(ClassIds, ExceptionFromTheFrameworkLeavesTheHandler) {
    throwing = true;
    EXPECT_THROW(enumerateNames("KORVA_OperatingSystem"), std::runtime_error);
    EXPECT_THROW(associators(capabilitiesPath("Linux"), "KORVA_OSElementCapabilities"),
                 std::runtime_error);
    throwing = false;
}

TEST_F(ClassIds, LargestIdIsRecordedUncut) {
    answered = 65535;
    enumerateNames("KORVA_OperatingSystem");
    EXPECT_EQ(recording::takeRendered(), rejected("OperatingSystem_EnumInstanceNames", 65535));
}

}  // namespace

namespace VA {

unsigned short ProviderUtilities::getClassId(const CMPIObjectPath*) {
    if (throwing) throw std::runtime_error("from the framework");
    return answered;
}

unsigned short ProviderUtilities::getClassId(const char*) {
    return getClassId(static_cast<const CMPIObjectPath*>(nullptr));
}

}  // namespace VA
