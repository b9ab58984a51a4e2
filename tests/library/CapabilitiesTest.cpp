// KORVA_OperatingSystemCapabilities, and GetInstance of its association, which alone looks at
// references.
#include "library/AssociationsFixture.h"
#include "library/LibraryFixture.h"

namespace {

using namespace cmpihost;
using testing::ElementsAre;
using testing::IsEmpty;
using Texts = std::vector<std::string>;
using namespace associations;

constexpr const char* capabilitiesClass = "KORVA_OperatingSystemCapabilities";

// The properties of an instance in their order, each as "type name=value".
Texts properties(const InstanceValue& instance) {
    Texts result;
    for (const PropertyValue& property : instance.properties)
        result.push_back(cimTypeName(property.value.type()) + " " + property.name + "=" +
                         property.value.toText());
    return result;
}

/// Requests for KORVA_OperatingSystemCapabilities.
class CapabilitiesRequests : public LibraryFixture {};

TEST_F(CapabilitiesRequests, InstanceCarriesItsFourPropertiesInOrderAndOfTheirTypes) {
    const Outcome outcome = enumerate(capabilitiesClass);
    expectDone(outcome);
    ASSERT_EQ(outcome.instances.size(), 1U);
    EXPECT_EQ(toString(outcome.instances[0].path),
              "root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"Linux\"");
    EXPECT_THAT(
        properties(outcome.instances[0]),
        ElementsAre("string InstanceID=Linux", "string ElementName=Linux",
                    "boolean ElementNameEditSupported=false", "uint16 HostShutdownBehavior=3"));
}

TEST_F(CapabilitiesRequests, NameIsEditableWhereItIsNotReadOnlyAndUnknownWhereThatIs) {
    host->clearNodes();
    VA::SimulatedHost::Node node;
    node.properties[VA::NodeLexicon::Name] = std::string("a");
    node.readOnly = {{VA::NodeLexicon::Name, false}};
    host->addNode(node);
    node.readOnly = {};
    host->addNode(node);
    const Outcome outcome = enumerate(capabilitiesClass);
    expectDone(outcome);
    ASSERT_EQ(outcome.instances.size(), 2U);
    EXPECT_THAT(
        properties(outcome.instances[0]),
        ElementsAre("string InstanceID=a", "string ElementName=a",
                    "boolean ElementNameEditSupported=true", "uint16 HostShutdownBehavior=3"));
    EXPECT_THAT(properties(outcome.instances[1]),
                ElementsAre("string InstanceID=a", "string ElementName=a",
                            "uint16 HostShutdownBehavior=3"));
}

TEST_F(CapabilitiesRequests, NamesComeOnePerNode) {
    setNodes({"a", "b"});
    const Outcome outcome = enumerateNames(capabilitiesClass);
    expectDone(outcome);
    EXPECT_THAT(texts(outcome.paths),
                ElementsAre("root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"a\"",
                            "root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"b\""));
}

TEST_F(CapabilitiesRequests, KeysOfThePathNarrowNothing) {
    setNodes({"a", "b"});
    for (const ObjectPathValue& asked :
         {capabilitiesPath("zzz"), capabilitiesPath("b"), capabilitiesPath("a"),
          capabilitiesPath(""), path(capabilitiesClass),
          path(capabilitiesClass, {{"Other", "b"}})}) {
        const Outcome outcome = get(asked);
        expectDone(outcome);
        EXPECT_THAT(texts(outcome.instances),
                    ElementsAre("root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"a\"",
                                "root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"b\""))
            << toString(asked);
    }
}

TEST_F(CapabilitiesRequests, PropertyListIsNotApplied) {
    OperationRequest request;
    request.path = capabilitiesPath("Linux");
    for (const Operation operation : {Operation::EnumerateInstances, Operation::GetInstance}) {
        request.operation = operation;
        for (const Texts& list : {Texts{"ElementName"}, Texts{}, Texts{"NoSuchProperty"}}) {
            request.properties = list;
            const Outcome outcome = invoke(request);
            expectDone(outcome);
            ASSERT_EQ(outcome.instances.size(), 1U);
            EXPECT_THAT(properties(outcome.instances[0]),
                        ElementsAre("string InstanceID=Linux", "string ElementName=Linux",
                                    "boolean ElementNameEditSupported=false",
                                    "uint16 HostShutdownBehavior=3"));
        }
    }
}

TEST_F(CapabilitiesRequests, OfANamelessNodeHaveNoKeyAndOnlyTheShutdownBehaviour) {
    host->clearNodes();
    host->addNode({});
    const Outcome instances = enumerate(capabilitiesClass);
    expectDone(instances);
    ASSERT_EQ(instances.instances.size(), 1U);
    EXPECT_EQ(toString(instances.instances[0].path),
              "root/cimv2:KORVA_OperatingSystemCapabilities");
    EXPECT_THAT(properties(instances.instances[0]), ElementsAre("uint16 HostShutdownBehavior=3"));
    EXPECT_THAT(broker.takeViolations(),
                ElementsAre("path of KORVA_OperatingSystemCapabilities without key InstanceID"));
    const Outcome names = enumerateNames(capabilitiesClass);
    expectDone(names);
    EXPECT_THAT(texts(names.paths), ElementsAre("root/cimv2:KORVA_OperatingSystemCapabilities"));
    EXPECT_THAT(broker.takeViolations(),
                ElementsAre("path of KORVA_OperatingSystemCapabilities without key InstanceID"));
}

TEST_F(CapabilitiesRequests, WithoutANodeThereAreNone) {
    setNodes({});
    for (const Outcome& outcome : {enumerateNames(capabilitiesClass), enumerate(capabilitiesClass),
                                   get(capabilitiesPath("Linux"))}) {
        expectDone(outcome);
        EXPECT_THAT(outcome.paths, IsEmpty());
        EXPECT_THAT(outcome.instances, IsEmpty());
    }
}

/// GetInstance of KORVA_OSElementCapabilities with given references.
class CapabilitiesPair : public Associations {
  protected:
    static Value ref(const ObjectPathValue& path) { return Value::fromReference(path); }

