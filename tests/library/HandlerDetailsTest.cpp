#include <fstream>
#include <stdexcept>

#include "host/broker/ResultCollector.h"
#include "library/LibraryFixture.h"

namespace {

using namespace cmpihost;
using testing::HasSubstr;

class HandlerDetails : public LibraryFixture {
  protected:
    static OperationRequest request(Operation operation, const ObjectPathValue& asked,
                                    const std::string& assocClass = "") {
        OperationRequest result;
        result.operation = operation;
        result.path = asked;
        if (!assocClass.empty()) result.assocClass = assocClass;
        return result;
    }
};

TEST_F(HandlerDetails, EveryInstanceCarriesAnEmptyDescriptionAndTheStatusOK) {
    setNodes({"a", "b", "c"});
    const Outcome outcome = enumerate("KORVA_OperatingSystem");
    ASSERT_EQ(outcome.instances.size(), 3U);
    for (const InstanceValue& instance : outcome.instances) {
        EXPECT_EQ(text(instance, "Description"), "");
        EXPECT_EQ(text(instance, "Status"), "OK");
    }
}

TEST_F(HandlerDetails, ResultThatRefusesTheInstanceOfAGetStillGetsDone) {
    const Outcome outcome =
        invoke(request(Operation::GetInstance, operatingSystemPath("host1", "Linux")),
               [](ResultCollector& collector) {
                   collector.failReturnInstance(1, CMPI_RC_ERR_FAILED);
                   collector.failReturnDone(1, CMPI_RC_ERR_FAILED);
               });
    EXPECT_EQ(outcome.rc, CMPI_RC_OK);
    EXPECT_EQ(outcome.refusedInstances.size(), 1U);
    EXPECT_EQ(outcome.doneCount, 1U);
}

TEST_F(HandlerDetails, PropertyListReachesTheAdapterAsItCame) {
    for (const Operation operation : {Operation::EnumerateInstances, Operation::GetInstance}) {
        OperationRequest asked = request(operation, operatingSystemPath("host1", "Linux"));
        recording::clear();
        invoke(asked);
        EXPECT_THAT(recording::takeRendered(), HasSubstr("properties=0\n"));
        asked.properties = std::vector<std::string>{"Name"};
        invoke(asked);
        EXPECT_THAT(recording::takeRendered(), HasSubstr("properties=0x*\n"));
    }
}

TEST_F(HandlerDetails, TextOfAnExceptionIsAskedForOnceAChannel) {
    struct Counting : std::exception {
        const char* what() const noexcept override { return asked++ == 0 ? "first" : "second"; }
        mutable int asked = 0;
    };
    host->throwFromCall(VA::SimulatedHost::Operation::Select, 1, Counting());
    enumerateNames("KORVA_OperatingSystem");
    std::string texts;
    for (const recording::Record& record : recording::take())
        if (record.text.rfind("MESSAGE ", 0) == 0)
            texts += record.channel + record.text.substr(record.text.find("]:") + 2) + ";";
    EXPECT_EQ(texts, "log first;trace second;");
}

TEST_F(HandlerDetails, LineOfARecordIsTheOneInItsText) {
    const OperationRequest requests[] = {
        request(Operation::EnumerateInstances, path("KORVA_OperatingSystem")),
        request(Operation::EnumerateInstances, path("KORVA_RunningOS")),
        request(Operation::Associators, operatingSystemPath("host1", "Linux"),
                "KORVA_OSElementCapabilities")};
    for (const OperationRequest& each : requests) {
        invoke(each);
        for (const recording::Record& record : recording::take()) {
            EXPECT_GT(record.line, 0);
            if (record.file == "include/Trace.h") continue;
            const std::string line = std::to_string(record.line);
            EXPECT_TRUE(record.text.find("Line: " + line + "]") != std::string::npos ||
                        record.text.find("at line " + line + " in") != std::string::npos)
                << record.text;
        }
    }
}

// The function of the provider's handlers in whose body a line of its source stands.
std::string functionAround(unsigned long line) {
    std::ifstream source(KORVA_SOURCE_DIR "/provider/OperatingSystemProvider.cpp");
    const std::string start = "static CMPIStatus ";
    std::string function = "(none)";
    std::string text;
    for (unsigned long number = 1; number <= line && std::getline(source, text); ++number)
        if (text.rfind(start, 0) == 0)
            function = text.substr(start.size(), text.find('(') - start.size());
        else if (text == "}" && number < line)
            function = "(none)";
    return function;
}

TEST_F(HandlerDetails, MarkersBearALineOfTheHandlersOwn) {
    const ObjectPathValue system = operatingSystemPath("host1", "Linux");
    const OperationRequest requests[] = {
        request(Operation::EnumerateInstanceNames, path("KORVA_OperatingSystem")),
        request(Operation::EnumerateInstances, path("KORVA_OperatingSystem")),
        request(Operation::GetInstance, system),
        request(Operation::AssociatorNames, system, "KORVA_RunningOS"),
        request(Operation::Associators, system, "KORVA_RunningOS")};
    for (const OperationRequest& each : requests) {
        recording::clear();
        invoke(each);
        unsigned int markers = 0;
        for (const recording::Record& record : recording::take()) {
            const std::size_t found = record.text.find(" [Line: ");
            if (record.file != "include/Trace.h" || found == std::string::npos) continue;
            ++markers;
            const std::size_t begin = record.text.find(": ") + 2;
            EXPECT_EQ(functionAround(std::stoul(record.text.substr(found + 8))),
                      record.text.substr(begin, record.text.find('(') - begin))
                << record.text;
        }
        EXPECT_EQ(markers, 4U);
    }
}

TEST_F(HandlerDetails, EachCursorSelectsItsNodesOnce) {
    enumerate("KORVA_OperatingSystem");
    EXPECT_EQ(host->calls(VA::SimulatedHost::Operation::Select), 1U);
    enumerate("KORVA_OSElementCapabilities");
    EXPECT_EQ(host->calls(VA::SimulatedHost::Operation::Select), 3U);
}

TEST_F(HandlerDetails, OnlyThePropertiesOfTheClassesAreAskedFor) {
    host->setHook([](const VA::SimulatedHost::Call& call) {
        if (!call.id) return;
        const unsigned int id = *call.id;
        const bool known = id == 108 || id == 128 || id == 134 || (id >= 139 && id <= 153);
        EXPECT_TRUE(known) << id;
    });
    for (const char* className : {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities",
                                  "KORVA_OSElementCapabilities"})
        enumerate(className);
    host->setHook({});
}

// Records fail in every destructor of an adapter or element: the first failure is reported, and
// what was returned before it stays.
TEST_F(HandlerDetails, ExceptionFromADestructorIsReportedLikeAnyOther) {
    const std::pair<const char*, OperationRequest> rows[] = {
        {"~CMPIOperatingSystem",
         request(Operation::EnumerateInstanceNames, path("KORVA_OperatingSystem"))},
        {"~CMPIOperatingSystemCapabilities",
         request(Operation::EnumerateInstanceNames, path("KORVA_OperatingSystemCapabilities"))},
        {"~CMPIInstalledOS", request(Operation::EnumerateInstanceNames, path("KORVA_InstalledOS"))},
        {"~CMPIOSComputerSystem",
         request(Operation::EnumerateInstanceNames, path("KORVA_RunningOS"))},
        {"~CMPIOSElementCapabilities",
         request(Operation::EnumerateInstanceNames, path("KORVA_OSElementCapabilities"))},
        {"~OSElementCapabilities",
         request(Operation::EnumerateInstanceNames, path("KORVA_OSElementCapabilities"))},
        {"~", request(Operation::EnumerateInstanceNames, path("KORVA_OSElementCapabilities"))},
    };
    for (const auto& [function, asked] : rows) {
        const std::string prefix = function;
        recording::setHook([prefix](const recording::Record& record) {
            if (record.function == prefix || (prefix == "~" && record.function[0] == '~'))
                throw std::runtime_error("from a destructor");
        });
        recording::clear();
        const Outcome outcome = invoke(asked);
        EXPECT_EQ(outcome.rc, CMPI_RC_OK) << function;
        EXPECT_EQ(outcome.paths.size(), 1U) << function;
        EXPECT_EQ(outcome.doneCount, 1U) << function;
        const std::string records = recording::takeRendered();
        const std::string message = "]: from a destructor\n";
        EXPECT_NE(records.find(message), std::string::npos) << function;
        EXPECT_EQ(records.find(message, records.find(message) + 1), std::string::npos) << function;
        EXPECT_THAT(records, HasSubstr("markProviderExit"));
    }
}

// While an exception is under way, the records of destructors must not stand in its way.
TEST_F(HandlerDetails, ExceptionFromADestructorDoesNotReplaceTheFirstOne) {
    recording::setHook([](const recording::Record& record) {
        if (record.function[0] == '~') throw std::runtime_error("from a destructor");
    });
    host->throwFromCall(VA::SimulatedHost::Operation::ReadText, 1, std::runtime_error("the first"));
    recording::clear();
    EXPECT_EQ(enumerate("KORVA_OSElementCapabilities").rc, CMPI_RC_OK);
    EXPECT_THAT(recording::takeRendered(), HasSubstr("]: the first\n"));
}

}  // namespace
