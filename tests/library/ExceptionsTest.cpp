// What a handler does with an exception: where it ends up depends on its type and on where it is
// thrown.
#include <functional>
#include <new>
#include <stdexcept>

#include "FrameworkException.h"
#include "InstrumentationException.h"
#include "ProviderException.h"
#include "host/broker/Request.h"
#include "library/LibraryFixture.h"

namespace {

using namespace cmpihost;
using testing::HasSubstr;
using testing::IsEmpty;

using HostOperation = VA::SimulatedHost::Operation;

class Exceptions : public LibraryFixture {
  protected:
    // What a request leaves that meets an exception of the standard hierarchy.
    void expectMessage(const NamedRequest& each, const std::string& what) {
        recording::clear();
        const Outcome outcome = invoke(each.request);
        EXPECT_EQ(outcome.rc, CMPI_RC_OK) << each.handler;
        EXPECT_FALSE(outcome.message.has_value()) << each.handler;
        EXPECT_EQ(outcome.doneCount, 0U) << each.handler;
        std::string messages;
        const auto records = recording::take();
        for (const recording::Record& record : records)
            if (record.text.rfind("MESSAGE ", 0) == 0) messages += recording::rendered({record});
        const std::string expected = each.handler +
                                     " OperatingSystemProvider.cpp:# "
                                     "Zumbrel.OperatingSystemProvider 3000 null 0 0 | MESSAGE "
                                     "[File: OperatingSystemProvider.cpp, Line: #]: " +
                                     what + "\n";
        EXPECT_EQ(messages, "log " + expected + "trace " + expected);
        ASSERT_FALSE(records.empty());
        EXPECT_EQ(records[records.size() - 4].text.rfind("EXITING: " + each.handler, 0), 0U);
    }
};

TEST_F(Exceptions, StandardOneFromAnyPlaceLeavesOneMessageAndTheStatusOK) {
    for (const HostOperation operation : {HostOperation::Select, HostOperation::Valid,
                                          HostOperation::ReadText, HostOperation::Next}) {
        for (const NamedRequest& each : oneRequestOfEachHandler()) {
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
    for (const NamedRequest& each : oneRequestOfEachHandler()) {
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
    for (const NamedRequest& each : oneRequestOfEachHandler()) {
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
    for (NamedRequest each : oneRequestOfEachHandler()) {
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
        for (const NamedRequest& each : oneRequestOfEachHandler())
            EXPECT_THROW(invoke(each.request), std::runtime_error) << function;
    }
    recording::setHook([](const recording::Record& record) {
        if (record.text.find("'classId'") != std::string::npos)
            throw std::runtime_error("from the log");
    });
    for (const NamedRequest& each : oneRequestOfEachHandler())
        EXPECT_THROW(invoke(each.request), std::runtime_error);
}

/// Throws from returnDone, or from the calls that take an element.
class ThrowingResult {
  public:
    explicit ThrowingResult(bool fromDone) : fromDone_(fromDone) {
        calls_.returnInstance = [](const CMPIResult* self, const CMPIInstance*) {
            return of(self).answer(false);
        };
        calls_.returnObjectPath = [](const CMPIResult* self, const CMPIObjectPath*) {
            return of(self).answer(false);
        };
        calls_.returnDone = [](const CMPIResult* self) { return of(self).answer(true); };
    }

    const CMPIResult* cmpi() const { return &result_; }
    unsigned int calls = 0;

  private:
    static ThrowingResult& of(const CMPIResult* self) {
        return *static_cast<ThrowingResult*>(self->hdl);
    }

    CMPIStatus answer(bool done) {
        ++calls;
        if (done == fromDone_) throw std::runtime_error("from the result");
        return {CMPI_RC_OK, nullptr};
    }

    bool fromDone_;
    CMPIResultFT calls_ = {};
    CMPIResult result_ = {this, &calls_};
};

class ThrowingResults : public LibraryFixture {
  protected:
    struct Handler {
        const char* name;
        std::function<CMPIStatus(const CMPIContext*, const CMPIResult*, Request&)> call;
    };

    // The five, each for one element.
    std::vector<Handler> handlers() {
        CMPIInstanceMI* const instances = library.instanceMI();
        CMPIAssociationMI* const associations = library.associationMI();
        const ObjectPathValue system = operatingSystemPath("host1", "Linux");
        const char* const association = "KORVA_RunningOS";
        return {
            {"OperatingSystem_EnumInstanceNames",
             [=](auto* context, auto* result, Request& request) {
                 return instances->ft->enumerateInstanceNames(
                     instances, context, result, request.makePath(path(system.className)));
             }},
            {"OperatingSystem_EnumInstances",
             [=](auto* context, auto* result, Request& request) {
                 return instances->ft->enumerateInstances(
                     instances, context, result, request.makePath(path(system.className)), nullptr);
             }},
            {"OperatingSystem_GetInstance",
             [=](auto* context, auto* result, Request& request) {
                 return instances->ft->getInstance(instances, context, result,
                                                   request.makePath(system), nullptr);
             }},
            {"OperatingSystem_AssociatorNames",
             [=](auto* context, auto* result, Request& request) {
                 return associations->ft->associatorNames(associations, context, result,
                                                          request.makePath(system), association,
                                                          nullptr, nullptr, nullptr);
             }},
            {"OperatingSystem_Associators",
             [=](auto* context, auto* result, Request& request) {
                 return associations->ft->associators(associations, context, result,
                                                      request.makePath(system), association,
                                                      nullptr, nullptr, nullptr, nullptr);
             }},
        };
    }

    // The records end with a destructor's, one message and the exit marker.
    static void expectReported(const std::string& handler) {
        const std::string category = " Zumbrel.OperatingSystemProvider ";
        const std::string expected =
            "both " + handler + " OperatingSystemProvider.cpp:#" + category +
            "3000 null 0 0 | MESSAGE [File: OperatingSystemProvider.cpp, Line: #]: from the "
            "result\nboth markProviderExit include/Trace.h:348" +
            category + "4000 null 0 0 | EXITING: " + handler +
            "() in OperatingSystemProvider.cpp [Line: #]\n"
            "both markProviderExit include/Trace.h:349" +
            category +
            "4000 null 0 0 | "
            "==============================================================================\n";
        const std::string records = recording::takeRendered();
        ASSERT_THAT(records, testing::EndsWith(expected));
        const std::string before = records.substr(0, records.size() - expected.size());
        EXPECT_EQ(before.rfind("both ~"), before.rfind("both ")) << before;
    }
};

TEST_F(ThrowingResults, AreReportedOnceTheAdapterIsDestroyed) {
    for (const Handler& handler : handlers()) {
        for (const bool fromDone : {false, true}) {
            Request request(broker);
            ThrowingResult result(fromDone);
            recording::clear();
            const CMPIStatus status =
                handler.call(request.makeContext({}, "root/cimv2"), result.cmpi(), request);
            EXPECT_EQ(status.rc, CMPI_RC_OK) << handler.name;
            EXPECT_EQ(status.msg, nullptr) << handler.name;
            EXPECT_EQ(result.calls, fromDone ? 2U : 1U) << handler.name;
            expectReported(handler.name);
        }
    }
}

}  // namespace
