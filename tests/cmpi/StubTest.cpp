// The stubs that write table and factory of an MI, in C++ and in C.
#include <cmpi/cmpimacs.h>
#include <dlfcn.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

// A function for a slot of any MI. It returns a code of its own, so that slots can be told apart.
template <int Code, class MI, class... Arguments>
CMPIStatus answer(MI*, Arguments...) {
    CMReturn(static_cast<CMPIrc>(Code));
}

constexpr decltype(CMPIInstanceMIFT::cleanup) stubCleanup = answer<1>;
constexpr decltype(CMPIInstanceMIFT::enumerateInstanceNames) stubEnumInstanceNames = answer<2>;
constexpr decltype(CMPIInstanceMIFT::enumerateInstances) stubEnumInstances = answer<3>;
constexpr decltype(CMPIInstanceMIFT::getInstance) stubGetInstance = answer<4>;
constexpr decltype(CMPIInstanceMIFT::createInstance) stubCreateInstance = answer<5>;
constexpr decltype(CMPIInstanceMIFT::modifyInstance) stubModifyInstance = answer<6>;
constexpr decltype(CMPIInstanceMIFT::deleteInstance) stubDeleteInstance = answer<7>;
constexpr decltype(CMPIInstanceMIFT::execQuery) stubExecQuery = answer<8>;

constexpr decltype(CMPIAssociationMIFT::cleanup) stubAssociationCleanup = answer<11>;
constexpr decltype(CMPIAssociationMIFT::associators) stubAssociators = answer<12>;
constexpr decltype(CMPIAssociationMIFT::associatorNames) stubAssociatorNames = answer<13>;
constexpr decltype(CMPIAssociationMIFT::references) stubReferences = answer<14>;
constexpr decltype(CMPIAssociationMIFT::referenceNames) stubReferenceNames = answer<15>;

constexpr decltype(CMPIMethodMIFT::cleanup) stubMethodCleanup = answer<21>;
constexpr decltype(CMPIMethodMIFT::invokeMethod) stubInvokeMethod = answer<22>;

constexpr decltype(CMPIPropertyMIFT::cleanup) stubPropertyCleanup = answer<31>;
constexpr decltype(CMPIPropertyMIFT::setProperty) stubSetProperty = answer<32>;
constexpr decltype(CMPIPropertyMIFT::getProperty) stubGetProperty = answer<33>;

constexpr decltype(CMPIIndicationMIFT::cleanup) stubIndicationCleanup = answer<41>;
constexpr decltype(CMPIIndicationMIFT::authorizeFilter) stubAuthorizeFilter = answer<42>;
constexpr decltype(CMPIIndicationMIFT::mustPoll) stubMustPoll = answer<43>;
constexpr decltype(CMPIIndicationMIFT::activateFilter) stubActivateFilter = answer<44>;
constexpr decltype(CMPIIndicationMIFT::deActivateFilter) stubDeActivateFilter = answer<45>;
constexpr decltype(CMPIIndicationMIFT::enableIndications) stubEnableIndications = answer<46>;
constexpr decltype(CMPIIndicationMIFT::disableIndications) stubDisableIndications = answer<47>;

const CMPIBroker* storedBroker = nullptr;
const CMPIContext* contextOfHook = nullptr;

}  // namespace

CMInstanceMIStub(stub, Sample, storedBroker, contextOfHook = ctx)
    CMAssociationMIStub(stub, Sample, storedBroker, CMNoHook)
        CMMethodMIStub(stub, Sample, storedBroker, CMNoHook)
            CMPropertyMIStub(stub, Sample, storedBroker, CMNoHook)
                CMIndicationMIStub(stub, Sample, storedBroker, CMNoHook)

                    extern "C" CMPIInstanceMI* PlainProvider_Create_InstanceMI(const CMPIBroker*,
                                                                               const CMPIContext*,
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
    ASSERT_NE(mi, nullptr);
    EXPECT_EQ(mi->hdl, nullptr);
    EXPECT_EQ(mi->ft->ftVersion, 200);
    EXPECT_EQ(mi->ft->miVersion, 200);
    EXPECT_STREQ(mi->ft->miName, miName);
}

TEST(CmpiStubs, InstanceTableHoldsThePrefixedFunctions) {
    const auto* mi = make<CMPIInstanceMI>("Sample_Create_InstanceMI", nullptr, nullptr, nullptr);
    ASSERT_NO_FATAL_FAILURE(expectHead(mi, "instanceSample"));
    EXPECT_EQ(mi->ft->cleanup, stubCleanup);
    EXPECT_EQ(mi->ft->enumerateInstanceNames, stubEnumInstanceNames);
    EXPECT_EQ(mi->ft->enumerateInstances, stubEnumInstances);
    EXPECT_EQ(mi->ft->getInstance, stubGetInstance);
    EXPECT_EQ(mi->ft->createInstance, stubCreateInstance);
    EXPECT_EQ(mi->ft->modifyInstance, stubModifyInstance);
    EXPECT_EQ(mi->ft->deleteInstance, stubDeleteInstance);
    EXPECT_EQ(mi->ft->execQuery, stubExecQuery);
}

