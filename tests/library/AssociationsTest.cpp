#include "library/LibraryFixture.h"

namespace {

using namespace cmpihost;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

using Texts = std::vector<std::string>;

constexpr const char* noComputerSystem = "Could not obtain an instance of Computer System";

// A path in short: the one key that tells elements of its class apart, "-" when it lacks it.
std::string brief(const ObjectPathValue& path) {
    for (const char* name : {"InstanceID", "Name"})
        if (const Value* value = path.key(name)) return value->toText();
    return "-";
}

std::string brief(const Value* reference) {
    return reference == nullptr ? "(absent)" : brief(reference->reference());
}

Texts briefs(const std::vector<ObjectPathValue>& paths) {
    Texts result;
    for (const ObjectPathValue& path : paths) result.push_back(brief(path));
    return result;
}

Texts briefs(const std::vector<InstanceValue>& instances) {
    Texts result;
    for (const InstanceValue& instance : instances) result.push_back(brief(instance.path));
    return result;
}

/// What the three associations have: class, and the reference names in their order.
struct Design {
    const char* className;
    const char* first;
    const char* second;
};
constexpr Design installed = {"KORVA_InstalledOS", "GroupComponent", "PartComponent"};
constexpr Design running = {"KORVA_RunningOS", "Antecedent", "Dependent"};
constexpr Design capabilities = {"KORVA_OSElementCapabilities", "ManagedElement", "Capabilities"};

class Associations : public LibraryFixture {
  protected:
    // Nodes os1, os2 … and computer systems cs1, cs2 …; the host's own name stays host1.
    void populate(unsigned int nodes, unsigned int computerSystems) {
        Texts names;
        for (unsigned int number = 1; number <= nodes; ++number)
            names.push_back("os" + std::to_string(number));
        setNodes(names);
        names.clear();
        for (unsigned int number = 1; number <= computerSystems; ++number)
            names.push_back("cs" + std::to_string(number));
        computers.setNames(names);
    }

    // The pairs of an enumeration, each as "first+second"; checks that names and instances agree,
    // and that each ends as `ends` says: with returnDone, or with a message and without.
    Texts pairs(const Design& design, const std::string& message = "") {
        recording::clear();
        const Outcome names = enumerateNames(design.className);
        expectEnd(names, message);
        const Outcome instances = enumerate(design.className);
        expectEnd(instances, message);
        Texts result;
        for (const ObjectPathValue& path : names.paths) {
            EXPECT_EQ(path.keys.size(), 2U);
            EXPECT_EQ(path.keys[0].name, design.first);
            EXPECT_EQ(path.keys[1].name, design.second);
            result.push_back(brief(path.key(design.first)) + "+" + brief(path.key(design.second)));
        }
        Texts ofInstances;
        for (const InstanceValue& instance : instances.instances) {
            EXPECT_EQ(instance.property("PrimaryOS"), nullptr);
            ofInstances.push_back(brief(instance.property(design.first)) + "+" +
                                  brief(instance.property(design.second)));
        }
        EXPECT_EQ(ofInstances, result);
        return result;
    }

    // The far ends from a source; checks that names and instances agree, and the end.
    Texts farEnds(const ObjectPathValue& source, const Design& design,
                  const std::string& message = "") {
        recording::clear();
        const Outcome names = associatorNames(source, design.className);
        expectEnd(names, message);
        const Outcome instances = associators(source, design.className);
        expectEnd(instances, message);
        EXPECT_EQ(briefs(instances.instances), briefs(names.paths));
        return briefs(names.paths);
    }