    Outcome getPair(std::vector<KeyBinding> keys) {
        recording::clear();
        return get(path("KORVA_OSElementCapabilities", std::move(keys)));
    }

    void expectFound(const Outcome& outcome, const std::string& pair) {
        expectEnd(outcome, "");
        ASSERT_EQ(outcome.instances.size(), 1U);
        EXPECT_EQ(brief(outcome.instances[0].property("ManagedElement")) + "+" +
                      brief(outcome.instances[0].property("Capabilities")),
                  pair);
    }

    void expectNotFound(const Outcome& outcome, const std::string& message = "Object Not Found.") {
        expectEnd(outcome, message);
        EXPECT_THAT(outcome.instances, IsEmpty());
    }
};

TEST_F(CapabilitiesPair, ConsistentOneYieldsOneInstance) {
    expectFound(getPair({{"ManagedElement", ref(operatingSystemPath("host1", "Linux"))},
                         {"Capabilities", ref(capabilitiesPath("Linux"))}}),
                "Linux+Linux");
    setNodes({"a", "b"});
    expectFound(getPair({{"Capabilities", ref(capabilitiesPath("b"))},
                         {"ManagedElement", ref(path("KORVA_OperatingSystem", {{"Name", "b"}}))}}),
                "b+a");
    setNodes({"a", "b", "c"});
    expectFound(getPair({{"ManagedElement", ref(operatingSystemPath("host1", "c"))},
                         {"Capabilities", ref(capabilitiesPath("c"))}}),
                "c+a");
}

TEST_F(CapabilitiesPair, ConsistentOneWithoutANodeIsGivenWithoutTheKeysOfItsEnds) {
    setNodes({});
    const Outcome outcome = getPair({{"ManagedElement", ref(operatingSystemPath("host1", "Linux"))},
                                     {"Capabilities", ref(capabilitiesPath("Linux"))}});
    expectFound(outcome, "-+-");
    EXPECT_EQ(
        text(outcome.instances[0], "ManagedElement"),
        "root/"
        "cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\",CSName=\"host1\","
        "CreationClassName=\"KORVA_OperatingSystem\"");
    EXPECT_EQ(text(outcome.instances[0], "Capabilities"),
              "root/cimv2:KORVA_OperatingSystemCapabilities");
    EXPECT_THAT(broker.takeViolations(),
                ElementsAre("path of KORVA_OperatingSystem without key Name",
                            "path of KORVA_OperatingSystemCapabilities without key InstanceID"));
}

TEST_F(CapabilitiesPair, ContradictingOneIsNotFound) {
    for (const char* name : {"linux", "Linux ", "Linu", "", "x"})
        expectNotFound(getPair({{"ManagedElement", ref(operatingSystemPath("host1", name))},
                                {"Capabilities", ref(capabilitiesPath("Linux"))}}));
}

TEST_F(CapabilitiesPair, PartlyMissingOneIsNotFound) {
    expectNotFound(getPair({{"ManagedElement", ref(operatingSystemPath("host1", "Linux"))}}));
    expectNotFound(getPair({{"Capabilities", ref(capabilitiesPath("Linux"))}}));
    expectNotFound(getPair({{"ManagedElement", "text"}, {"Capabilities", "text"}}));
    expectNotFound(
        getPair({{"ManagedElement", ref(path("KORVA_OperatingSystem", {{"CSName", "h"}}))},
                 {"Capabilities", ref(capabilitiesPath("Linux"))}}));
    expectNotFound(getPair({{"ManagedElement", ref(operatingSystemPath("host1", "Linux"))},
                            {"Capabilities", ref(path("KORVA_OperatingSystemCapabilities"))}}));
}

TEST_F(CapabilitiesPair, ForeignReferenceFailsWithTheMappingsMessage) {
    expectNotFound(getPair({{"ManagedElement", ref(operatingSystemPath("host1", "Linux"))},
                            {"Capabilities", ref(path("KORVA_Other", {{"Key", "Linux"}}))}}),
                   "Could not find 'InstanceID' Key in Moniker");
    // Before it is seen that the other one is missing.
    expectNotFound(getPair({{"Capabilities", ref(path("KORVA_Other", {{"Key", "Linux"}}))}}),
                   "Could not find 'InstanceID' Key in Moniker");
    // The classes of the references are not looked at, only their keys.
    expectFound(getPair({{"ManagedElement", ref(path("KORVA_Other", {{"Name", "Linux"}}))},
                         {"Capabilities", ref(path("KORVA_Other", {{"InstanceID", "Linux"}}))}}),
                "Linux+Linux");
}

TEST_F(CapabilitiesPair, ConsistentOneOfAnUnknownNameIsGivenWithoutIt) {
    expectFound(getPair({{"ManagedElement", ref(operatingSystemPath("host1", "unknown"))},
                         {"Capabilities", ref(capabilitiesPath("unknown"))}}),
                "-+Linux");
    EXPECT_THAT(broker.takeViolations(),
                ElementsAre("path of KORVA_OperatingSystem without key Name"));
}

}  // namespace
