#include "facade/FacadeFixture.h"

// Requests for instances are passed on; property lists are applied to what comes back.

namespace {

using namespace facade;
using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::IsEmpty;

class InstanceRequests : public FacadeFixture {
  protected:
    static Texts names(const InstanceValue& instance) {
        Texts result;
        for (const PropertyValue& property : instance.properties) result.push_back(property.name);
        return result;
    }
};

TEST_F(InstanceRequests, AreAnsweredAsByTheProvider) {
    for (const char* name :
         {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities", "KORVA_InstalledOS",
          "KORVA_RunningOS", "KORVA_OSElementCapabilities", "korva_OPERATINGsystem"}) {
        EXPECT_EQ(ask(Operation::EnumerateInstanceNames, path(name)).paths,
                  enumerateNames(name).paths);
        const Outcome facades = ask(Operation::EnumerateInstances, path(name));
        const Outcome providers = enumerate(name);
        ASSERT_EQ(facades.instances.size(), 1U);
        EXPECT_EQ(facades.doneCount, 1U);
        EXPECT_EQ(facades.instances[0].path, providers.instances[0].path);
        EXPECT_EQ(names(facades.instances[0]), names(providers.instances[0]));
    }
}

TEST_F(InstanceRequests, OfOtherClassesAreRefusedByTheirName) {
    for (const Operation operation :
         {Operation::EnumerateInstanceNames, Operation::EnumerateInstances}) {
        OperationRequest request;
        request.operation = operation;
        for (const char* name : {"KORVA_ComputerSystem", "CIM_OperatingSystem", "TEST_Nothing"}) {
            request.path = path(name);
            EXPECT_EQ(refusal(request), std::string("5 ") + name + " is not served here");
        }
    }
}

TEST_F(InstanceRequests, ThatWriteAreRefusedByTheirOperation) {
    OperationRequest request;
    request.path = operatingSystemPath("host1", "Linux");
    request.instance.path = request.path;
    for (const Operation operation :
         {Operation::CreateInstance, Operation::ModifyInstance, Operation::DeleteInstance}) {
        request.operation = operation;
        EXPECT_EQ(refusal(request), std::string("7 ") + operationName(operation) +
                                        " is not supported for KORVA_OperatingSystem");
    }
}

TEST_F(InstanceRequests, PropertyListIsAppliedAndKeysStay) {
    const Texts keys = {"CSCreationClassName", "CSName", "CreationClassName", "Name"};
    struct Row {
        Texts list;
        Texts others;  // what comes beside the keys
    };
    const Row rows[] = {
        {{}, {}},
        {{"OSType"}, {"OSType"}},
        {{"ostype", "HEALTHSTATE"}, {"HealthState", "OSType"}},
        {{"NoSuchProperty", "OSType", "Caption"}, {"OSType"}},  // Caption has no value
        {{"OSType", "OSType", "osType"}, {"OSType"}},
        {{"Name", "name"}, {}},
        {{""}, {}},
        {{"OperationalStatus"}, {"OperationalStatus"}},
    };
    for (const Row& row : rows) {
        Texts expected = keys;
        expected.insert(expected.end(), row.others.begin(), row.others.end());
        for (const Operation operation : {Operation::EnumerateInstances, Operation::GetInstance}) {
            const Outcome outcome = ask(operation, operatingSystemPath("host1", "Linux"), row.list);
            ASSERT_EQ(outcome.instances.size(), 1U);
            EXPECT_THAT(names(outcome.instances[0]), testing::UnorderedElementsAreArray(expected));
            EXPECT_EQ(toString(outcome.instances[0].path), operatingSystem);
            for (const std::string& other : row.others)
                EXPECT_EQ(text(outcome.instances[0], other),
                          text(enumerate("KORVA_OperatingSystem").instances[0], other));
        }
        // The same for an end, one that another provider serves, and an association.
        for (const ObjectPathValue& source :
             {capabilitiesPath("Linux"), computerSystemPath("host1")}) {
            OperationRequest request = associationRequest(Operation::Associators, source);
            request.properties = row.list;
            EXPECT_THAT(names(ask(request).instances.at(0)),
                        testing::UnorderedElementsAreArray(expected));
        }
    }
    OperationRequest request =
        associationRequest(Operation::Associators, operatingSystemPath("host1", "Linux"));
    request.properties = Texts{"ElementName"};
    const Outcome ends = ask(request);
    ASSERT_EQ(ends.instances.size(), 2U);
    EXPECT_THAT(names(ends.instances[0]), ElementsAre("CreationClassName", "Name"));
    EXPECT_THAT(names(ends.instances[1]), ElementsAre("InstanceID", "ElementName"));
    request = associationRequest(Operation::References, capabilitiesPath("Linux"));
    request.properties = Texts{"Capabilities"};
    EXPECT_THAT(names(ask(request).instances.at(0)), ElementsAre("ManagedElement", "Capabilities"));
}

/// A broker whose tables are those of the fixture's, with some entries replaced.
class OtherBroker : public InstanceRequests {
  protected:
    OtherBroker() : upcallEntries(*broker.cmpi()->bft), entries(*broker.cmpi()->eft) {
        real = &*broker.cmpi()->eft;
        other.bft = &upcallEntries;
        other.eft = &entries;
        using Factory = CMPIInstanceMI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
        const auto create =
            reinterpret_cast<Factory>(facade.symbol("OSStatusFacade_Create_InstanceMI"));
        create(&other, nullptr, nullptr);
    }