TEST(CmpiStubs, AssociationTableHoldsThePrefixedFunctions) {
    const auto* mi =
        make<CMPIAssociationMI>("Sample_Create_AssociationMI", nullptr, nullptr, nullptr);
    ASSERT_NO_FATAL_FAILURE(expectHead(mi, "associationSample"));
    EXPECT_EQ(mi->ft->cleanup, stubAssociationCleanup);
    EXPECT_EQ(mi->ft->associators, stubAssociators);
    EXPECT_EQ(mi->ft->associatorNames, stubAssociatorNames);
    EXPECT_EQ(mi->ft->references, stubReferences);
    EXPECT_EQ(mi->ft->referenceNames, stubReferenceNames);
}

TEST(CmpiStubs, MethodTableHoldsThePrefixedFunctions) {
    const auto* mi = make<CMPIMethodMI>("Sample_Create_MethodMI", nullptr, nullptr, nullptr);
    ASSERT_NO_FATAL_FAILURE(expectHead(mi, "methodSample"));
    EXPECT_EQ(mi->ft->cleanup, stubMethodCleanup);
    EXPECT_EQ(mi->ft->invokeMethod, stubInvokeMethod);
}

TEST(CmpiStubs, PropertyTableHoldsThePrefixedFunctionsAndNoOrigin) {
    const auto* mi = make<CMPIPropertyMI>("Sample_Create_PropertyMI", nullptr, nullptr, nullptr);
    ASSERT_NO_FATAL_FAILURE(expectHead(mi, "propertySample"));
    EXPECT_EQ(mi->ft->cleanup, stubPropertyCleanup);
    EXPECT_EQ(mi->ft->setProperty, stubSetProperty);
    EXPECT_EQ(mi->ft->getProperty, stubGetProperty);
    EXPECT_EQ(mi->ft->setPropertyWithOrigin, nullptr);
}

