#include <pthread.h>

#include <cstring>
#include <functional>

#include "facade/FacadeFixture.h"
#include "support/GoldenFile.h"
#include "support/ProcessMap.h"

// The factories and their tables, the records of requests, and the file's coming and going.

namespace {

using namespace facade;

class FacadeEntryPoints : public FacadeFixture {};

TEST_F(FacadeEntryPoints, TablesAreNamedAndFull) {
    const CMPIInstanceMIFT& instance = *facade.instanceMI()->ft;
    EXPECT_EQ(instance.ftVersion, 200);
    EXPECT_EQ(instance.miVersion, 200);
    EXPECT_STREQ(instance.miName, "instanceOSStatusFacade");
    const CMPIAssociationMIFT& association = *facade.associationMI()->ft;
    EXPECT_EQ(association.ftVersion, 200);
    EXPECT_EQ(association.miVersion, 200);
    EXPECT_STREQ(association.miName, "associationOSStatusFacade");
    EXPECT_EQ(facade.instanceMI()->hdl, nullptr);
    EXPECT_EQ(facade.associationMI()->hdl, nullptr);
}

TEST_F(FacadeEntryPoints, EitherFactoryAloneServesItsRequests) {
    facade.unload();
    library.unload();
    LoadOptions options = loadOptions();
    options.instance = false;
    {
        const ProviderLibrary alone(file, broker, options);
        const OperationRequest request =
            associationRequest(Operation::AssociatorNames, capabilitiesPath("Linux"));
        EXPECT_EQ(cmpihost::invoke(alone, broker, request).paths.size(), 1U);
    }
    options.instance = true;
    options.association = false;
    const ProviderLibrary alone(file, broker, options);
    const OperationRequest request =
        requestFor(Operation::EnumerateInstances, path("KORVA_OperatingSystem"));
    EXPECT_EQ(cmpihost::invoke(alone, broker, request).instances.size(), 1U);
}

TEST_F(FacadeEntryPoints, FactoriesLeaveTheStatusAloneAndReturnTheSameRecord) {
    using InstanceFactory = CMPIInstanceMI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    const auto create =
        reinterpret_cast<InstanceFactory>(facade.symbol("OSStatusFacade_Create_InstanceMI"));
    CMPIStatus status;
    std::memset(&status, 0x5A, sizeof status);
    const CMPIStatus untouched = status;
    EXPECT_EQ(create(broker.cmpi(), nullptr, &status), facade.instanceMI());
    EXPECT_EQ(std::memcmp(&status, &untouched, sizeof status), 0);
}

TEST_F(FacadeEntryPoints, CleanupSucceedsAndRequestsFollow) {
    for (const CMPIBoolean terminating : {CMPIBoolean{0}, CMPIBoolean{1}}) {
        CMPIInstanceMI* const instance = facade.instanceMI();
        EXPECT_EQ(instance->ft->cleanup(instance, nullptr, terminating).rc, CMPI_RC_OK);
        CMPIAssociationMI* const association = facade.associationMI();
        EXPECT_EQ(association->ft->cleanup(association, nullptr, terminating).rc, CMPI_RC_OK);
    }
    EXPECT_EQ(ask(Operation::EnumerateInstances, path("KORVA_OperatingSystem")).instances.size(),
              1U);
}

TEST_F(FacadeEntryPoints, IsGoneWithTheProviderAfterEachOfAHundredUses) {
    facade.unload();
    library.unload();
    for (int round = 0; round < 100; ++round) {
        facade.load();
        EXPECT_TRUE(isMapped("libkorvaosstatusfacade"));
        EXPECT_EQ(ask(Operation::EnumerateInstances, path("KORVA_OperatingSystem"), Texts{})
                      .instances.size(),
                  1U);
        EXPECT_EQ(
            ask(associationRequest(Operation::Associators, operatingSystemPath("host1", "Linux")))
                .instances.size(),
            2U);
        EXPECT_EQ(ask(Operation::GetInstance, capabilitiesPath("x")).rc, CMPI_RC_ERR_NOT_FOUND);
        EXPECT_TRUE(facade.unload(false));
        EXPECT_FALSE(isMapped("libkorvaosstatusfacade"));
        EXPECT_FALSE(isMapped("libkorzbosstatusprofileprovider"));
    }
}

// The whole sequence of records that a request leaves: the provider's for each question, and one
// line for a refusal. The expected ones stand in records/, a file a sequence.
TEST_F(FacadeEntryPoints, LeaveTheProvidersRecordsAndOneOfARefusal) {
    const ObjectPathValue system = operatingSystemPath("host1", "Linux");
    OperationRequest query = requestFor(Operation::ExecQuery, path("KORVA_OperatingSystem"));
    query.query = "SELECT * FROM KORVA_OperatingSystem";
    const std::pair<const char*, OperationRequest> rows[] = {
        {"AssociatorsOfOperatingSystemByCapabilities",
         associationRequest(Operation::Associators, system, "CIM_ElementCapabilities")},
        {"GetInstanceOfUnknownOperatingSystem",
         requestFor(Operation::GetInstance, operatingSystemPath("host1", "other"))},
        {"DeleteInstance", requestFor(Operation::DeleteInstance, system)},
        // Object managers evaluate a refused query themselves, and the request succeeds: no line.
        {"ExecQuery", query},
    };
    for (const auto& [name, request] : rows) {
        ask(request);
        expectGolden(std::string(KORVA_TEST_DATA "/records/") + name + ".txt",
                     recording::takeRendered());
    }
    const Outcome refused = ask(query);
    EXPECT_EQ(refused.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(refused.message, "ExecQuery is not supported for KORVA_OperatingSystem");
    // Of a source of another class nobody is asked.
    ask(associationRequest(Operation::AssociatorNames, path("TEST_Thing", {{"Name", "x"}})));
    EXPECT_EQ(recording::takeRendered(), "");
}

// A thread that ends while a refusal is recorded, at a cancellation point of the log.
TEST_F(FacadeEntryPoints, LetACancelledThreadEndWhileARefusalIsRecorded) {
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

// With the broker that has only what it must have.
class FacadeWithASparseBroker : public FacadeFixture {
  protected:
    FacadeWithASparseBroker() : FacadeFixture(BrokerOptions::sparse()) {}
};

TEST_F(FacadeWithASparseBroker, AnswersTheSame) {
    const ObjectPathValue source = operatingSystemPath("host1", "Linux");
    EXPECT_THAT(delivered(associationRequest(Operation::Associators, source)),
                testing::ElementsAre(computerSystem, capabilities));
    EXPECT_EQ(delivered(associationRequest(Operation::References, source)).size(), 3U);
    EXPECT_EQ(ask(Operation::GetInstance, source, Texts{"OSType"}).instances.size(), 1U);
    EXPECT_EQ(ask(Operation::GetInstance, path("KORVA_OperatingSystem")).message,
              "key CSCreationClassName of KORVA_OperatingSystem is missing");
}

}  // namespace
