#include <algorithm>

#include "facade/FacadeFixture.h"

// Which paths name a source: its keys in any order and spelling, and all of them.

namespace {

using namespace facade;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

class Sources : public FacadeFixture {
  protected:
    // Whether the source leads anywhere; checks that the four operations agree.
    bool leadsOn(const ObjectPathValue& source) {
        std::vector<bool> answers;
        for (const Operation operation : associationOperations)
            answers.push_back(!delivered(associationRequest(operation, source)).empty());
        EXPECT_EQ(answers, std::vector<bool>(4, answers[0])) << toString(source);
        return answers[0];
    }
};

TEST_F(Sources, OrderOfKeysPlaysNoPart) {
    std::vector<KeyBinding> keys = operatingSystemPath("host1", "Linux").keys;
    const auto byName = [](const KeyBinding& left, const KeyBinding& right) {
        return left.name < right.name;
    };
    std::sort(keys.begin(), keys.end(), byName);
    unsigned orders = 0;
    do {
        const ObjectPathValue source = path(os, keys);
        EXPECT_THAT(delivered(associationRequest(Operation::AssociatorNames, source)),
                    ElementsAre(computerSystem, capabilities));
        EXPECT_THAT(delivered(associationRequest(Operation::Associators, source)),
                    ElementsAre(computerSystem, capabilities));
        EXPECT_THAT(delivered(associationRequest(Operation::References, source)), SizeIs(3));
        EXPECT_EQ(ask(Operation::GetInstance, source).instances.size(), 1U);
        ++orders;
    } while (std::next_permutation(keys.begin(), keys.end(), byName));
    EXPECT_EQ(orders, 24U);
}

TEST_F(Sources, AreTakenOrPassedOverByTheirKeys) {
    const Value reference = Value::fromReference(computerSystemPath("host1"));
    const Value nothing = Value::null(CMPI_string);
    struct Row {
        const char* what;
        ObjectPathValue source;
        bool leadsOn;
    };
    const Row rows[] = {
        {"names of keys and class in another case",
         path("korva_operatingSYSTEM", {{"cscreationCLASSNAME", cs},
                                        {"CSNAME", "host1"},
                                        {"creationclassname", os},
                                        {"name", "Linux"}}),
         true},
        {"CSName and Name in another case", operatingSystemPath("HOST1", "linux"), true},
        {"CreationClassName in another case",
         operatingSystemWith({{"CreationClassName", "korva_operatingsystem"}}), false},
        {"another CSCreationClassName",
         operatingSystemWith({{"CSCreationClassName", "Other_ComputerSystem"}}), false},
        {"another CSName", operatingSystemPath("host2", "Linux"), false},
        {"another Name", operatingSystemPath("host1", "Linux2"), false},
        {"an empty Name", operatingSystemPath("host1", ""), false},
        {"CSName missing",
         path(os, {{"CSCreationClassName", cs}, {"CreationClassName", os}, {"Name", "Linux"}}),
         false},
        {"Name null", operatingSystemWith({{"Name", nothing}}), false},
        {"Name a reference", operatingSystemWith({{"Name", reference}}), false},
        {"Name twice", operatingSystemWith({{"NAME", "Linux"}}), false},
        {"an unknown key more", operatingSystemWith({{"Other", "x"}}), false},
        {"no keys", path(os), false},
        {"the computer system", computerSystemPath("host1"), true},
        {"the computer system in another case", computerSystemPath("HOST1"), true},
        {"another computer system", computerSystemPath("host2"), false},
        {"a computer system by its Name alone", path(cs, {{"Name", "host1"}}), false},
        {"a computer system of another CreationClassName",
         path(cs, {{"CreationClassName", "Other_ComputerSystem"}, {"Name", "host1"}}), false},
        {"the capabilities", capabilitiesPath("Linux"), true},
        {"InstanceID in another case", capabilitiesPath("linux"), false},
        {"another InstanceID", capabilitiesPath("unknown"), false},
        {"InstanceID a real number",
         path("KORVA_OperatingSystemCapabilities", {{"InstanceID", Value::fromReal(1)}}), false},
    };
    for (const Row& row : rows) EXPECT_EQ(leadsOn(row.source), row.leadsOn) << row.what;
}

TEST_F(Sources, NumbersAndBooleansAreTakenByValueWhateverTheirType) {
    setNodes({"17"});
    const auto named = [](const Value& id) {
        return path("KORVA_OperatingSystemCapabilities", {{"InstanceID", id}});
    };
    constexpr CMPIType unsignedTypes[] = {CMPI_uint8, CMPI_uint16, CMPI_uint32, CMPI_uint64,
                                          CMPI_char16};
    constexpr CMPIType signedTypes[] = {CMPI_sint8, CMPI_sint16, CMPI_sint32, CMPI_sint64};
    for (const CMPIType type : unsignedTypes)
        EXPECT_TRUE(leadsOn(named(Value::fromUnsigned(17, type)))) << type;
    for (const CMPIType type : signedTypes)
        EXPECT_TRUE(leadsOn(named(Value::fromSigned(17, type)))) << type;
    EXPECT_TRUE(leadsOn(named("17")));
    EXPECT_TRUE(leadsOn(named(Value::fromText("17", CMPI_chars))));
    EXPECT_FALSE(leadsOn(named(Value::fromSigned(-17))));
    EXPECT_FALSE(leadsOn(named(Value::fromUnsigned(18))));
    setNodes({"-5"});
    EXPECT_TRUE(leadsOn(named(Value::fromSigned(-5, CMPI_sint8))));
    EXPECT_TRUE(leadsOn(named(Value::fromSigned(-5, CMPI_sint64))));
    setNodes({"18446744073709551615"});
    EXPECT_TRUE(leadsOn(named(Value::fromUnsigned(~0ULL))));
    EXPECT_FALSE(leadsOn(named(Value::fromSigned(-1))));
    setNodes({"true"});
    EXPECT_TRUE(leadsOn(named(Value::fromBoolean(true))));
    EXPECT_FALSE(leadsOn(named(Value::fromBoolean(false))));
}

TEST_F(Sources, HostOfThePathPlaysNoPart) {
    ObjectPathValue source = operatingSystemPath("host1", "Linux");
    source.hostName = "elsewhere.example";
    EXPECT_TRUE(leadsOn(source));
}

TEST_F(Sources, AnswersStayInTheNamespaceOfTheRequest) {
    ObjectPathValue source = operatingSystemPath("host1", "Linux");
    source.nameSpace = "root/other";
    for (const std::string& end : delivered(associationRequest(Operation::AssociatorNames, source)))
        EXPECT_THAT(end, testing::StartsWith("root/other:KORVA_"));
}

TEST_F(Sources, EmptyFilterIsNone) {
    OperationRequest request =
        associationRequest(Operation::AssociatorNames, capabilitiesPath("Linux"));
    request.assocClass = request.resultClass = request.role = request.resultRole = "";
    EXPECT_THAT(delivered(request), ElementsAre(operatingSystem));
}

/// Several operating systems and computer systems: the pairs are those that are enumerated.
class SourcesAmongMany : public Sources {
  protected:
    SourcesAmongMany() {
        setNodes({"a", "b", "c"});
        computers.setNames({"host1", "host2", "host3", "host4"});
    }

