#include <new>
#include <stdexcept>

#include "FrameworkException.h"
#include "InstrumentationException.h"
#include "ProviderException.h"
#include "library/LibraryFixture.h"

namespace {

using namespace cmpihost;
using testing::HasSubstr;
using testing::IsEmpty;
using HostOperation = VA::SimulatedHost::Operation;

class Exceptions : public LibraryFixture {
  protected:
    struct Request {
        const char* handler;
        OperationRequest request;
    };

    // One request for each of the five handlers, all of which meet the instrumentation.
    static std::vector<Request> requests() {
        OperationRequest request;
        request.path = path("KORVA_OperatingSystem");
        std::vector<Request> all;
        request.operation = Operation::EnumerateInstanceNames;
        all.push_back({"OperatingSystem_EnumInstanceNames", request});
        request.operation = Operation::EnumerateInstances;
        all.push_back({"OperatingSystem_EnumInstances", request});
        request.operation = Operation::GetInstance;
        request.path = operatingSystemPath("host1", "Linux");
        all.push_back({"OperatingSystem_GetInstance", request});
        request.path = capabilitiesPath("Linux");
        request.assocClass = "KORVA_OSElementCapabilities";
        request.operation = Operation::AssociatorNames;
        all.push_back({"OperatingSystem_AssociatorNames", request});
        request.operation = Operation::Associators;
        all.push_back({"OperatingSystem_Associators", request});
        return all;
    }

