#include "library/AssociationsFixture.h"

namespace {

using namespace associations;
using testing::ElementsAre;
using testing::IsEmpty;

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