    Texts namesFrom(const ObjectPathValue& source, const std::string& associationClass) {
        Texts result;
        const OperationRequest request =
            associationRequest(Operation::AssociatorNames, source, associationClass);
        for (const ObjectPathValue& end : ask(request).paths)
            result.push_back(end.keys.empty() ? "(no keys)" : end.keys.back().value.toText());
        EXPECT_EQ(ask(associationRequest(Operation::Associators, source, associationClass))
                      .instances.size(),
                  result.size());
        return result;
    }
};

TEST_F(SourcesAmongMany, LeadToTheirPartnersOnly) {
    const char* const systems[] = {"host1", "host2", "host3"};
    const char* const nodes[] = {"a", "b", "c"};
    for (const char* association : {"KORVA_InstalledOS", "KORVA_RunningOS"})
        for (const int index : {0, 1, 2}) {
            EXPECT_THAT(namesFrom(operatingSystemPath("host1", nodes[index]), association),
                        ElementsAre(systems[index]));
            EXPECT_THAT(namesFrom(computerSystemPath(systems[index]), association),
                        ElementsAre(nodes[index]));
        }
    EXPECT_THAT(namesFrom(computerSystemPath("host4"), "KORVA_InstalledOS"), IsEmpty());
}

// The provider pairs the first with all capabilities, and the others with ends that have no keys.
TEST_F(SourcesAmongMany, PairsWithoutKeysTieNothing) {
    const char* const association = "KORVA_OSElementCapabilities";
    EXPECT_THAT(namesFrom(operatingSystemPath("host1", "a"), association),
                ElementsAre("a", "b", "c"));
    EXPECT_THAT(namesFrom(operatingSystemPath("host1", "b"), association), IsEmpty());
    EXPECT_THAT(namesFrom(capabilitiesPath("c"), association), ElementsAre("a"));
    EXPECT_THAT(delivered(associationRequest(Operation::ReferenceNames,
                                             operatingSystemPath("host1", "b"), association)),
                IsEmpty());
}

}  // namespace