    // What a request leaves that meets an exception of the standard hierarchy.
    void expectMessage(const Request& each, const std::string& what) {
        recording::clear();
        const Outcome outcome = invoke(each.request);
        EXPECT_EQ(outcome.rc, CMPI_RC_OK) << each.handler;
        EXPECT_FALSE(outcome.message.has_value()) << each.handler;
        EXPECT_EQ(outcome.doneCount, 0U) << each.handler;
        std::string messages;
        const auto records = recording::take();
        for (const recording::Record& record : records)
            if (record.text.rfind("MESSAGE ", 0) == 0) messages += recording::rendered({record});
        const std::string expected = std::string(each.handler) +
                                     " OperatingSystemProvider.cpp:# "
                                     "Zumbrel.OperatingSystemProvider 3000 null 0 0 | MESSAGE "
                                     "[File: OperatingSystemProvider.cpp, Line: #]: " +
                                     what + "\n";
        EXPECT_EQ(messages, "log " + expected + "trace " + expected);
        ASSERT_FALSE(records.empty());
        EXPECT_EQ(
            records[records.size() - 4].text.rfind("EXITING: " + std::string(each.handler), 0), 0U);
    }
};

TEST_F(Exceptions, StandardOneFromAnyPlaceLeavesOneMessageAndTheStatusOK) {
    for (const HostOperation operation : {HostOperation::Select, HostOperation::Valid,
                                          HostOperation::ReadText, HostOperation::Next}) {
        for (const Request& each : requests()) {
            if (operation == HostOperation::Valid &&
                each.request.path.className == "KORVA_OperatingSystemCapabilities")
                continue;  // without an element to filter, its first test is the walk's end
            host->throwFromCall(operation, 1, std::runtime_error("from the instrumentation"));
            recording::clear();
            const Outcome outcome = invoke(each.request);
            EXPECT_EQ(outcome.rc, CMPI_RC_OK) << each.handler;
            EXPECT_EQ(outcome.doneCount, 0U) << each.handler;
            std::size_t messages = 0;
            for (const recording::Record& record : recording::take())
                if (record.text.find("]: from the instrumentation") != std::string::npos)
                    ++messages;
            EXPECT_EQ(messages, 2U) << each.handler;
        }
    }
}

TEST_F(Exceptions, EachFrameworkClassIsReportedByItsText) {
    for (const Request& each : requests()) {
        host->throwFromCall(HostOperation::Select, 1, VA::FrameworkException("x"));
        expectMessage(each, "x");
        host->throwFromCall(HostOperation::Select, 1, VA::ProviderException("provider"));
        expectMessage(each, "provider");
        host->throwFromCall(HostOperation::Select, 1, VA::InstrumentationException("Not Found."));
        expectMessage(each, "Not Found.");
        host->throwFromCall(HostOperation::Select, 1, std::bad_alloc());
        expectMessage(each, "std::bad_alloc");
    }
}

TEST_F(Exceptions, ElementsBeforeTheExceptionHaveBeenReturned) {
    setNodes({"a", "b", "c"});
    host->throwFromCall(HostOperation::Next, 2, std::runtime_error("late"));
    const Outcome outcome = enumerateNames("KORVA_OperatingSystem");
    EXPECT_EQ(outcome.rc, CMPI_RC_OK);
    EXPECT_EQ(outcome.paths.size(), 2U);
    EXPECT_EQ(outcome.doneCount, 0U);
}

TEST_F(Exceptions, ForeignTypeLeavesTheHandlerWithoutMessageOrExitMarker) {
    struct Foreign {};
    for (const Request& each : requests()) {
        host->throwFromCall(HostOperation::ReadText, 1, Foreign{});
        recording::clear();
        EXPECT_THROW(invoke(each.request), Foreign) << each.handler;
        const std::string records = recording::takeRendered();
        EXPECT_THAT(records, HasSubstr("markProviderEntry"));
        EXPECT_THAT(records, testing::Not(HasSubstr("MESSAGE ")));
        EXPECT_THAT(records, testing::Not(HasSubstr("markProviderExit")));
    }
}

// The last records of the request are those of its destructors.
TEST_F(Exceptions, ForeignTypeLeavesTheHandlerOnceTheAdapterIsDestroyed) {
    struct Foreign {};
    host->throwFromCall(HostOperation::Next, 1, Foreign{});
    for (Request each : requests()) {
        const bool association = each.request.assocClass.has_value();
        each.request.path.keys.clear();
        recording::clear();
        EXPECT_THROW(invoke(each.request), Foreign) << each.handler;
        std::string functions;
        for (const recording::Record& record : recording::take())
            functions += record.channel == "log" ? record.function + ";" : "";
        const std::string destroyed =
            association ? "~CMPIOSElementCapabilities;~OSElementCapabilities;~CMPIOperatingSystem;"
                          "~CMPIOperatingSystemCapabilities;"
                        : "~CMPIOperatingSystem;";
        EXPECT_THAT(functions, testing::EndsWith("operator++;" + destroyed)) << each.handler;
    }
}

TEST_F(Exceptions, AdapterIsDestroyedBeforeTheMessageIsWritten) {
    host->throwFromCall(HostOperation::ReadText, 1, std::runtime_error("x"));
    recording::clear();
    enumerate("KORVA_OperatingSystem");
    const std::string records = recording::takeRendered();
    const std::size_t destroyed = records.find("~CMPIOperatingSystem");
    const std::size_t message = records.find("MESSAGE ");
    ASSERT_NE(destroyed, std::string::npos);
    ASSERT_NE(message, std::string::npos);
    EXPECT_LT(destroyed, message);
}

TEST_F(Exceptions, OneFromOutsideTheWalkLeavesTheHandler) {
    for (const char* function : {"markProviderEntry", "markProviderExit"}) {
        recording::setHook([function](const recording::Record& record) {
            if (record.function == function) throw std::runtime_error("from the log");
        });
        for (const Request& each : requests())
            EXPECT_THROW(invoke(each.request), std::runtime_error) << function;
    }
    recording::setHook([](const recording::Record& record) {
        if (record.text.find("'classId'") != std::string::npos)
            throw std::runtime_error("from the log");
    });
    for (const Request& each : requests()) EXPECT_THROW(invoke(each.request), std::runtime_error);
}

}  // namespace
