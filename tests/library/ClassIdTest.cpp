// This program answers for the framework which id a class has: its definitions of getClassId come
// before the library's when the loader binds the provider. So every id can be tried.
#include <functional>
#include <set>
#include <stdexcept>

#include "ProviderUtilities.h"
#include "library/LibraryFixture.h"

namespace {

unsigned short answered = 0;
std::function<void()> onQuestion = [] {};

using namespace cmpihost;

class ClassIds : public LibraryFixture {};

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

TEST_F(ClassIds, HandlersRejectEveryIdFrom0To70ButTheServedOnes) {
    const std::set<unsigned int> associations = {57, 64, 65};
    const std::set<unsigned int> all = {55, 56, 57, 64, 65};
    for (const NamedRequest& each : oneRequestOfEachHandler()) {
        const bool walk = each.request.assocClass.has_value();
        for (unsigned int id = 0; id <= 70; ++id) {
            if ((walk ? associations : all).count(id) != 0) continue;
            SCOPED_TRACE(testing::Message() << each.handler << " with id " << id);
            answered = static_cast<unsigned short>(id);
            recording::clear();
            const Outcome outcome = invoke(each.request);
            EXPECT_EQ(outcome.rc, CMPI_RC_ERR_INVALID_CLASS);
            EXPECT_FALSE(outcome.message.has_value());
            EXPECT_EQ(outcome.doneCount, 0U);
            EXPECT_EQ(recording::takeRendered(), rejected(each.handler, id));
        }
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
    answered = 0;
    for (const NamedRequest& each : oneRequestOfEachHandler()) {
        std::string before;
        onQuestion = [&before] { before += recording::takeRendered() + "asked\n"; };
        recording::clear();
        invoke(each.request);
        onQuestion = [] {};
        EXPECT_EQ(before, entered(each.handler) + "asked\n");
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
