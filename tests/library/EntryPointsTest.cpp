// The factories and the tables that they fill, with the operations that are refused: all that an
// object manager relies on before it knows what the provider is about.
#include <dlfcn.h>
#include <cstring>

#include "host/broker/RequestScope.h"
#include "host/broker/ResultCollector.h"
#include "library/LibraryFixture.h"

namespace {

using namespace cmpihost;
using testing::HasSubstr;
using testing::StartsWith;

using InstanceFactory = CMPIInstanceMI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
using AssociationFactory = CMPIAssociationMI* (*)(const CMPIBroker*, const CMPIContext*,
                                                  CMPIStatus*);

class EntryPoints : public LibraryFixture {
  protected:
    InstanceFactory instanceFactory = reinterpret_cast<InstanceFactory>(
        library.symbol("OperatingSystemProvider_Create_InstanceMI"));
    AssociationFactory associationFactory = reinterpret_cast<AssociationFactory>(
        library.symbol("OperatingSystemProvider_Create_AssociationMI"));
};

TEST_F(EntryPoints, TablesCarryTheirNamesAndVersion200) {
    const CMPIInstanceMIFT& instance = *library.instanceMI()->ft;
    EXPECT_EQ(instance.ftVersion, 200);
    EXPECT_EQ(instance.miVersion, 200);
    EXPECT_STREQ(instance.miName, "instanceOperatingSystemProvider");
    const CMPIAssociationMIFT& association = *library.associationMI()->ft;
    EXPECT_EQ(association.ftVersion, 200);
    EXPECT_EQ(association.miVersion, 200);
    EXPECT_STREQ(association.miName, "associationOperatingSystemProvider");
}

TEST_F(EntryPoints, EverySlotIsFilledAndNoProviderHasState) {
    EXPECT_EQ(library.instanceMI()->hdl, nullptr);
    EXPECT_EQ(library.associationMI()->hdl, nullptr);
    const CMPIInstanceMIFT& instance = *library.instanceMI()->ft;
    for (const bool filled :
         {instance.cleanup != nullptr, instance.enumerateInstanceNames != nullptr,
          instance.enumerateInstances != nullptr, instance.getInstance != nullptr,
          instance.createInstance != nullptr, instance.modifyInstance != nullptr,
          instance.deleteInstance != nullptr, instance.execQuery != nullptr})
        EXPECT_TRUE(filled);
    const CMPIAssociationMIFT& association = *library.associationMI()->ft;
    for (const bool filled :
         {association.cleanup != nullptr, association.associators != nullptr,
          association.associatorNames != nullptr, association.references != nullptr,
          association.referenceNames != nullptr})
        EXPECT_TRUE(filled);
}

TEST_F(EntryPoints, FactoryReturnsTheSameRecordAndNeverWritesItsStatus) {
    CMPIStatus status;
    std::memset(&status, 0x5A, sizeof status);
    const CMPIStatus untouched = status;
    EXPECT_EQ(instanceFactory(broker.cmpi(), nullptr, &status), library.instanceMI());
    EXPECT_EQ(associationFactory(broker.cmpi(), nullptr, &status), library.associationMI());
    EXPECT_EQ(std::memcmp(&status, &untouched, sizeof status), 0);
    EXPECT_EQ(instanceFactory(broker.cmpi(), nullptr, nullptr), library.instanceMI());
}

TEST_F(EntryPoints, LaterFactorySuppliesTheBrokerOfBothTables) {
    Broker first(&schemaCatalogue());
    Broker second(&schemaCatalogue());
    for (Broker* each : {&first, &second}) each->route(ComputerSystemService::className, computers);
    FaultPlan firstCalls;
    FaultPlan secondCalls;
    first.setFaultPlan(&firstCalls);
    second.setFaultPlan(&secondCalls);
    const auto serveBoth = [&](Broker& running) {
        for (const OperationRequest& names :
             {requestFor(Operation::EnumerateInstanceNames, path("KORVA_OperatingSystem")),
              requestFor(Operation::AssociatorNames, capabilitiesPath("Linux"),
                         "KORVA_OSElementCapabilities")})
            EXPECT_EQ(cmpihost::invoke(library, running, names).paths.size(), 1U);
    };

    instanceFactory(first.cmpi(), nullptr, nullptr);
    associationFactory(second.cmpi(), nullptr, nullptr);
    serveBoth(second);
    EXPECT_EQ(firstCalls.calls("newObjectPath"), 0U);
    const unsigned bySecond = secondCalls.calls("newObjectPath");
    EXPECT_GT(bySecond, 0U);

    instanceFactory(first.cmpi(), nullptr, nullptr);
    serveBoth(first);
    EXPECT_GT(firstCalls.calls("newObjectPath"), 0U);
    EXPECT_EQ(secondCalls.calls("newObjectPath"), bySecond);
}

TEST_F(EntryPoints, AssociationFactoryAloneMakesTheBrokerAvailable) {
    library.unload();
    LoadOptions options;
    options.instance = false;
    const ProviderLibrary alone(providerFile, broker, options);
    const Outcome outcome =
        cmpihost::invoke(alone, broker,
                         requestFor(Operation::AssociatorNames,
                                    operatingSystemPath("host1", "Linux"), "KORVA_RunningOS"));
    EXPECT_EQ(outcome.paths.size(), 1U);
    EXPECT_EQ(outcome.doneCount, 1U);
}

TEST_F(EntryPoints, CleanupSucceedsWhateverItIsToldAndRequestsFollow) {
    for (const CMPIBoolean terminating : {CMPIBoolean{0}, CMPIBoolean{1}}) {
        const CMPIStatus instance =
            library.instanceMI()->ft->cleanup(library.instanceMI(), nullptr, terminating);
        EXPECT_EQ(instance.rc, CMPI_RC_OK);
        EXPECT_EQ(instance.msg, nullptr);
        const CMPIStatus association =
            library.associationMI()->ft->cleanup(library.associationMI(), nullptr, terminating);
        EXPECT_EQ(association.rc, CMPI_RC_OK);
        EXPECT_EQ(association.msg, nullptr);
    }
    EXPECT_TRUE(recording::take().empty());
    EXPECT_EQ(enumerateNames("KORVA_OperatingSystem").paths.size(), 1U);
}

TEST_F(EntryPoints, NoticeIsAText) {
    const auto* notice =
        static_cast<const char*>(library.symbol("_ZN2VA16OSStatusProvider9COPYRIGHTE"));
    ASSERT_NE(notice, nullptr);
    EXPECT_THAT(notice, StartsWith("OperatingSystemProvider"));
    EXPECT_THAT(notice, HasSubstr("Copyright"));
}

class RefusedOperations : public LibraryFixture {
  protected:
    void expectRefusal(const CMPIStatus& status, const std::string& handler) {
        EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
        EXPECT_EQ(status.msg, nullptr);
        EXPECT_EQ(recording::takeRendered(),
                  "both " + handler +
                      " OperatingSystemProvider.cpp:# Zumbrel.OperatingSystemProvider 4000 null 0 "
                      "0 | METHOD: " +
                      handler + "() was invoked in OperatingSystemProvider.cpp [Line: #]\n");
    }
};

TEST_F(RefusedOperations, EachLeavesOneMethodRecordAndCallsNothingOnTheResult) {
    FaultPlan calls;
    for (const NamedRequest& each : refusedRequests()) {
        SCOPED_TRACE(each.name);
        calls.clear();
        broker.setFaultPlan(&calls);
        const Outcome outcome = invoke(each.request);
        broker.setFaultPlan(nullptr);
        EXPECT_FALSE(outcome.message.has_value());
        EXPECT_TRUE(outcome.paths.empty() && outcome.instances.empty());
        EXPECT_EQ(outcome.doneCount, 0U);
        EXPECT_EQ(calls.calls(), 0U);
        expectRefusal({outcome.rc, nullptr}, each.handler);
    }
}

TEST_F(RefusedOperations, ArgumentsAreNotLookedAt) {
    const CMPIInstanceMIFT& instance = *library.instanceMI()->ft;
    const CMPIAssociationMIFT& association = *library.associationMI()->ft;
    expectRefusal(instance.createInstance(nullptr, nullptr, nullptr, nullptr, nullptr),
                  "OperatingSystem_CreateInstance");
    expectRefusal(instance.modifyInstance(nullptr, nullptr, nullptr, nullptr, nullptr, nullptr),
                  "OperatingSystem_ModifyInstance");
    expectRefusal(instance.deleteInstance(nullptr, nullptr, nullptr, nullptr),
                  "OperatingSystem_DeleteInstance");
    expectRefusal(instance.execQuery(nullptr, nullptr, nullptr, nullptr, nullptr, nullptr),
                  "OperatingSystem_ExecQuery");
    expectRefusal(
        association.references(nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr),
        "OperatingSystem_References");
    expectRefusal(association.referenceNames(nullptr, nullptr, nullptr, nullptr, nullptr, nullptr),
                  "OperatingSystem_ReferenceNames");
}

}  // namespace
