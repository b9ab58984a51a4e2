// What a client gets for KORVA_OperatingSystem: every value, and what happens where one is missing.
#include <ctime>
#include <iterator>
#include <utility>

#include "library/LibraryFixture.h"
#include "support/Properties.h"

namespace {

using namespace cmpihost;
using namespace VA::NodeLexicon;
using testing::ElementsAre;
using testing::IsEmpty;

const std::string linuxPath =
    "root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\","
    "CSName=\"host1\",CreationClassName=\"KORVA_OperatingSystem\",Name=\"Linux\"";

class InstanceRequests : public LibraryFixture {};

TEST_F(InstanceRequests, NamesComeOnePerNodeWithTheirKeysInOrder) {
    setNodes({"a", "b"});
    const Outcome outcome = enumerateNames("KORVA_OperatingSystem");
    expectDone(outcome);
    EXPECT_THAT(
        texts(outcome.paths),
        ElementsAre("root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\","
                    "CSName=\"host1\",CreationClassName=\"KORVA_OperatingSystem\",Name=\"a\"",
                    "root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\","
                    "CSName=\"host1\",CreationClassName=\"KORVA_OperatingSystem\",Name=\"b\""));
}

TEST_F(InstanceRequests, NamespaceOfTheRequestIsThatOfThePaths) {
    OperationRequest request =
        requestFor(Operation::EnumerateInstanceNames, path("KORVA_OperatingSystem"));
    request.path.nameSpace = "root/other";
    const Outcome outcome = invoke(request);
    ASSERT_EQ(outcome.paths.size(), 1U);
    EXPECT_EQ(outcome.paths[0].nameSpace, "root/other");
}

TEST_F(InstanceRequests, ClassNameOfTheRequestIsTakenInAnyLetterCase) {
    EXPECT_THAT(texts(enumerateNames("korva_OPERATINGsystem").paths), ElementsAre(linuxPath));
}

// `timezone` as given, as long as it lives.
class Zone {
  public:
    explicit Zone(long seconds) : before_(std::exchange(timezone, seconds)) {}
    ~Zone() { timezone = before_; }
    Zone(const Zone&) = delete;
    Zone& operator=(const Zone&) = delete;

