// Requests and up-calls by registration; whole sets of libraries stand in the tests of the program.
#include "host/broker/Router.h"

#include "BrokerFixture.h"

#include "support/ProcessMap.h"

#include <dlfcn.h>
#include <thread>

namespace cmpihost {
namespace {

const std::string folder = KORVA_BINARY_DIR "/lib";
const std::string library = folder + "/libbroker_test_providers.so";

std::string good(const std::string& className, const std::string& types) {
    return "[" + className + "]\nprovider: Good\nlocation: broker_test_providers\ntype: " + types +
           "\nnamespace: root/cimv2\n";
}

class RoutedRequest : public ::testing::Test {
  protected:
    const TestCatalogue catalogue = testClasses();
    Broker broker;

    static Registrations registered(const std::string& text) {
        Registrations registrations;
        registrations.add(text, "x.reg");
        return registrations;
    }
    static OperationRequest request(Operation operation, const std::string& className) {
        OperationRequest result;
        result.operation = operation;
        result.path = {"root/cimv2", className};
        return result;
    }
    static std::string shown(const OperationResult& result) {
        std::string text = std::to_string(result.rc) + " " + result.message.value_or("");
        for (const ObjectPathValue& path : result.paths) text += toString(path) + " ";
        return text;
    }
};

TEST_F(RoutedRequest, LoadsALibraryWhenItIsNeededAndOnceForManyThreads) {
    Router router(broker, catalogue, registered(good("TEST_Thing", "instance")), {folder});
    EXPECT_FALSE(isMapped(library));
    std::vector<std::thread> threads;
    std::vector<std::size_t> counts(4);
    for (std::size_t& count : counts) {
        threads.emplace_back([&] {
            for (int round = 0; round < 20; ++round)
                count += router.ask(request(Operation::EnumerateInstanceNames, "TEST_Thing"))
                             .paths.size();
        });
    }
    for (std::thread& thread : threads) thread.join();
    EXPECT_THAT(counts, ::testing::Each(40U));
    EXPECT_TRUE(isMapped(library));
    router.unload();
    EXPECT_FALSE(isMapped(library));
    EXPECT_EQ(router.ask(request(Operation::EnumerateInstanceNames, "TEST_Thing")).paths.size(),
              2U);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(RoutedRequest, JoinsTheAnswersOfSeveralAndAsksAProviderOfAssociationsOnce) {
    Router router(broker, catalogue,
                  registered(good("TEST_Thing", "instance") + good("TEST_SmallThing", "instance") +
                             good("TEST_Link", "association") + good("TEST_Tie", "association")),
                  {folder});
    EXPECT_EQ(router.ask(request(Operation::EnumerateInstanceNames, "test_thing")).paths.size(),
              4U);
    EXPECT_EQ(router.ask(request(Operation::EnumerateInstanceNames, "CIM_Thing")).paths.size(), 4U);
    EXPECT_EQ(router.ask(request(Operation::AssociatorNames, "TEST_Thing")).paths.size(), 1U);
    // The first failure is the answer.
    EXPECT_EQ(shown(router.ask(request(Operation::ExecQuery, "TEST_Thing"))),
              "1 the provider of TEST_Thing: an exception left the provider:  in WQL");
}

TEST_F(RoutedRequest, IsRefusedWithTheReasonWhereNobodyIsRegistered) {
    Router router(broker, catalogue, registered(good("TEST_Thing", "instance")), {folder});
    OperationRequest elsewhere = request(Operation::GetInstance, "TEST_Thing");
    elsewhere.path.nameSpace = "root/x";
    OperationRequest linked = request(Operation::References, "TEST_Thing");
    linked.resultClass = "TEST_Link";
    const std::pair<OperationRequest, const char*> rows[] = {
        {elsewhere, "3 no registration names the namespace root/x; known are root/cimv2"},
        {request(Operation::GetInstance, "TEST_Wrong"),
         "5 neither the schema nor a registration names the class TEST_Wrong"},
        {request(Operation::GetInstance, "TEST_SmallThing"),
         "7 no instance provider is registered for TEST_SmallThing in the namespace root/cimv2"},
        {request(Operation::InvokeMethod, "TEST_Thing"),
         "7 no method provider is registered for TEST_Thing in the namespace root/cimv2"},
        {request(Operation::Associators, "TEST_Thing"),
         "7 no association provider is registered in the namespace root/cimv2"},
        {linked,
         "7 no association provider is registered for TEST_Link in the namespace root/cimv2"},
        {request(Operation::ExecQuery, ""), "15 the query names no class behind FROM"}};
    for (const auto& [asked, answer] : rows) EXPECT_EQ(shown(router.ask(asked)), answer);
    EXPECT_FALSE(isMapped(library));
}

TEST_F(RoutedRequest, GoesToTheOneLibraryThatAnswersAll) {
    Router router(broker, catalogue, registered(good("TEST_Thing", "instance")), {folder});
    router.answerWith(
        std::make_unique<ProviderLibrary>(folder + "/libbroker_test_generic.so", broker));
    // It has no slot for it, but is asked; what it lacks is told by who is registered.
    const OperationRequest names = request(Operation::EnumerateInstanceNames, "TEST_Thing");
    EXPECT_EQ(router.ask(names).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(router.askAnyone(names).paths.size(), 2U);
    EXPECT_EQ(router.askAnyone(request(Operation::GetInstance, "TEST_Other")).rc,
              CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(router.perform(broker, names).paths.size(), 2U);
}

TEST_F(RoutedRequest, OfACleanupMeetsNoLibraryThatHasGone) {
    const std::pair<const char*, CMPIrc> rows[] = {{"TEST_Thing", CMPI_RC_ERR_FAILED},
                                                   {"TEST_Other", CMPI_RC_ERR_NOT_SUPPORTED}};
    for (const auto& [className, status] : rows) {
        Router router(broker, catalogue, registered(good("TEST_Thing", "instance")), {folder});
        router.answerWith(
            std::make_unique<ProviderLibrary>(folder + "/libbroker_test_generic.so", broker));
        router.askAnyone(request(Operation::EnumerateInstanceNames, "TEST_Thing"));
        void* const handle = dlopen(library.c_str(), RTLD_NOW | RTLD_NOLOAD);
        *static_cast<const char**>(dlsym(handle, "askedInCleanup")) = className;
        router.unload();
        EXPECT_EQ(*static_cast<const CMPIrc*>(dlsym(handle, "statusInCleanup")), status);
        dlclose(handle);
        EXPECT_FALSE(isMapped(library));
    }
}

TEST_F(RoutedRequest, OfAProviderFailsAndIsToldWhenItsLibraryIsMissing) {
    Router router(broker, catalogue,
                  registered("[TEST_Thing]\nprovider: P\nlocation: nowhere\ntype: instance\n"
                             "namespace: *\n"),
                  {folder});
    const OperationRequest names = request(Operation::EnumerateInstanceNames, "TEST_Thing");
    EXPECT_THROW(router.ask(names), LoadError);
    EXPECT_THAT(router.takeLoadErrors(), IsEmpty());
    RequestScope scope(broker);
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    for (int round = 0; round < 2; ++round) {
        EXPECT_EQ(CBEnumInstanceNames(broker.cmpi(), scope.makeContext({}, {}),
                                      scope.makePath(names.path), &status),
                  nullptr);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    }
    EXPECT_THAT(router.takeLoadErrors(),
                ElementsAre(::testing::StartsWith("an up-call for TEST_Thing: x.reg:1: the "
                                                  "provider of TEST_Thing: libnowhere.so: ")));
    EXPECT_THAT(router.takeLoadErrors(), IsEmpty());
}

}  // namespace
}  // namespace cmpihost
