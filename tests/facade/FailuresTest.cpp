#include <new>
#include <stdexcept>

#include "facade/FacadeFixture.h"

// What is made of an answer of the provider that breaks off, when the provider itself says OK, and
// of an object manager that fails.

namespace {

using namespace facade;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using HostOperation = VA::SimulatedHost::Operation;

class BrokenWalks : public FacadeFixture {};

TEST_F(BrokenWalks, OfAssociationsWithoutAComputerSystemMeanThatThereAreNone) {
    const auto expectNone = [this] {
        for (const char* association : {"KORVA_InstalledOS", "KORVA_RunningOS"}) {
            for (const Operation operation :
                 {Operation::EnumerateInstanceNames, Operation::EnumerateInstances})
                EXPECT_THAT(delivered(requestFor(operation, path(association))), IsEmpty());
            for (const Operation operation : associationOperations)
                EXPECT_THAT(delivered(associationRequest(
                                operation, operatingSystemPath("host1", "Linux"), association)),
                            IsEmpty());
        }
        // What needs no computer system is there.
        EXPECT_THAT(delivered(associationRequest(Operation::AssociatorNames,
                                                 operatingSystemPath("host1", "Linux"))),
                    ElementsAre(capabilities));
    };
    computers.setNames({});
    expectNone();
    computers.failEnumerations(CMPI_RC_ERR_NOT_SUPPORTED);
    expectNone();
}

TEST_F(BrokenWalks, OfCapabilitiesWithoutANodeMeanThatThereAreNone) {
    setNodes({});
    EXPECT_THAT(
        delivered(requestFor(Operation::EnumerateInstances, path("KORVA_OSElementCapabilities"))),
        IsEmpty());
    EXPECT_THAT(delivered(associationRequest(Operation::Associators, capabilitiesPath("Linux"))),
                IsEmpty());
}

TEST_F(BrokenWalks, AfterSomeElementsFailTheRequest) {
    setNodes({"a", "b", "c"});
    computers.setNames({"host1", "host2", "host3", "host4"});
    const auto breakOff = [this] {
        host->throwFromCall(HostOperation::Next, 1, std::runtime_error("late"));
    };
    for (const char* name : {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities",
                             "KORVA_InstalledOS", "KORVA_OSElementCapabilities"})
        for (const Operation operation :
             {Operation::EnumerateInstanceNames, Operation::EnumerateInstances}) {
            breakOff();
            EXPECT_EQ(refusal(requestFor(operation, path(name))),
                      std::string("1 the answer about ") + name + " broke off");
        }
    for (const Operation operation : associationOperations) {
        breakOff();
        EXPECT_EQ(refusal(associationRequest(operation, computerSystemPath("host1"))),
                  "1 the answer about KORVA_InstalledOS broke off");
    }
}

TEST_F(BrokenWalks, OfElementsFailTheRequestEvenBeforeTheFirst) {
    host->throwFromCall(HostOperation::Select, 1, std::bad_alloc());
    for (const Operation operation :
         {Operation::EnumerateInstanceNames, Operation::EnumerateInstances})
        EXPECT_EQ(refusal(requestFor(operation, path("KORVA_OperatingSystem"))),
                  "1 the answer about KORVA_OperatingSystem broke off");
}

TEST_F(BrokenWalks, OfTheInstancesAtTheFarEndsFailTheRequest) {
    const OperationRequest toComputers = associationRequest(
        Operation::Associators, operatingSystemPath("host1", "Linux"), "KORVA_RunningOS");
    computers.setNames({"host1", "host2"});
    computers.failAtNext(2);
    EXPECT_EQ(refusal(toComputers), "1 the object manager does not enumerate KORVA_ComputerSystem");
    computers.failAtNext(0);
    EXPECT_THAT(delivered(toComputers), ElementsAre(computerSystem));
}

// What is there must not look as if it were gone.
TEST_F(BrokenWalks, OfGetInstanceFailTheRequest) {
    const auto get = [this](const ObjectPathValue& path, HostOperation operation, unsigned call) {
        host->throwFromCall(operation, host->calls(operation) + call, std::runtime_error("x"));
        return refusal(requestFor(Operation::GetInstance, path));
    };
    const std::string brokeOff = "1 the answer about KORVA_OperatingSystem broke off";
    EXPECT_EQ(get(operatingSystemPath("host1", "Linux"), HostOperation::Select, 1), brokeOff);
    EXPECT_EQ(get(capabilitiesPath("Linux"), HostOperation::Select, 1),
              "1 the answer about KORVA_OperatingSystemCapabilities broke off");
    // The names that tell which key is unknown.
    EXPECT_EQ(get(operatingSystemPath("host1", "other"), HostOperation::Select, 2), brokeOff);
}

TEST_F(BrokenWalks, ThatThrowWhatTheProviderDoesNotCatchFailTheRequest) {
    struct Foreign {};
    host->throwFromCall(HostOperation::Select, 1, Foreign{});
    EXPECT_EQ(refusal(requestFor(Operation::EnumerateInstances, path("KORVA_OperatingSystem"))),
              "1 unknown exception");
    EXPECT_EQ(refusal(associationRequest(Operation::AssociatorNames, capabilitiesPath("Linux"))),
              "1 unknown exception");
    host->setHook({});
    // From outside of the provider's walk even a standard one comes through.
    recording::setHook([](const recording::Record& record) {
        if (record.function == "markProviderEntry") throw std::runtime_error("from\tthe log");
    });
    EXPECT_EQ(refusal(requestFor(Operation::EnumerateInstanceNames, path("KORVA_OperatingSystem"))),
              "1 from\\x09the log");
    // The record of the refusal may fail too.
    recording::setHook([](const recording::Record&) { throw Foreign{}; });
    EXPECT_EQ(ask(requestFor(Operation::EnumerateInstances, path("KORVA_OperatingSystem"))).rc,
              CMPI_RC_ERR_FAILED);
}

/// A broker whose tables are those of the fixture's, with some entries replaced.
class OtherBroker : public FacadeFixture {
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
    OperationRequest request = requestFor(Operation::GetInstance, capabilitiesPath("Linux"));
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

TEST_F(OtherBroker, ThatFillsNewInstancesWithTheirClassGivesOnlyWhatIsAskedFor) {
    entries.newInstance = [](const CMPIBroker* by, const CMPIObjectPath* path, CMPIStatus* status) {
        CMPIInstance* const instance = real->newInstance(by, path, status);
        CMPIValue two = {};
        two.uint16 = 2;
        instance->ft->setProperty(instance, "EnabledDefault", &two, CMPI_uint16);
        return instance;
    };
    const ObjectPathValue asked = operatingSystemPath("host1", "Linux");
    EXPECT_THAT(propertyNames(ask(Operation::GetInstance, asked).instances.at(0)),
                testing::Contains("EnabledDefault"));
    EXPECT_THAT(
        propertyNames(ask(Operation::GetInstance, asked, Texts{"OSType"}).instances.at(0)),
        ElementsAre("CSCreationClassName", "CSName", "CreationClassName", "Name", "OSType"));
}

}  // namespace
