#include <functional>
#include <stdexcept>

#include "library/LibraryFixture.h"

#include "ProviderUtilities.h"

// This program answers for the framework which id a class has: its definitions of getClassId come
// before the library's when the loader binds the provider.

namespace {

unsigned short answered = 0;
std::function<void()> onQuestion = [] {};

using namespace cmpihost;

class ClassIds : public LibraryFixture {};

bool isOneOf(unsigned int id, std::initializer_list<unsigned int> ids) {
    for (const unsigned int each : ids)
        if (each == id) return true;
    return false;
}

const std::string category = "Zumbrel.OperatingSystemProvider 4000 null 0 0 | ";
const std::string banner =
    "==============================================================================\n";

std::string entered(const std::string& handler) {
    return "both markProviderEntry include/Trace.h:336 " + category + banner +
           "both markProviderEntry include/Trace.h:337 " + category + "ENTERING: " + handler +
           "() in OperatingSystemProvider.cpp [Line: #]\n";
}

std::string rejected(const std::string& handler, unsigned int id) {
    return entered(handler) + "both " + handler + " OperatingSystemProvider.cpp:# " + category +
           "VARIABLE: 'classId' has Value '" + std::to_string(id) +
           "' at line # in OperatingSystemProvider.cpp\n" +
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
    onQuestion = [] { throw std::runtime_error("from the framework"); };
    EXPECT_THROW(enumerateNames("KORVA_OperatingSystem"), std::runtime_error);
    EXPECT_THROW(associators(capabilitiesPath("Linux"), "KORVA_OSElementCapabilities"),
                 std::runtime_error);
    onQuestion = [] {};
}

TEST_F(ClassIds, AreAskedForOnceTheEntryMarkerIsWritten) {
    const ObjectPathValue system = operatingSystemPath("host1", "Linux");
    const std::pair<const char*, std::function<void()>> requests[] = {
        {"OperatingSystem_EnumInstanceNames", [&] { enumerateNames("KORVA_OperatingSystem"); }},
        {"OperatingSystem_EnumInstances", [&] { enumerate("KORVA_OperatingSystem"); }},
        {"OperatingSystem_GetInstance", [&] { get(system); }},
        {"OperatingSystem_AssociatorNames", [&] { associatorNames(system, "KORVA_RunningOS"); }},
        {"OperatingSystem_Associators", [&] { associators(system, "KORVA_RunningOS"); }},
    };
    answered = 0;
    for (const auto& [handler, request] : requests) {
        std::string before;
        onQuestion = [&before] { before += recording::takeRendered() + "asked\n"; };
        recording::clear();
        request();
        onQuestion = [] {};
        EXPECT_EQ(before, entered(handler) + "asked\n");
    }
}

// The handler and the adapter each ask for the class of the path.
TEST_F(ClassIds, PathThatTellsTheAdapterAnotherClassYieldsNothingAndDone) {
    const std::pair<unsigned short, const char*> associations[] = {
        {57, "KORVA_InstalledOS"}, {64, "KORVA_RunningOS"}, {65, "KORVA_OSElementCapabilities"}};
    const unsigned short others[] = {0, 1, 55, 56, 57, 64, 65, 66};
    for (const auto& [id, className] : associations) {
        for (const unsigned short other : others) {
            if (other == id) continue;
            for (const bool names : {true, false}) {
                answered = id;
                int questions = 0;
                onQuestion = [&questions, told = other] {
                    if (++questions == 2) answered = told;
                };
                const Outcome outcome = names ? enumerateNames(className) : enumerate(className);
                EXPECT_EQ(outcome.rc, CMPI_RC_OK) << id << ' ' << other;
                EXPECT_TRUE(outcome.paths.empty()) << id << ' ' << other;
                EXPECT_TRUE(outcome.instances.empty()) << id << ' ' << other;
                EXPECT_EQ(outcome.doneCount, 1U) << id << ' ' << other;
            }
        }
    }
    onQuestion = [] {};
}

TEST_F(ClassIds, LargestIdIsRecordedUncut) {
    answered = 65535;
    enumerateNames("KORVA_OperatingSystem");
    EXPECT_EQ(recording::takeRendered(), rejected("OperatingSystem_EnumInstanceNames", 65535));
}

}  // namespace

namespace VA {

unsigned short ProviderUtilities::getClassId(const CMPIObjectPath*) {
    onQuestion();
    return answered;
}

unsigned short ProviderUtilities::getClassId(const char*) {
    return getClassId(static_cast<const CMPIObjectPath*>(nullptr));
}

}  // namespace VA
