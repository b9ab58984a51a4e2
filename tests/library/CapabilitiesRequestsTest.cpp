#include "library/LibraryFixture.h"

namespace {

using namespace cmpihost;
using testing::ElementsAre;
using testing::IsEmpty;

using Texts = std::vector<std::string>;

constexpr const char* className = "KORVA_OperatingSystemCapabilities";

// The properties of an instance in their order, each as "type name=value".
Texts properties(const InstanceValue& instance) {
    Texts result;
    for (const PropertyValue& property : instance.properties)
        result.push_back(cimTypeName(property.value.type()) + " " + property.name + "=" +
                         property.value.toText());
    return result;
}

/// Requests for KORVA_OperatingSystemCapabilities.
class CapabilitiesRequests : public LibraryFixture {
  protected:
    void expectDone(const Outcome& outcome) {
        EXPECT_EQ(outcome.rc, CMPI_RC_OK);
        EXPECT_FALSE(outcome.message.has_value());
        EXPECT_EQ(outcome.doneCount, 1U);
    }
};

TEST_F(CapabilitiesRequests, InstanceCarriesItsFourPropertiesInOrderAndOfTheirTypes) {
    const Outcome outcome = enumerate(className);
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
    const Outcome outcome = enumerate(className);
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

TEST_F(CapabilitiesRequests, LengthAndRequestedStatesAreNeverSupplied) {
    const Outcome outcome = enumerate(className);
    ASSERT_EQ(outcome.instances.size(), 1U);
    EXPECT_EQ(text(outcome.instances[0], "MaxElementNameLen"), "(absent)");
    EXPECT_EQ(text(outcome.instances[0], "RequestedStatesSupported"), "(absent)");
}

TEST_F(CapabilitiesRequests, NamesComeOnePerNode) {
    setNodes({"a", "b"});
    const Outcome outcome = enumerateNames(className);
    expectDone(outcome);
    EXPECT_THAT(texts(outcome.paths),
                ElementsAre("root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"a\"",
                            "root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"b\""));
}

TEST_F(CapabilitiesRequests, KeysOfThePathNarrowNothing) {
    setNodes({"a", "b"});
    for (const ObjectPathValue& asked :
         {capabilitiesPath("zzz"), capabilitiesPath("b"), capabilitiesPath("a"),
          capabilitiesPath(""), path(className), path(className, {{"Other", "b"}})}) {
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
    const Outcome instances = enumerate(className);
    expectDone(instances);
    ASSERT_EQ(instances.instances.size(), 1U);
    EXPECT_EQ(toString(instances.instances[0].path),
              "root/cimv2:KORVA_OperatingSystemCapabilities");
    EXPECT_THAT(properties(instances.instances[0]), ElementsAre("uint16 HostShutdownBehavior=3"));
    EXPECT_THAT(broker.takeViolations(),
                ElementsAre("path of KORVA_OperatingSystemCapabilities without key InstanceID"));
    const Outcome names = enumerateNames(className);
    expectDone(names);
    EXPECT_THAT(texts(names.paths), ElementsAre("root/cimv2:KORVA_OperatingSystemCapabilities"));
    EXPECT_THAT(broker.takeViolations(),
                ElementsAre("path of KORVA_OperatingSystemCapabilities without key InstanceID"));
}

TEST_F(CapabilitiesRequests, WithoutANodeThereAreNone) {
    setNodes({});
    for (const Outcome& outcome :
         {enumerateNames(className), enumerate(className), get(capabilitiesPath("Linux"))}) {
        expectDone(outcome);
        EXPECT_THAT(outcome.paths, IsEmpty());
        EXPECT_THAT(outcome.instances, IsEmpty());
    }
}

}  // namespace
