// The stubs that write table and factory of an MI, in C++ and in C.
#include <cmpi/cmpimacs.h>
#include <dlfcn.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "host/broker/Invoke.h"

namespace {

using namespace cmpihost;

// A function for a slot of any MI. It returns a code of its own, so that slots can be told apart.
template <int Code, class MI, class... Arguments>
CMPIStatus answer(MI*, Arguments...) {
    CMReturn(static_cast<CMPIrc>(Code));
}

// SLOT(kind of MI, slot, function of that slot, its code)
#define SLOTS(SLOT)                                                  \
    SLOT(Instance, cleanup, stubCleanup, 1)                          \
    SLOT(Instance, enumerateInstanceNames, stubEnumInstanceNames, 2) \
    SLOT(Instance, enumerateInstances, stubEnumInstances, 3)         \
    SLOT(Instance, getInstance, stubGetInstance, 4)                  \
    SLOT(Instance, createInstance, stubCreateInstance, 5)            \
    SLOT(Instance, modifyInstance, stubModifyInstance, 6)            \
    SLOT(Instance, deleteInstance, stubDeleteInstance, 7)            \
    SLOT(Instance, execQuery, stubExecQuery, 8)                      \
    SLOT(Association, cleanup, stubAssociationCleanup, 11)           \
    SLOT(Association, associators, stubAssociators, 12)              \
    SLOT(Association, associatorNames, stubAssociatorNames, 13)      \
    SLOT(Association, references, stubReferences, 14)                \
    SLOT(Association, referenceNames, stubReferenceNames, 15)        \
    SLOT(Method, cleanup, stubMethodCleanup, 21)                     \
    SLOT(Method, invokeMethod, stubInvokeMethod, 22)                 \
    SLOT(Property, cleanup, stubPropertyCleanup, 31)                 \
    SLOT(Property, setProperty, stubSetProperty, 32)                 \
    SLOT(Property, getProperty, stubGetProperty, 33)                 \
    SLOT(Indication, cleanup, stubIndicationCleanup, 41)             \
    SLOT(Indication, authorizeFilter, stubAuthorizeFilter, 42)       \
    SLOT(Indication, mustPoll, stubMustPoll, 43)                     \
    SLOT(Indication, activateFilter, stubActivateFilter, 44)         \
    SLOT(Indication, deActivateFilter, stubDeActivateFilter, 45)     \
    SLOT(Indication, enableIndications, stubEnableIndications, 46)   \
    SLOT(Indication, disableIndications, stubDisableIndications, 47)

#define DEFINE(kind, slot, function, code) \
    constexpr decltype(CMPI##kind##MIFT::slot) function = answer<code>;
SLOTS(DEFINE)

const CMPIBroker* storedBroker = nullptr;
const CMPIContext* contextOfHook = nullptr;

}  // namespace

CMInstanceMIStub(stub, Sample, storedBroker, contextOfHook = ctx)
CMAssociationMIStub(stub, Sample, storedBroker, CMNoHook)
CMMethodMIStub(stub, Sample, storedBroker, CMNoHook)
CMPropertyMIStub(stub, Sample, storedBroker, CMNoHook)
CMIndicationMIStub(stub, Sample, storedBroker, CMNoHook)

extern "C" CMPIInstanceMI* PlainProvider_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                           CMPIStatus*);