    void expectEnd(const Outcome& outcome, const std::string& message) {
        EXPECT_EQ(outcome.rc, CMPI_RC_OK);
        EXPECT_FALSE(outcome.message.has_value());
        EXPECT_EQ(outcome.doneCount, message.empty() ? 1U : 0U);
        Texts messages;
        for (const recording::Record& record : recording::take())
            if (record.channel == "log" && record.text.rfind("MESSAGE ", 0) == 0)
                messages.push_back(record.text.substr(record.text.find("]: ") + 3));
        EXPECT_EQ(messages, message.empty() ? Texts{} : Texts{message});
    }
};

TEST_F(Associations, OfComputerAndSystemAreEnumeratedInStepUntilEitherEndRunsOut) {
    struct Row {
        unsigned int nodes;
        unsigned int computerSystems;
        Texts installedPairs;
    };
    // Of n > 1 computer systems the last is never reported.
    const Row rows[] = {
        {0, 1, {}},          {0, 2, {}},          {0, 3, {}},
        {1, 1, {"cs1+os1"}}, {1, 2, {"cs1+os1"}}, {1, 3, {"cs1+os1"}},
        {2, 1, {"cs1+os1"}}, {2, 2, {"cs1+os1"}}, {2, 3, {"cs1+os1", "cs2+os2"}},
        {3, 1, {"cs1+os1"}}, {3, 2, {"cs1+os1"}}, {3, 3, {"cs1+os1", "cs2+os2"}},
    };
    for (const Row& row : rows) {
        populate(row.nodes, row.computerSystems);
        EXPECT_EQ(pairs(installed), row.installedPairs) << row.nodes << row.computerSystems;
        Texts swapped;
        for (const std::string& pair : row.installedPairs)
            swapped.push_back(pair.substr(4) + "+" + pair.substr(0, 3));
        EXPECT_EQ(pairs(running), swapped) << row.nodes << row.computerSystems;
    }
}

TEST_F(Associations, WithoutAComputerSystemEnumerationEndsWithAMessage) {
    for (const unsigned int nodes : {0U, 1U, 2U, 3U}) {
        populate(nodes, 0);
        EXPECT_THAT(pairs(installed, noComputerSystem), IsEmpty());
        EXPECT_THAT(pairs(running, noComputerSystem), IsEmpty());
    }
}

TEST_F(Associations, FromAnOperatingSystemToItsComputers) {
    const Texts byCount[] = {{}, {"cs1"}, {"cs1"}, {"cs1", "cs2"}};
    for (const unsigned int nodes : {0U, 1U, 2U, 3U}) {
        for (const unsigned int count : {1U, 2U, 3U}) {
            populate(nodes, count);
            for (const Design& design : {installed, running})
                for (const ObjectPathValue& source :
                     {operatingSystemPath("host1", "os1"), path("KORVA_OperatingSystem"),
                      operatingSystemPath("elsewhere", "unknown")})
                    EXPECT_EQ(farEnds(source, design), byCount[count]) << nodes << count;
        }
        populate(nodes, 0);
        EXPECT_THAT(farEnds(operatingSystemPath("host1", "os1"), installed, noComputerSystem),
                    IsEmpty());
        EXPECT_THAT(farEnds(operatingSystemPath("host1", "os1"), running, noComputerSystem),
                    IsEmpty());
    }
}

TEST_F(Associations, FromAComputerToItsOperatingSystems) {
    const Texts byCount[] = {{}, {"os1"}, {"os1", "os2"}, {"os1", "os2", "os3"}};
    for (const unsigned int nodes : {0U, 1U, 2U, 3U}) {
        for (const unsigned int count : {0U, 1U, 2U, 3U}) {
            populate(nodes, count);
            for (const Design& design : {installed, running}) {
                EXPECT_EQ(farEnds(computerSystemPath("HOST1"), design), byCount[nodes]);
                EXPECT_EQ(farEnds(path("KORVA_ComputerSystem"), design), byCount[nodes]);
                EXPECT_EQ(farEnds(computerSystemPath("host2"), design), Texts{});
            }
        }
    }
}

TEST_F(Associations, OfCapabilitiesAreEnumeratedWithoutRestartingTheInnerWalk) {
    populate(1, 1);
    EXPECT_THAT(pairs(capabilities), ElementsAre("os1+os1"));
    // Once the capabilities are spent, the remaining operating systems are paired with a reference
    // that has no key.
    populate(2, 1);
    EXPECT_THAT(pairs(capabilities), ElementsAre("os1+os1", "os1+os2", "os2+-"));
    populate(3, 1);
    EXPECT_THAT(pairs(capabilities),
                ElementsAre("os1+os1", "os1+os2", "os1+os3", "os2+-", "os3+-"));
    broker.takeViolations();
}

TEST_F(Associations, OfCapabilitiesWithoutANodeEndWithAMessage) {
    populate(0, 1);
    EXPECT_THAT(pairs(capabilities, "Object Not Found."), IsEmpty());
}

TEST_F(Associations, FromAnOperatingSystemToEveryCapabilities) {
    const Texts byCount[] = {{"-"}, {"os1"}, {"os1", "os2"}, {"os1", "os2", "os3"}};
    for (const unsigned int nodes : {0U, 1U, 2U, 3U}) {
        populate(nodes, 1);
        for (const ObjectPathValue& source :
             {operatingSystemPath("host1", "os1"), operatingSystemPath("host1", "unknown"),
              path("KORVA_OperatingSystem")})
            EXPECT_EQ(farEnds(source, capabilities), byCount[nodes]) << nodes;
        // Without a node the one result lacks its key, which the strict broker notes.
        if (nodes == 0) {
            EXPECT_FALSE(broker.takeViolations().empty());
        }
    }
}

TEST_F(Associations, FromCapabilitiesToTheOperatingSystemOfThatName) {
    for (const unsigned int nodes : {1U, 2U, 3U}) {
        populate(nodes, 1);
        EXPECT_THAT(farEnds(capabilitiesPath("OS1"), capabilities), ElementsAre("os1"));
    }
    populate(3, 1);
    EXPECT_THAT(farEnds(path("KORVA_OperatingSystemCapabilities"), capabilities),
                ElementsAre("os1", "os2", "os3"));
    setNodes({"a", "b", "a"});
    EXPECT_THAT(farEnds(capabilitiesPath("a"), capabilities), ElementsAre("a", "a"));
}

TEST_F(Associations, FirstResultFromAnEndIsGivenEvenWhereNoneExists) {
    populate(1, 1);
    EXPECT_THAT(farEnds(capabilitiesPath("unknown"), capabilities), ElementsAre("-"));
    populate(0, 1);
    EXPECT_THAT(farEnds(capabilitiesPath("os1"), capabilities), ElementsAre("-"));
    EXPECT_FALSE(broker.takeViolations().empty());
}

TEST_F(Associations, FirstOfTheKeysThatNameTheComputerDecides) {
    FaultPlan calls;
    const auto nameAskedFor = [this](std::vector<KeyBinding> keys) {
        recording::clear();
        associatorNames(path("KORVA_OperatingSystem", std::move(keys)), "KORVA_RunningOS");
        return recording::takeRendered();
    };
    // The computer systems are enumerated whatever the key holds; that the mapping accepts either
    // order shows in the absence of a message.
    EXPECT_THAT(nameAskedFor({{"Name", "os1"}, {"CSName", "host1"}}),
                testing::Not(HasSubstr("MESSAGE")));
    EXPECT_THAT(nameAskedFor({{"CSName", "host1"}, {"Name", "os1"}}),
                testing::Not(HasSubstr("MESSAGE")));
    EXPECT_THAT(nameAskedFor({{"csname", "host1"}, {"NAME", "os1"}}),
                HasSubstr("MESSAGE [File: OperatingSystemProvider.cpp, Line: #]: Could not find "
                          "'CSName' or 'Name' Key in Moniker"));
}

TEST_F(Associations, SourceWithKeysButNotTheOneSoughtEndsWithAMessage) {
    const std::vector<KeyBinding> keys = {{"Other", "x"}};
    for (const Design& design : {installed, running}) {
        EXPECT_THAT(farEnds(path("KORVA_OperatingSystem", keys), design,
                            "Could not find 'CSName' or 'Name' Key in Moniker"),
                    IsEmpty());
        EXPECT_THAT(farEnds(path("KORVA_ComputerSystem", keys), design,
                            "Could not find 'Name' Key in Moniker"),
                    IsEmpty());
    }
    EXPECT_THAT(farEnds(path("KORVA_OperatingSystem", keys), capabilities,
                        "Could not find 'Name' Key in Moniker"),
                IsEmpty());
    EXPECT_THAT(farEnds(path("KORVA_OperatingSystemCapabilities", keys), capabilities,
                        "Could not find 'InstanceID' Key in Moniker"),
                IsEmpty());
}

TEST_F(Associations, KeysOfOtherTypesAreMappedAsText) {
    setNodes({"17", "true"});
    EXPECT_THAT(farEnds(path("KORVA_OperatingSystemCapabilities",
                             {{"InstanceID", Value::fromUnsigned(17)}}),
                        capabilities),
                ElementsAre("17"));
    EXPECT_THAT(farEnds(path("KORVA_OperatingSystemCapabilities",
                             {{"InstanceID", Value::fromBoolean(true)}}),
                        capabilities),
                ElementsAre("true"));
    host->setComputerName("42");
    EXPECT_THAT(farEnds(path("KORVA_ComputerSystem", {{"Name", Value::fromSigned(42)}}), running),
                ElementsAre("17", "true"));
    // A reference is no text: the key counts as missing.
    EXPECT_THAT(farEnds(path("KORVA_ComputerSystem",
                             {{"Name", Value::fromReference(computerSystemPath("42"))}}),
                        running, "Could not find 'Name' Key in Moniker"),
                IsEmpty());
}

TEST_F(Associations, SourceThatIsNoEndYieldsNothingAndDone) {
    for (const Design& design : {installed, running, capabilities})
        for (const char* source : {"KORVA_Unknown", "CIM_OperatingSystem", ""})
            EXPECT_THAT(farEnds(path(source, {{"Name", "x"}}), design), IsEmpty());
    EXPECT_THAT(farEnds(path("KORVA_RunningOS"), installed), IsEmpty());
    EXPECT_THAT(farEnds(path("KORVA_InstalledOS"), running), IsEmpty());
    EXPECT_THAT(farEnds(path("KORVA_OSElementCapabilities"), running), IsEmpty());
    EXPECT_THAT(farEnds(path("KORVA_OperatingSystemCapabilities"), installed), IsEmpty());
    EXPECT_THAT(farEnds(computerSystemPath("host1"), capabilities), IsEmpty());
    EXPECT_THAT(farEnds(path("KORVA_RunningOS"), capabilities), IsEmpty());
}

TEST_F(Associations, SourceOfTheAssociationItselfHasNoFarEnd) {
    for (const Design& design : {installed, running, capabilities})
        EXPECT_THAT(farEnds(path(design.className), design), IsEmpty());
    populate(1, 0);
    EXPECT_THAT(farEnds(path("KORVA_RunningOS"), running, noComputerSystem), IsEmpty());
    populate(0, 1);
    EXPECT_THAT(farEnds(path("KORVA_OSElementCapabilities"), capabilities, "Object Not Found."),
                IsEmpty());
}

TEST_F(Associations, ClassThatIsNoAssociationIsInvalid) {
    const std::optional<std::string> wrong[] = {std::nullopt,
                                                "",
                                                "KORVA_OperatingSystem",
                                                "KORVA_OperatingSystemCapabilities",
                                                "KORVA_ComputerSystem",
                                                "CIM_RunningOS"};
    for (const std::optional<std::string>& className : wrong) {
        for (const ObjectPathValue& source :
             {operatingSystemPath("host1", "Linux"), capabilitiesPath("Linux"),
              computerSystemPath("host1"), path("KORVA_RunningOS"), path("KORVA_Unknown")}) {
            for (const Outcome& outcome :
                 {associatorNames(source, className), associators(source, className)}) {
                EXPECT_EQ(outcome.rc, CMPI_RC_ERR_INVALID_CLASS);
                EXPECT_EQ(outcome.doneCount, 0U);
                EXPECT_TRUE(outcome.paths.empty() && outcome.instances.empty());
            }
        }
    }
}

TEST_F(Associations, ResultClassAndRolesHaveNoEffect) {
    OperationRequest request;
    request.operation = Operation::Associators;
    request.path = operatingSystemPath("host1", "Linux");
    request.assocClass = "korva_RUNNINGos";
    request.resultClass = "KORVA_Contradicting";
    request.role = "Dependent";
    request.resultRole = "Antecedent";
    for (const auto operation : {Operation::Associators, Operation::AssociatorNames}) {
        request.operation = operation;
        const Outcome outcome = invoke(request);
        EXPECT_EQ(outcome.rc, CMPI_RC_OK);
        EXPECT_EQ(outcome.instances.size() + outcome.paths.size(), 1U);
        EXPECT_EQ(outcome.doneCount, 1U);
    }
}

TEST_F(Associations, PropertyListReachesTheFarEndAndIsNotApplied) {
    OperationRequest request;
    request.operation = Operation::Associators;
    request.path = computerSystemPath("host1");
    request.assocClass = "KORVA_InstalledOS";
    request.properties = std::vector<std::string>{"Name"};
    const Outcome listed = invoke(request);
    ASSERT_EQ(listed.instances.size(), 1U);
    EXPECT_EQ(listed.instances[0].properties.size(), 26U);
    EXPECT_THAT(recording::takeRendered(), HasSubstr("getCMPIInstance() in CMPIOperatingSystem.cpp "
                                                     "[Line: #],Parameters List:  properties=0x*"));
    request.properties = std::nullopt;
    invoke(request);
    EXPECT_THAT(recording::takeRendered(), HasSubstr("getCMPIInstance() in CMPIOperatingSystem.cpp "
                                                     "[Line: #],Parameters List:  properties=0\n"));
}

TEST_F(Associations, ReferencesOmittedFromThePropertyListAreSetAllTheSame) {
    for (const Design& design : {installed, running, capabilities}) {
        OperationRequest request;
        request.operation = Operation::EnumerateInstances;
        request.path = path(design.className);
        request.properties = std::vector<std::string>{"PrimaryOS"};
        const Outcome outcome = invoke(request);
        ASSERT_EQ(outcome.instances.size(), 1U);
        EXPECT_NE(outcome.instances[0].property(design.first), nullptr);
        EXPECT_NE(outcome.instances[0].property(design.second), nullptr);
        EXPECT_EQ(outcome.instances[0].property("PrimaryOS"), nullptr);
    }
}

TEST_F(Associations, GetOfAComputersAssociationGivesThePairsOfAnEnumeration) {
    populate(3, 3);
    for (const Design& design : {installed, running}) {
        const Outcome outcome =
            get(path(design.className,
                     {{design.first, Value::fromReference(computerSystemPath("other"))},
                      {design.second, Value::fromReference(operatingSystemPath("x", "y"))}}));
        EXPECT_EQ(outcome.rc, CMPI_RC_OK);
        EXPECT_EQ(outcome.instances.size(), 2U);
        EXPECT_EQ(outcome.doneCount, 1U);
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
    // The classes of the references are not looked at, only their keys.
    expectFound(getPair({{"ManagedElement", ref(path("KORVA_Other", {{"Name", "Linux"}}))},
                         {"Capabilities", ref(path("KORVA_Other", {{"InstanceID", "Linux"}}))}}),
                "Linux+Linux");
}

TEST_F(CapabilitiesPair, ConsistentOneOfAnUnknownNameIsGivenWithoutIt) {
    expectFound(getPair({{"ManagedElement", ref(operatingSystemPath("host1", "unknown"))},
                         {"Capabilities", ref(capabilitiesPath("unknown"))}}),
                "-+Linux");
    broker.takeViolations();
}

/// Computer systems that the broker fails to deliver.
class ComputerSystems : public Associations {};

TEST_F(ComputerSystems, FailedEnumerationOrFirstElementEndsWithAMessage) {
    computers.failEnumerations(CMPI_RC_ERR_FAILED);
    EXPECT_THAT(pairs(installed, noComputerSystem), IsEmpty());
    EXPECT_THAT(farEnds(operatingSystemPath("host1", "Linux"), running, noComputerSystem),
                IsEmpty());
    computers.failEnumerations(CMPI_RC_OK);
    computers.failAtNext(1);
    EXPECT_THAT(pairs(running, noComputerSystem), IsEmpty());
    EXPECT_THAT(farEnds(operatingSystemPath("host1", "Linux"), installed, noComputerSystem),
                IsEmpty());
}

TEST_F(ComputerSystems, FailedLaterElementEndsTheWalkOfTheOperatingSystemsEnd) {
    populate(1, 4);
    computers.failAtNext(2);
    // The element that failed is null: no further result, and done.
    EXPECT_THAT(farEnds(operatingSystemPath("host1", "os1"), running), ElementsAre("cs1"));
}

TEST_F(ComputerSystems, FailedLaterElementLeavesItsReferenceOut) {
    populate(3, 4);
    computers.failAtNext(2);
    recording::clear();
    const Outcome outcome = enumerateNames("KORVA_RunningOS");
    expectEnd(outcome, "");
    ASSERT_EQ(outcome.paths.size(), 3U);
    EXPECT_EQ(brief(outcome.paths[0].key("Dependent")), "cs1");
    EXPECT_EQ(outcome.paths[1].key("Dependent"), nullptr);
    EXPECT_EQ(brief(outcome.paths[2].key("Antecedent")), "os3");
    EXPECT_FALSE(broker.takeViolations().empty());
}

TEST_F(ComputerSystems, AreDeliveredAsTheBrokerHasThem) {
    const Outcome outcome = associators(operatingSystemPath("host1", "Linux"), "KORVA_InstalledOS");
    ASSERT_EQ(outcome.instances.size(), 1U);
    EXPECT_EQ(toString(outcome.instances[0].path),
              "root/cimv2:KORVA_ComputerSystem.CreationClassName=\"KORVA_ComputerSystem\",Name="
              "\"host1\"");
}

TEST_F(ComputerSystems, WithoutAPathForThemTheBrokerIsNotAsked) {
    for (const CMPIrc rc : {CMPI_RC_OK, CMPI_RC_ERR_FAILED}) {
        FaultPlan plan(Fault{"newObjectPath", 1, 0, rc});
        broker.setFaultPlan(&plan);
        EXPECT_THAT(pairs(installed, noComputerSystem), IsEmpty());
        EXPECT_EQ(plan.calls("CMPIBrokerFT.enumerateInstances"), 0U);
        broker.setFaultPlan(nullptr);
    }
}

}  // namespace