  private:
    const long before_;
};

TEST_F(InstanceRequests, InstanceCarriesEveryAvailablePropertyInOrderOfItsTypeAndWithItsOwnValue) {
    const Zone utc(0);
    host->clearNodes();
    host->addNode(VA::SimulatedHost::plausibleNode());
    host->setComputerName("simulated.example");
    const Outcome outcome = enumerate("KORVA_OperatingSystem");
    expectDone(outcome);
    ASSERT_EQ(outcome.instances.size(), 1U);
    EXPECT_EQ(toString(outcome.instances[0].path),
              toString(operatingSystemPath("simulated.example", "Simulated Linux")));
    std::vector<std::string> expected;
    for (const PublishedProperty& each : operatingSystemProperties)
        expected.push_back(cimTypeName(each.type) + " " + each.name + "=" + each.value);
    std::vector<std::string> found;
    for (const PropertyValue& each : outcome.instances[0].properties)
        found.push_back(cimTypeName(each.value.type()) + " " + each.name + "=" +
                        each.value.toText());
    EXPECT_EQ(found, expected);
}

TEST_F(InstanceRequests, DatesAreLabelledWithTheZoneAndStatesFollowTheStatus) {
    const Zone newYork(18000);
    host->clearNodes();
    VA::SimulatedHost::Node node = VA::SimulatedHost::plausibleNode();
    node.properties[InstallDate] = std::string("2024-02-29-23:59:58");
    node.status = 20;
    host->addNode(node);
    const Outcome outcome = enumerate("KORVA_OperatingSystem");
    ASSERT_EQ(outcome.instances.size(), 1U);
    const std::pair<const char*, const char*> expected[] = {
        {"InstallDate", "20240229235958.000000+300"},
        {"LastBootUpTime", "20240229235958.000000+300"},
        {"OperationalStatus", "{3, 5}"},
        {"HealthState", "10"},
        {"EnabledState", "5"},
    };
    for (const auto& [name, value] : expected)
        EXPECT_EQ(text(outcome.instances[0], name), value) << name;
}

TEST_F(InstanceRequests, PropertyThatTheHostCannotSupplyIsLeftOut) {
    setNodes({"Linux"});
    const Outcome outcome = enumerate("KORVA_OperatingSystem");
    ASSERT_EQ(outcome.instances.size(), 1U);
    std::vector<std::string> expected;
    for (const PublishedProperty& each : operatingSystemProperties)
        if (each.id == 0 || each.id == Name) expected.push_back(each.name);
    std::vector<std::string> found;
    for (const PropertyValue& each : outcome.instances[0].properties) found.push_back(each.name);
    EXPECT_EQ(found, expected);
}

TEST_F(InstanceRequests, DateThatIsNoneIsLeftOutAndTheRestStays) {
    host->clearNodes();
    VA::SimulatedHost::Node node = VA::SimulatedHost::plausibleNode();
    node.properties[InstallDate] = std::string("never");
    host->addNode(node);
    const Outcome outcome = enumerate("KORVA_OperatingSystem");
    ASSERT_EQ(outcome.instances.size(), 1U);
    EXPECT_EQ(text(outcome.instances[0], "InstallDate"), "(absent)");
    EXPECT_NE(text(outcome.instances[0], "LastBootUpTime"), "(absent)");
}

TEST_F(InstanceRequests, UnknownComputerNameLeavesCSNameOut) {
    host->setComputerName(std::nullopt);
    const Outcome names = enumerateNames("KORVA_OperatingSystem");
    ASSERT_EQ(names.paths.size(), 1U);
    EXPECT_EQ(names.paths[0].key("CSName"), nullptr);
    const Outcome instances = enumerate("KORVA_OperatingSystem");
    ASSERT_EQ(instances.instances.size(), 1U);
    EXPECT_EQ(text(instances.instances[0], "CSName"), "(absent)");
    // The strict broker notes the key that the class declares.
    EXPECT_THAT(broker.takeViolations(),
                ElementsAre("path of KORVA_OperatingSystem without key CSName",
                            "path of KORVA_OperatingSystem without key CSName"));
}

TEST_F(InstanceRequests, PropertyListIsNotApplied) {
    OperationRequest request =
        requestFor(Operation::EnumerateInstances, path("KORVA_OperatingSystem"));
    const std::size_t all = invoke(request).instances.at(0).properties.size();
    for (const std::vector<std::string>& list :
         {std::vector<std::string>{"Name"}, std::vector<std::string>{},
          std::vector<std::string>{"NoSuchProperty"}}) {
        request.properties = list;
        const Outcome outcome = invoke(request);
        ASSERT_EQ(outcome.instances.size(), 1U);
        EXPECT_EQ(outcome.instances[0].properties.size(), all);
    }
}

TEST_F(InstanceRequests, GetFindsTheNodeByItsKeysInAnyLetterCase) {
    for (const ObjectPathValue& asked :
         {operatingSystemPath("host1", "Linux"), operatingSystemPath("HOST1", "lINUX"),
          path("KORVA_OperatingSystem", {{"Name", "linux"}}),
          path("KORVA_OperatingSystem", {{"CSName", "Host1"}}),
          path("KORVA_OperatingSystem", {{"csname", "host1"}, {"NAME", "Linux"}}),
          path("KORVA_OperatingSystem", {{"CreationClassName", "Wrong"}, {"Name", "Linux"}}),
          path("KORVA_OperatingSystem",
               {{"Name", Value::fromText("Linux", CMPI_chars)}, {"Unknown", "x"}})}) {
        const Outcome outcome = get(asked);
        expectDone(outcome);
        EXPECT_THAT(texts(outcome.instances), ElementsAre(linuxPath));
    }
}

TEST_F(InstanceRequests, GetOfAnotherNodeReturnsNothingAndDone) {
    for (const ObjectPathValue& asked :
         {operatingSystemPath("host1", "Linux "), operatingSystemPath("host1 ", "Linux"),
          operatingSystemPath("host2", "Linux"), operatingSystemPath("host1", ""),
          operatingSystemPath("", "Linux")}) {
        const Outcome outcome = get(asked);
        expectDone(outcome);
        EXPECT_THAT(outcome.instances, IsEmpty());
    }
}

TEST_F(InstanceRequests, NumberAndBooleanKeysAreComparedAsText) {
    setNodes({"17", "true"});
    const auto named = [this](Value value) {
        return texts(get(path("KORVA_OperatingSystem", {{"Name", std::move(value)}})).instances)
            .size();
    };
    EXPECT_EQ(named(Value::fromUnsigned(17)), 1U);
    EXPECT_EQ(named(Value::fromSigned(17)), 1U);
    EXPECT_EQ(named(Value::fromBoolean(true)), 1U);
    EXPECT_EQ(named(Value::fromBoolean(false)), 0U);
    // A reference is no text: it filters nothing.
    EXPECT_EQ(named(Value::fromReference(capabilitiesPath("x"))), 2U);
}

TEST_F(InstanceRequests, KeysNarrowEnumerationsToo) {
    setNodes({"a", "b", "A"});
    OperationRequest request = requestFor(Operation::EnumerateInstanceNames,
                                          path("KORVA_OperatingSystem", {{"Name", "a"}}));
    EXPECT_EQ(invoke(request).paths.size(), 2U);
    request.path = path("KORVA_OperatingSystem", {{"SomethingElse", "a"}});
    EXPECT_EQ(invoke(request).paths.size(), 3U);
}

TEST_F(InstanceRequests, WithoutANodeEveryOperationReturnsOnlyDone) {
    setNodes({});
    for (const Outcome& outcome :
         {enumerateNames("KORVA_OperatingSystem"), enumerate("KORVA_OperatingSystem"),
          get(operatingSystemPath("host1", "Linux"))}) {
        expectDone(outcome);
        EXPECT_THAT(outcome.paths, IsEmpty());
        EXPECT_THAT(outcome.instances, IsEmpty());
    }
}

TEST_F(InstanceRequests, ClassThatIsNotServedIsInvalidAndNothingIsReturned) {
    for (const char* className : {"KORVA_ComputerSystem", "CIM_OperatingSystem", "", "KORVA_",
                                  "KORVA_OperatingSystemX", "\xff%n"}) {
        for (const Outcome& outcome : {enumerateNames(className), enumerate(className),
                                       get(path(className, {{"Name", "x"}}))}) {
            EXPECT_EQ(outcome.rc, CMPI_RC_ERR_INVALID_CLASS) << className;
            EXPECT_FALSE(outcome.message.has_value()) << className;
            EXPECT_EQ(outcome.doneCount, 0U) << className;
        }
    }
}

TEST_F(InstanceRequests, PathThatTheBrokerDoesNotMakeEndsTheWalk) {
    setNodes({"a", "b", "c"});
    FaultPlan second(Fault{"newObjectPath", 2, 1, CMPI_RC_OK});
    broker.setFaultPlan(&second);
    const Outcome names = enumerateNames("KORVA_OperatingSystem");
    broker.setFaultPlan(nullptr);
    expectDone(names);
    EXPECT_EQ(names.paths.size(), 1U);
}

/// A broker whose tables are as poor as a provider may meet them.
class SparseBroker : public LibraryFixture {
  protected:
    SparseBroker() : LibraryFixture(BrokerOptions::sparse()) {}
};

TEST_F(SparseBroker, ServesTheSameInstances) {
    const Outcome outcome = enumerate("KORVA_OperatingSystem");
    EXPECT_THAT(texts(outcome.instances), ElementsAre(linuxPath));
    EXPECT_EQ(outcome.instances[0].properties.size(), std::size(operatingSystemProperties));
    EXPECT_THAT(texts(get(operatingSystemPath("HOST1", "linux")).instances),
                ElementsAre(linuxPath));
    EXPECT_EQ(
        associatorNames(operatingSystemPath("host1", "Linux"), "KORVA_InstalledOS").paths.size(),
        1U);
}

}  // namespace
