#include <new>
#include <stdexcept>

#include "facade/FacadeFixture.h"

// What is made of an answer of the provider that breaks off: the provider itself says OK.

namespace {

using namespace facade;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using HostOperation = VA::SimulatedHost::Operation;

class BrokenWalks : public FacadeFixture {
  protected:
    static OperationRequest request(Operation operation, const std::string& className) {
        OperationRequest result;
        result.operation = operation;
        result.path = path(className);
        return result;
    }
};

TEST_F(BrokenWalks, OfAssociationsWithoutAComputerSystemMeanThatThereAreNone) {
    const auto expectNone = [this] {
        for (const char* association : {"KORVA_InstalledOS", "KORVA_RunningOS"}) {
            for (const Operation operation :
                 {Operation::EnumerateInstanceNames, Operation::EnumerateInstances})
                EXPECT_THAT(delivered(request(operation, association)), IsEmpty());
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
    EXPECT_THAT(delivered(request(Operation::EnumerateInstances, "KORVA_OSElementCapabilities")),
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
            EXPECT_EQ(refusal(request(operation, name)),
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
        EXPECT_EQ(refusal(request(operation, "KORVA_OperatingSystem")),
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
        OperationRequest result = request(Operation::GetInstance, path.className);
        result.path = path;
        return refusal(result);
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
    EXPECT_EQ(refusal(request(Operation::EnumerateInstances, "KORVA_OperatingSystem")),
              "1 unknown exception");
    EXPECT_EQ(refusal(associationRequest(Operation::AssociatorNames, capabilitiesPath("Linux"))),
              "1 unknown exception");
    host->setHook({});
    // From outside of the provider's walk even a standard one comes through.
    recording::setHook([](const recording::Record& record) {
        if (record.function == "markProviderEntry") throw std::runtime_error("from\tthe log");
    });
    EXPECT_EQ(refusal(request(Operation::EnumerateInstanceNames, "KORVA_OperatingSystem")),
              "1 from\\x09the log");
    // The record of the refusal may fail too.
    recording::setHook([](const recording::Record&) { throw Foreign{}; });
    EXPECT_EQ(ask(request(Operation::EnumerateInstances, "KORVA_OperatingSystem")).rc,
              CMPI_RC_ERR_FAILED);
}

}  // namespace
