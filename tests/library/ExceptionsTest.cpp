// What a handler does with an exception: where it ends up depends on its type and on where it is
// thrown.
// tests/faults throws every kind from every call; here is what only one place shows.
#include <functional>
#include <stdexcept>

#include "host/broker/RequestScope.h"
#include "library/LibraryFixture.h"

namespace {

using namespace cmpihost;

using HostOperation = VA::SimulatedHost::Operation;

class Exceptions : public LibraryFixture {};

TEST_F(Exceptions, ElementsBeforeTheExceptionHaveBeenReturned) {
    setNodes({"a", "b", "c"});
    host->throwFromCall(HostOperation::Next, 2, std::runtime_error("late"));
    const Outcome outcome = enumerateNames("KORVA_OperatingSystem");
    EXPECT_EQ(outcome.rc, CMPI_RC_OK);
    EXPECT_EQ(outcome.paths.size(), 2U);
    EXPECT_EQ(outcome.doneCount, 0U);
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
        std::function<CMPIStatus(const CMPIContext*, const CMPIResult*, RequestScope&)> call;
    };

    // The five, each for one element.
    std::vector<Handler> handlers() {
        CMPIInstanceMI* const instances = library.instanceMI();
        CMPIAssociationMI* const associations = library.associationMI();
        const ObjectPathValue system = operatingSystemPath("host1", "Linux");
        const char* const association = "KORVA_RunningOS";
        return {
            {"OperatingSystem_EnumInstanceNames",
             [=](auto* context, auto* result, RequestScope& request) {
                 return instances->ft->enumerateInstanceNames(
                     instances, context, result, request.makePath(path(system.className)));
             }},
            {"OperatingSystem_EnumInstances",
             [=](auto* context, auto* result, RequestScope& request) {
                 return instances->ft->enumerateInstances(
                     instances, context, result, request.makePath(path(system.className)), nullptr);
             }},
            {"OperatingSystem_GetInstance",
             [=](auto* context, auto* result, RequestScope& request) {
                 return instances->ft->getInstance(instances, context, result,
                                                   request.makePath(system), nullptr);
             }},
            {"OperatingSystem_AssociatorNames",
             [=](auto* context, auto* result, RequestScope& request) {
                 return associations->ft->associatorNames(associations, context, result,
                                                          request.makePath(system), association,
                                                          nullptr, nullptr, nullptr);
             }},
            {"OperatingSystem_Associators",
             [=](auto* context, auto* result, RequestScope& request) {
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
            RequestScope request(broker);
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