    static inline const CMPIBrokerEncFT* real = nullptr;
    CMPIBrokerFT upcallEntries;
    CMPIBrokerEncFT entries;
    CMPIBroker other = *broker.cmpi();
};

TEST_F(OtherBroker, ThatFillsNewInstancesWithTheirClassGivesOnlyWhatIsAskedFor) {
    entries.newInstance = [](const CMPIBroker* by, const CMPIObjectPath* path, CMPIStatus* status) {
        CMPIInstance* const instance = real->newInstance(by, path, status);
        CMPIValue two = {};
        two.uint16 = 2;
        instance->ft->setProperty(instance, "EnabledDefault", &two, CMPI_uint16);
        return instance;
    };
    const ObjectPathValue asked = operatingSystemPath("host1", "Linux");
    EXPECT_THAT(names(ask(Operation::GetInstance, asked).instances.at(0)),
                testing::Contains("EnabledDefault"));
    EXPECT_THAT(
        names(ask(Operation::GetInstance, asked, Texts{"OSType"}).instances.at(0)),
        ElementsAre("CSCreationClassName", "CSName", "CreationClassName", "Name", "OSType"));
}

/// What no provider of an object manager expects to leave a function of it.
struct Unexpected {};

TEST_F(OtherBroker, WhoseFunctionsThrowGetsAStatus) {
    const auto refused = [this](Operation operation) {
        return refusal(associationRequest(operation, operatingSystemPath("host1", "Linux")));
    };
    entries.newObjectPath = [](const CMPIBroker*, const char*, const char*,
                               CMPIStatus*) -> CMPIObjectPath* { throw Unexpected{}; };
    for (const Operation operation : {Operation::EnumerateInstances, Operation::GetInstance,
                                      Operation::AssociatorNames, Operation::References})
        EXPECT_EQ(refused(operation), "1 unknown exception");
    entries.newObjectPath = real->newObjectPath;
    upcallEntries.enumerateInstances = [](const CMPIBroker*, const CMPIContext*,
                                          const CMPIObjectPath*, const char**,
                                          CMPIStatus*) -> CMPIEnumeration* {
        throw std::runtime_error("from\nthe object manager");
    };
    // The provider keeps it to itself, as it does when there are no computer systems.
    EXPECT_THAT(
        delivered(associationRequest(Operation::ReferenceNames, computerSystemPath("host1"))),
        IsEmpty());
    upcallEntries.enumerateInstances = [](const CMPIBroker*, const CMPIContext*,
                                          const CMPIObjectPath*, const char**,
                                          CMPIStatus*) -> CMPIEnumeration* { throw 1; };
    EXPECT_EQ(refused(Operation::ReferenceNames), "1 unknown exception");
}

TEST_F(OtherBroker, ThatMakesNoObjectsGetsAStatus) {
    entries.newInstance = [](const CMPIBroker* by, const CMPIObjectPath* path, CMPIStatus* status) {
        static unsigned calls = 0;
        return ++calls % 2 == 0 ? nullptr : real->newInstance(by, path, status);
    };
    OperationRequest request;
    request.operation = Operation::GetInstance;
    request.path = capabilitiesPath("Linux");
    request.properties = Texts{};
    EXPECT_EQ(refusal(request), "1 the object manager makes no instance");
    entries.newObjectPath = [](const CMPIBroker*, const char*, const char*,
                               CMPIStatus*) -> CMPIObjectPath* { return nullptr; };
    EXPECT_EQ(refusal(request), "1 the object manager makes no path");
    entries.newString = [](const CMPIBroker*, const char*, CMPIStatus*) -> CMPIString* {
        throw Unexpected{};
    };
    const Outcome outcome = ask(request);
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
    EXPECT_FALSE(outcome.message.has_value());
}

}  // namespace
