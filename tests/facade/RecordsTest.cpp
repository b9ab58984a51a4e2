#include <pthread.h>

#include <fstream>
#include <functional>
#include <sstream>

#include "facade/FacadeFixture.h"

// The whole sequence of records that a request of the facade leaves: the provider's for each
// question, and one line for a refusal. The expected ones stand in records/, a file a sequence.

namespace {

using namespace facade;

class FacadeRecords : public FacadeFixture {
  protected:
    void expectRecords(const OperationRequest& request, const std::string& name) {
        ask(request);
        const std::string actual = recording::takeRendered();
        std::ifstream expected(std::string(KORVA_TEST_DATA "/records/") + name + ".txt");
        std::ostringstream text;
        text << expected.rdbuf();
        EXPECT_EQ(actual, text.str());
    }
};

TEST_F(FacadeRecords, OfCapabilitiesOfAnOperatingSystem) {
    expectRecords(associationRequest(Operation::Associators, operatingSystemPath("host1", "Linux"),
                                     "CIM_ElementCapabilities"),
                  "AssociatorsOfOperatingSystemByCapabilities");
}

TEST_F(FacadeRecords, OfAnInstanceThatIsNotThere) {
    OperationRequest request;
    request.operation = Operation::GetInstance;
    request.path = operatingSystemPath("host1", "other");
    expectRecords(request, "GetInstanceOfUnknownOperatingSystem");
}

TEST_F(FacadeRecords, OfARefusedOperation) {
    OperationRequest request;
    request.operation = Operation::DeleteInstance;
    request.path = operatingSystemPath("host1", "Linux");
    expectRecords(request, "DeleteInstance");
}

TEST_F(FacadeRecords, OfASourceOfAnotherClassAreNone) {
    ask(associationRequest(Operation::AssociatorNames, path("TEST_Thing", {{"Name", "x"}})));
    EXPECT_EQ(recording::takeRendered(), "");
}

// Object managers evaluate the query themselves then, and the request succeeds.
TEST_F(FacadeRecords, OfARefusedQueryAreTheProvidersAlone) {
    OperationRequest request;
    request.operation = Operation::ExecQuery;
    request.path = path("KORVA_OperatingSystem");
    request.query = "SELECT * FROM KORVA_OperatingSystem";
    const Outcome outcome = ask(request);
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(outcome.message, "ExecQuery is not supported for KORVA_OperatingSystem");
    expectRecords(request, "ExecQuery");
}

// A thread that ends while a refusal is recorded, at a cancellation point of the log.
TEST_F(FacadeRecords, OfARefusalLetACancelledThreadEnd) {
    recording::setHook([](const recording::Record& record) {
        if (record.category != "Zumbrel.OSStatusFacade") return;
        ::pthread_cancel(::pthread_self());
        ::pthread_testcancel();
    });
    std::function<void()> askForNothing = [this] {
        ask(Operation::EnumerateInstances, path("Nothing"));
    };
    const auto run = [](void* function) -> void* {
        (*static_cast<std::function<void()>*>(function))();
        return nullptr;
    };
    pthread_t thread{};
    ASSERT_EQ(::pthread_create(&thread, nullptr, run, &askForNothing), 0);
    void* result = nullptr;
    ::pthread_join(thread, &result);
    recording::setHook({});
    EXPECT_EQ(result, PTHREAD_CANCELED);
}

}  // namespace
