// What the provider asks the object manager about computer systems.
#include <utility>

#include "library/LibraryFixture.h"

namespace {

using namespace cmpihost;
using testing::ElementsAre;
using testing::IsEmpty;

using Texts = std::vector<std::string>;

/// Answers as the service behind it and keeps what was asked, each as "operation path
/// [properties]".
class RecordingService final : public UpcallService {
  public:
    explicit RecordingService(UpcallService& behind) : behind_(behind) {}

    UpcallAnswer perform(Broker& broker, const OperationRequest& request) override {
        std::string question = operationName(request.operation);
        question += " " + toString(request.path);
        if (request.properties) question += " with a property list";
        asked_.push_back(std::move(question));
        return behind_.perform(broker, request);
    }

    Texts take() { return std::exchange(asked_, {}); }

  private:
    UpcallService& behind_;
    Texts asked_{};
};

class Upcall : public LibraryFixture {
  protected:
    Upcall() { broker.route(ComputerSystemService::className, service); }

    // What one request of each kind asks, from an operating system with these keys.
    void expectAsked(const std::vector<KeyBinding>& keys, const std::string& question) {
        const ObjectPathValue source = path("KORVA_OperatingSystem", keys);
        for (const char* association : {"KORVA_InstalledOS", "KORVA_RunningOS"}) {
            associatorNames(source, association);
            EXPECT_THAT(service.take(), ElementsAre(question)) << association;
            associators(source, association);
            EXPECT_THAT(service.take(), ElementsAre(question)) << association;
        }
    }

    RecordingService service{computers};
};

const std::string ofNoKey = "EnumerateInstances root/cimv2:KORVA_ComputerSystem";

TEST_F(Upcall, AsksOnceForTheComputerThatTheSourceNames) {
    expectAsked({{"CSCreationClassName", "KORVA_ComputerSystem"},
                 {"CSName", "h"},
                 {"CreationClassName", "KORVA_OperatingSystem"},
                 {"Name", "n"}},
                "EnumerateInstances root/cimv2:KORVA_ComputerSystem.Name=\"h\"");
}

TEST_F(Upcall, FirstOfTheTwoKeysThatMayNameTheComputerDecides) {
    expectAsked({{"CSName", "h"}, {"Name", "n"}},
                "EnumerateInstances root/cimv2:KORVA_ComputerSystem.Name=\"h\"");
    expectAsked({{"Name", "n"}, {"CSName", "h"}},
                "EnumerateInstances root/cimv2:KORVA_ComputerSystem.Name=\"n\"");
    expectAsked({{"Name", "n"}}, "EnumerateInstances root/cimv2:KORVA_ComputerSystem.Name=\"n\"");
}

TEST_F(Upcall, KeyOfAnotherTypeNamesTheComputerByItsText) {
    expectAsked({{"CSName", Value::fromUnsigned(5)}},
                "EnumerateInstances root/cimv2:KORVA_ComputerSystem.Name=\"5\"");
    expectAsked({{"CSName", Value::fromSigned(-5)}, {"Name", "n"}},
                "EnumerateInstances root/cimv2:KORVA_ComputerSystem.Name=\"-5\"");
    expectAsked({{"CSName", Value::fromBoolean(true)}},
                "EnumerateInstances root/cimv2:KORVA_ComputerSystem.Name=\"true\"");
}

TEST_F(Upcall, ReferenceAsKeyIsPassedOver) {
    expectAsked({{"CSName", Value::fromReference(computerSystemPath("h"))}, {"Name", "n"}},
                "EnumerateInstances root/cimv2:KORVA_ComputerSystem.Name=\"n\"");
}

TEST_F(Upcall, KeylessSourceAsksForEveryComputer) {
    expectAsked({}, ofNoKey);
}

TEST_F(Upcall, EnumerationAndGetOfAComputersAssociationAskForEveryComputer) {
    for (const char* association : {"KORVA_InstalledOS", "KORVA_RunningOS"}) {
        enumerateNames(association);
        EXPECT_THAT(service.take(), ElementsAre(ofNoKey));
        enumerate(association);
        EXPECT_THAT(service.take(), ElementsAre(ofNoKey));
        get(path(association));
        EXPECT_THAT(service.take(), ElementsAre(ofNoKey));
    }
}

TEST_F(Upcall, StaysInTheNamespaceOfTheRequest) {
    OperationRequest request;
    for (const char* association : {"KORVA_InstalledOS", "KORVA_RunningOS"}) {
        request.operation = Operation::AssociatorNames;
        request.path = operatingSystemPath("h", "n");
        request.path.nameSpace = "root/other";
        request.assocClass = association;
        const Outcome farEnds = invoke(request);
        EXPECT_THAT(service.take(),
                    ElementsAre("EnumerateInstances root/other:KORVA_ComputerSystem.Name=\"h\""));
        ASSERT_EQ(farEnds.paths.size(), 1U);
        EXPECT_EQ(farEnds.paths[0].nameSpace, "root/other");
        request.operation = Operation::EnumerateInstances;
        request.path = path(association);
        request.path.nameSpace = "root/other";
        invoke(request);
        EXPECT_THAT(service.take(),
                    ElementsAre("EnumerateInstances root/other:KORVA_ComputerSystem"));
    }
}

TEST_F(Upcall, PropertyListOfTheRequestIsNotPassedOn) {
    OperationRequest request =
        requestFor(Operation::Associators, operatingSystemPath("h", "n"), "KORVA_RunningOS");
    request.properties = Texts{"Name"};
    invoke(request);
    EXPECT_THAT(service.take(),
                ElementsAre("EnumerateInstances root/cimv2:KORVA_ComputerSystem.Name=\"h\""));
}

TEST_F(Upcall, NothingIsAskedWhereNoComputerIsNeeded) {
    for (const char* association : {"KORVA_InstalledOS", "KORVA_RunningOS"}) {
        associators(computerSystemPath("host1"), association);
        associators(capabilitiesPath("Linux"), association);
        associators(path("KORVA_OperatingSystem", {{"Other", "x"}}), association);
    }
    enumerate("KORVA_OperatingSystem");
    enumerate("KORVA_OperatingSystemCapabilities");
    enumerate("KORVA_OSElementCapabilities");
    associators(operatingSystemPath("h", "n"), "KORVA_OSElementCapabilities");
    EXPECT_THAT(service.take(), IsEmpty());
}

}  // namespace