TEST(CmpiStubs, IndicationTableHoldsThePrefixedFunctions) {
    const auto* mi =
        make<CMPIIndicationMI>("Sample_Create_IndicationMI", nullptr, nullptr, nullptr);
    ASSERT_NO_FATAL_FAILURE(expectHead(mi, "indicationSample"));
    EXPECT_EQ(mi->ft->cleanup, stubIndicationCleanup);
    EXPECT_EQ(mi->ft->authorizeFilter, stubAuthorizeFilter);
    EXPECT_EQ(mi->ft->mustPoll, stubMustPoll);
    EXPECT_EQ(mi->ft->activateFilter, stubActivateFilter);
    EXPECT_EQ(mi->ft->deActivateFilter, stubDeActivateFilter);
    EXPECT_EQ(mi->ft->enableIndications, stubEnableIndications);
    EXPECT_EQ(mi->ft->disableIndications, stubDisableIndications);
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

// As much of an object manager as the provider in C calls: it enumerates three objects, notes what
// the provider makes and what it returns.
class PlainCProvider : public testing::Test {
  protected:
    PlainCProvider() {
        notes.clear();
        position = 0;
        enumerationTable.hasNext = [](const CMPIEnumeration*, CMPIStatus*) -> CMPIBoolean {
            return position < 3;
        };
        enumerationTable.getNext = [](const CMPIEnumeration*, CMPIStatus*) {
            CMPIData item = {CMPI_ref, CMPI_goodValue, {0}};
            item.value.ref = &paths[position++];
            return item;
        };
        upCalls.enumerateInstanceNames = [](const CMPIBroker*, const CMPIContext*,
                                            const CMPIObjectPath*, CMPIStatus*) {
            notes.push_back("names");
            return enumeration;
        };
        upCalls.enumerateInstances = [](const CMPIBroker*, const CMPIContext*,
                                        const CMPIObjectPath*, const char** properties,
                                        CMPIStatus*) {
            notes.push_back(std::string("instances with ") + properties[0]);
            return enumeration;
        };
        makers.newObjectPath = [](const CMPIBroker*, const char* ns, const char* cn, CMPIStatus*) {
            notes.push_back(std::string("path ") + ns + ":" + cn);
            return &paths[0];
        };
        makers.newInstance = [](const CMPIBroker*, const CMPIObjectPath*, CMPIStatus*) {
            notes.push_back("instance");
            return &madeInstance;
        };
        makers.newString = [](const CMPIBroker*, const char* text, CMPIStatus*) {
            notes.push_back(std::string("string ") + text);
            return &madeString;
        };
        pathTable.addKey = [](CMPIObjectPath*, const char* name, const CMPIValue* value,
                              CMPIType type) {
            EXPECT_EQ(type, CMPI_chars);
            notes.push_back(std::string("key ") + name + "=" +
                            reinterpret_cast<const char*>(value));
            return CMPIStatus{CMPI_RC_OK, nullptr};
        };
        instanceTable.setProperty = [](const CMPIInstance*, const char* name,
                                       const CMPIValue* value, CMPIType type) {
            EXPECT_EQ(type, CMPI_uint32);
            notes.push_back(std::string("property ") + name + "=" + std::to_string(value->uint32));
            return CMPIStatus{CMPI_RC_OK, nullptr};
        };
        resultTable.returnObjectPath = [](const CMPIResult*, const CMPIObjectPath* path) {
            notes.push_back("return path " + std::to_string(path - paths));
            return CMPIStatus{CMPI_RC_OK, nullptr};
        };
        resultTable.returnInstance = [](const CMPIResult*, const CMPIInstance*) {
            notes.push_back("return instance");
            return CMPIStatus{CMPI_RC_OK, nullptr};
        };
        resultTable.returnDone = [](const CMPIResult*) {
            notes.push_back("done");
            return CMPIStatus{CMPI_RC_OK, nullptr};
        };
    }

    using Notes = std::vector<std::string>;
    static inline Notes notes;
    static inline int position = 0;
    static inline CMPIObjectPathFT pathTable = {};
    static inline CMPIInstanceFT instanceTable = {};
    static inline CMPIEnumerationFT enumerationTable = {};
    static inline CMPIObjectPath paths[3] = {
        {&notes, &pathTable}, {&notes, &pathTable}, {&notes, &pathTable}};
    static inline CMPIInstance madeInstance = {&notes, &instanceTable};
    static inline CMPIString madeString = {};
    static inline CMPIEnumeration threeItems = {&notes, &enumerationTable};
    static inline CMPIEnumeration* enumeration = &threeItems;

    CMPIBrokerFT upCalls = {};
    CMPIBrokerEncFT makers = {};
    CMPIResultFT resultTable = {};
    const CMPIBroker broker = {nullptr, &upCalls, &makers, nullptr, nullptr};
    const CMPIResult result = {&notes, &resultTable};
    CMPIInstanceMI* const mi = PlainProvider_Create_InstanceMI(&broker, nullptr, nullptr);
};

TEST_F(PlainCProvider, HandsOnEveryNameOfAnEnumeration) {
    enumeration = &threeItems;
    EXPECT_EQ(mi->ft->enumerateInstanceNames(mi, nullptr, &result, nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(notes, (Notes{"names", "return path 0", "return path 1", "return path 2", "done"}));
}

TEST_F(PlainCProvider, ReportsAMissingEnumerationWithText) {
    enumeration = nullptr;
    const CMPIStatus status = mi->ft->enumerateInstanceNames(mi, nullptr, &result, nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(status.msg, &madeString);
    EXPECT_EQ(notes, (Notes{"names", "string no enumeration"}));
}

TEST_F(PlainCProvider, PassesThePropertyListToTheObjectManager) {
    enumeration = &threeItems;
    const char* properties[] = {"Name", nullptr};
    mi->ft->enumerateInstances(mi, nullptr, &result, nullptr, properties);
    EXPECT_EQ(notes, (Notes{"instances with Name", "return instance", "return instance",
                            "return instance", "done"}));
}

TEST_F(PlainCProvider, MakesAnInstanceWithKeyAndProperty) {
    mi->ft->getInstance(mi, nullptr, &result, nullptr, nullptr);
    EXPECT_EQ(notes, (Notes{"path root/cimv2:Plain_Class", "key Name=first", "instance",
                            "property NumberOfUsers=3", "return instance", "done"}));
}

TEST_F(PlainCProvider, AnswersTheOtherOperationsWithTheirCodes) {
    CMPIInstanceMIFT* const ft = mi->ft;
    EXPECT_EQ(ft->createInstance(mi, nullptr, &result, nullptr, nullptr).rc, 11u);
    EXPECT_EQ(ft->modifyInstance(mi, nullptr, &result, nullptr, nullptr, nullptr).rc, 12u);
    EXPECT_EQ(ft->deleteInstance(mi, nullptr, &result, nullptr).rc, 2u);
    EXPECT_EQ(ft->execQuery(mi, nullptr, &result, nullptr, nullptr, nullptr).rc, 14u);
    EXPECT_EQ(ft->cleanup(mi, nullptr, 0).rc, 50u);
    EXPECT_EQ(ft->cleanup(mi, nullptr, 1).rc, 0u);
    EXPECT_STREQ(ft->miName, "instancePlainProvider");
}

}  // namespace