namespace {

// Looks a factory up as an object manager does. Null where the program does not export it.
template <class MI>
MI* make(const char* factory, const CMPIBroker* broker, const CMPIContext* ctx, CMPIStatus* rc) {
    using Factory = MI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    const auto create = reinterpret_cast<Factory>(dlsym(RTLD_DEFAULT, factory));
    return create == nullptr ? nullptr : create(broker, ctx, rc);
}

template <class MI>
void expectHead(const MI* mi, const char* miName) {
    ASSERT_NE(mi, nullptr) << miName;
    EXPECT_EQ(mi->hdl, nullptr);
    EXPECT_EQ(mi->ft->ftVersion, 200);
    EXPECT_EQ(mi->ft->miVersion, 200);
    EXPECT_STREQ(mi->ft->miName, miName);
}

TEST(CmpiStubs, TablesHoldTheirNamesAndThePrefixedFunctions) {
    const auto* Instance =
        make<CMPIInstanceMI>("Sample_Create_InstanceMI", nullptr, nullptr, nullptr);
    const auto* Association =
        make<CMPIAssociationMI>("Sample_Create_AssociationMI", nullptr, nullptr, nullptr);
    const auto* Method = make<CMPIMethodMI>("Sample_Create_MethodMI", nullptr, nullptr, nullptr);
    const auto* Property =
        make<CMPIPropertyMI>("Sample_Create_PropertyMI", nullptr, nullptr, nullptr);
    const auto* Indication =
        make<CMPIIndicationMI>("Sample_Create_IndicationMI", nullptr, nullptr, nullptr);
    ASSERT_NO_FATAL_FAILURE(expectHead(Instance, "instanceSample"));
    ASSERT_NO_FATAL_FAILURE(expectHead(Association, "associationSample"));
    ASSERT_NO_FATAL_FAILURE(expectHead(Method, "methodSample"));
    ASSERT_NO_FATAL_FAILURE(expectHead(Property, "propertySample"));
    ASSERT_NO_FATAL_FAILURE(expectHead(Indication, "indicationSample"));
#define CHECK(kind, slot, function, code) EXPECT_EQ(kind->ft->slot, function) << #slot;
    SLOTS(CHECK)
    EXPECT_EQ(Property->ft->setPropertyWithOrigin, nullptr);
}

TEST(CmpiStubs, AFactoryStoresTheBrokerRunsTheHookAndLeavesTheStatusAlone) {
    const CMPIBroker broker = {};
    const CMPIContext context = {};
    CMPIStatus status = {CMPI_RC_ERROR_SYSTEM, nullptr};
    make<CMPIInstanceMI>("Sample_Create_InstanceMI", &broker, &context, &status);
    EXPECT_EQ(storedBroker, &broker);
    EXPECT_EQ(contextOfHook, &context);
    EXPECT_EQ(status.rc, CMPI_RC_ERROR_SYSTEM);

    make<CMPIMethodMI>("Sample_Create_MethodMI", nullptr, nullptr, nullptr);
    EXPECT_EQ(storedBroker, nullptr);
}

TEST(CmpiStubs, AFactoryReturnsTheSameMiEachTime) {
    const auto* first = make<CMPIInstanceMI>("Sample_Create_InstanceMI", nullptr, nullptr, nullptr);
    EXPECT_EQ(first, make<CMPIInstanceMI>("Sample_Create_InstanceMI", nullptr, nullptr, nullptr));
}

/// Serves three objects of any class, and keeps what was asked.
class ThreeObjects final : public UpcallService {
  public:
    UpcallAnswer perform(Broker&, const OperationRequest& request) override {
        asked = request;
        UpcallAnswer answer;
        for (const char* name : {"a", "b", "c"}) {
            InstanceValue instance;
            instance.path = {"root/cimv2", "Plain_Class", {{"Name", name}}};
            answer.paths.push_back(instance.path);
            answer.instances.push_back(instance);
        }
        return answer;
    }

    OperationRequest asked;
};

/// A provider written in C, under the broker.
class PlainCProvider : public testing::Test {
  protected:
    Outcome ask(Operation operation) {
        OperationRequest request;
        request.operation = operation;
        request.path = {"root/cimv2", "Plain_Class", {}};
        request.properties = std::vector<std::string>{"Name"};
        return invoke({mi, nullptr}, broker, request);
    }

    ThreeObjects service;
    Broker broker;
    CMPIInstanceMI* const mi = PlainProvider_Create_InstanceMI(broker.cmpi(), nullptr, nullptr);
};

TEST_F(PlainCProvider, HandsOnWhatTheObjectManagerEnumerates) {
    broker.route("Plain_Class", service);
    const Outcome names = ask(Operation::EnumerateInstanceNames);
    EXPECT_EQ(names.rc, CMPI_RC_OK);
    EXPECT_EQ(names.doneCount, 1U);
    ASSERT_EQ(names.paths.size(), 3U);
    EXPECT_EQ(toString(names.paths[2]), "root/cimv2:Plain_Class.Name=\"c\"");
    EXPECT_EQ(ask(Operation::EnumerateInstances).instances.size(), 3U);
    EXPECT_EQ(service.asked.properties, std::vector<std::string>{"Name"});
}

TEST_F(PlainCProvider, ReportsAMissingEnumerationWithText) {
    const Outcome outcome = ask(Operation::EnumerateInstanceNames);
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(outcome.message, "no enumeration");
}

TEST_F(PlainCProvider, MakesAnInstanceWithKeyAndProperty) {
    const Outcome outcome = ask(Operation::GetInstance);
    ASSERT_EQ(outcome.instances.size(), 1U);
    EXPECT_EQ(toString(outcome.instances[0].path), "root/cimv2:Plain_Class.Name=\"first\"");
    ASSERT_NE(outcome.instances[0].property("NumberOfUsers"), nullptr);
    EXPECT_EQ(*outcome.instances[0].property("NumberOfUsers"), Value::fromUnsigned(3, CMPI_uint32));
}

TEST_F(PlainCProvider, AnswersTheOtherOperationsWithTheirCodes) {
    EXPECT_EQ(ask(Operation::CreateInstance).rc, 11u);
    EXPECT_EQ(ask(Operation::ModifyInstance).rc, 12u);
    EXPECT_EQ(ask(Operation::DeleteInstance).rc, 2u);
    EXPECT_EQ(ask(Operation::ExecQuery).rc, 14u);
    EXPECT_EQ(mi->ft->cleanup(mi, nullptr, 0).rc, 50u);
    EXPECT_EQ(mi->ft->cleanup(mi, nullptr, 1).rc, 0u);
    EXPECT_STREQ(mi->ft->miName, "instancePlainProvider");
}

}  // namespace
