#include "facade/FacadeFixture.h"

// Requests for instances are passed on, property lists are applied to what comes back, and all keys
// count: which instance they name, and what is said when they name none.

namespace {

using namespace facade;
using testing::ElementsAre;

Value to(const ObjectPathValue& path) {
    return Value::fromReference(path);
}

ObjectPathValue inNamespace(ObjectPathValue path, const std::string& nameSpace,
                            const std::string& host = "") {
    path.nameSpace = nameSpace;
    path.hostName = host;
    return path;
}

ObjectPathValue installedPair(const ObjectPathValue& system, const ObjectPathValue& part) {
    return pairPath(installedOS, system, part);
}

ObjectPathValue capabilitiesPair(const ObjectPathValue& element, const ObjectPathValue& end) {
    return pairPath(elementCapabilities, element, end);
}

class InstanceOperations : public FacadeFixture {
  protected:
    static OperationRequest get(const ObjectPathValue& path) {
        return requestFor(Operation::GetInstance, path);
    }
};

TEST_F(InstanceOperations, AreAnsweredAsByTheProvider) {
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
        EXPECT_EQ(propertyNames(facades.instances[0]), propertyNames(providers.instances[0]));
    }
}

TEST_F(InstanceOperations, OfOtherClassesAreRefusedByTheirName) {
    for (const Operation operation :
         {Operation::EnumerateInstanceNames, Operation::EnumerateInstances}) {
        for (const char* name : {"KORVA_ComputerSystem", "CIM_OperatingSystem", "TEST_Nothing"})
            EXPECT_EQ(refusal(requestFor(operation, path(name))),
                      std::string("5 ") + name + " is not served here");
    }
}

TEST_F(InstanceOperations, ThatWriteAreRefusedByTheirOperation) {
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

TEST_F(InstanceOperations, PropertyListIsAppliedAndKeysStay) {
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
            EXPECT_THAT(propertyNames(outcome.instances[0]),
                        testing::UnorderedElementsAreArray(expected));
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
            EXPECT_THAT(propertyNames(ask(request).instances.at(0)),
                        testing::UnorderedElementsAreArray(expected));
        }
    }
    OperationRequest request =
        associationRequest(Operation::Associators, operatingSystemPath("host1", "Linux"));
    request.properties = Texts{"ElementName"};
    const Outcome ends = ask(request);
    ASSERT_EQ(ends.instances.size(), 2U);
    EXPECT_THAT(propertyNames(ends.instances[0]), ElementsAre("CreationClassName", "Name"));
    EXPECT_THAT(propertyNames(ends.instances[1]), ElementsAre("InstanceID", "ElementName"));
    request = associationRequest(Operation::References, capabilitiesPath("Linux"));
    request.properties = Texts{"Capabilities"};
    EXPECT_THAT(propertyNames(ask(request).instances.at(0)),
                ElementsAre("ManagedElement", "Capabilities"));
}

TEST_F(InstanceOperations, GetTheInstanceThatEachEnumeratedPathNames) {
    for (const char* name :
         {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities", "KORVA_InstalledOS",
          "KORVA_RunningOS", "KORVA_OSElementCapabilities"}) {
        const Outcome names = ask(Operation::EnumerateInstanceNames, path(name));
        ASSERT_EQ(names.paths.size(), 1U) << name;
        const Outcome enumerated = ask(Operation::EnumerateInstances, path(name));
        const Outcome gotten = ask(Operation::GetInstance, names.paths[0]);
        ASSERT_EQ(gotten.instances.size(), 1U) << name;
        EXPECT_EQ(gotten.doneCount, 1U);
        EXPECT_EQ(gotten.instances[0].path, names.paths[0]);
        EXPECT_EQ(gotten.instances[0].properties.size(), enumerated.instances[0].properties.size());
    }
}

TEST_F(InstanceOperations, GetTheOneOfSeveralThatAllKeysName) {
    setNodes({"a", "b", "c"});
    computers.setNames({"host1", "host2", "host3", "host4"});
    EXPECT_THAT(delivered(get(operatingSystemPath("host1", "b"))), testing::SizeIs(1));
    EXPECT_THAT(delivered(get(capabilitiesPath("c"))),
                ElementsAre("root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"c\""));
    EXPECT_THAT(delivered(get(
                    installedPair(computerSystemPath("host2"), operatingSystemPath("host1", "b")))),
                testing::SizeIs(1));
    EXPECT_THAT(
        delivered(get(capabilitiesPair(operatingSystemPath("host1", "a"), capabilitiesPath("b")))),
        testing::SizeIs(1));
    EXPECT_EQ(
        refusal(get(installedPair(computerSystemPath("host1"), operatingSystemPath("host1", "b")))),
        "6 no instance of KORVA_InstalledOS has this GroupComponent, PartComponent");
}

TEST_F(InstanceOperations, GetWhateverTheSpellingOfNamesAndNamespaces) {
    const ObjectPathValue system = computerSystemPath("host1");
    const ObjectPathValue part = operatingSystemPath("host1", "Linux");
    const ObjectPathValue rows[] = {
        path("korva_operatingsystem", {{"NAME", "LINUX"},
                                       {"creationclassname", os},
                                       {"csNAME", "HOST1"},
                                       {"CSCREATIONCLASSNAME", cs}}),
        inNamespace(part, "root/cimv2", "host.example"),
        path("korva_INSTALLEDOS", {{"partcomponent", to(part)}, {"GROUPCOMPONENT", to(system)}}),
        installedPair(inNamespace(system, ""), inNamespace(part, "", "host.example")),
        installedPair(inNamespace(system, "ROOT/CIMV2", "192.0.2.1"), part),
        installedPair(computerSystemPath("HOST1"), operatingSystemPath("Host1", "linux")),
        capabilitiesPair(operatingSystemPath("HOST1", "LINUX"), capabilitiesPath("Linux")),
    };
    for (const ObjectPathValue& row : rows)
        EXPECT_THAT(delivered(get(row)), testing::SizeIs(1)) << toString(row);
}

TEST_F(InstanceOperations, SayWhichKeyIsNotAsItMustBe) {
    const Value reference = to(computerSystemPath("host1"));
    const ObjectPathValue system = computerSystemPath("host1");
    const ObjectPathValue part = operatingSystemPath("host1", "Linux");
    struct Row {
        ObjectPathValue path;
        const char* refusal;
    };
    const Row rows[] = {
        {path(os), "4 key CSCreationClassName of KORVA_OperatingSystem is missing"},
        {path(os, {{"CSCreationClassName", cs}, {"CreationClassName", os}, {"Name", "Linux"}}),
         "4 key CSName of KORVA_OperatingSystem is missing"},
        {operatingSystemWith({{"Name", Value::null(CMPI_string)}}),
         "4 key Name of KORVA_OperatingSystem is missing"},
        {path(os, {{"Nmae", "Linux"}}), "4 KORVA_OperatingSystem has no key Nmae"},
        {operatingSystemWith({{"CSName", reference}}), "4 key CSName is no text"},
        {operatingSystemWith({{"Name", Value::fromReal(0.5)}}), "4 key Name is no text"},
        {path("KORVA_OperatingSystemCapabilities", {{"InstanceID", "Linux"}, {"INSTANCEID", "x"}}),
         "4 key InstanceID of KORVA_OperatingSystemCapabilities is there twice"},
        {path("KORVA_InstalledOS", {{"GroupComponent", "text"}, {"PartComponent", to(part)}}),
         "4 key GroupComponent is no reference"},
        {path("KORVA_RunningOS", {{"Antecedent", to(part)}}),
         "4 key Dependent of KORVA_RunningOS is missing"},
        {installedPair(system, path(os, {{"Name", "Linux"}})),
         "4 PartComponent: key CSCreationClassName of KORVA_OperatingSystem is missing"},
        {installedPair(path("Other_ComputerSystem", {{"Itself", to(system)}}), part),
         "4 GroupComponent: key Itself is a reference"},
        {installedPair(installedPair(system, part), part),
         "4 GroupComponent: key GroupComponent is a reference"},
        {operatingSystemPath("host1", "Linux2"),
         "6 no instance of KORVA_OperatingSystem has this Name"},
        {operatingSystemPath("host2", "Linux"),
         "6 no instance of KORVA_OperatingSystem has this CSName"},
        {operatingSystemPath("host2", "x"),
         "6 no instance of KORVA_OperatingSystem has this CSName, Name"},
        {operatingSystemWith({{"CreationClassName", "CIM_OperatingSystem"}}),
         "6 no instance of KORVA_OperatingSystem has this CreationClassName"},
        {operatingSystemWith({{"CSCreationClassName", "korva_computersystem"}}),
         "6 no instance of KORVA_OperatingSystem has this CSCreationClassName"},
        {capabilitiesPath("linux"),
         "6 no instance of KORVA_OperatingSystemCapabilities has this InstanceID"},
        {installedPair(computerSystemPath("host2"), part),
         "6 no instance of KORVA_InstalledOS has this GroupComponent"},
        {installedPair(system, inNamespace(part, "root/other")),
         "6 no instance of KORVA_InstalledOS has this PartComponent"},
        {installedPair(path("Other_ComputerSystem", system.keys), part),
         "6 no instance of KORVA_InstalledOS has this GroupComponent"},
        {capabilitiesPair(part, capabilitiesPath("linux")),
         "6 no instance of KORVA_OSElementCapabilities has this Capabilities"},
        {capabilitiesPair(system, capabilitiesPath("Linux")),
         "6 no instance of KORVA_OSElementCapabilities has this ManagedElement"},
        {path("Other_OperatingSystem", part.keys), "5 Other_OperatingSystem is not served here"},
        {system, "5 KORVA_ComputerSystem is not served here"},
        {path(""), "5  is not served here"},
    };
    for (const Row& row : rows)
        EXPECT_EQ(refusal(get(row.path)), row.refusal) << toString(row.path);
}

TEST_F(InstanceOperations, SayThatWhatIsNowhereIsNotFound) {
    computers.setNames({});
    EXPECT_EQ(refusal(get(installedPair(computerSystemPath("host1"),
                                        operatingSystemPath("host1", "Linux")))),
              "6 no instance of KORVA_InstalledOS has this GroupComponent, PartComponent");
    setNodes({});
    EXPECT_EQ(refusal(get(capabilitiesPath("Linux"))),
              "6 no instance of KORVA_OperatingSystemCapabilities has this InstanceID");
}

TEST_F(InstanceOperations, TellAClientsTextBoundedAndPrintable) {
    EXPECT_EQ(refusal(get(path(os, {{"a\nb\x01\xFF<\"\xC3\xA9", "x"}}))),
              "4 KORVA_OperatingSystem has no key a\\x0Ab\\x01\\xFF<\"\\xC3\\xA9");
    EXPECT_EQ(refusal(get(path(os, {{std::string(100000, 'k'), "x"}}))),
              "4 KORVA_OperatingSystem has no key " + std::string(64, 'k') + "...");
    EXPECT_EQ(
        refusal(get(path(std::string(100000, '\n')))), "5 " + [] {
            std::string escapes;
            for (int count = 0; count < 64; ++count) escapes += "\\x0A";
            return escapes;
        }() + "... is not served here");
}

TEST_F(InstanceOperations, MakeTheProvidersUpcallsAndNoOther) {
    for (const auto& [name, count] : {std::pair("KORVA_OperatingSystem", 0U),
                                      {"KORVA_OperatingSystemCapabilities", 0U},
                                      {"KORVA_InstalledOS", 1U},
                                      {"KORVA_RunningOS", 1U},
                                      {"KORVA_OSElementCapabilities", 0U}}) {
        OperationRequest request;
        request.path = path(name);
        request.operation = Operation::EnumerateInstanceNames;
        EXPECT_EQ(upcalls(request), count) << name;
        const Outcome names = ask(request);
        request.operation = Operation::EnumerateInstances;
        EXPECT_EQ(upcalls(request), count) << name;
        request.operation = Operation::GetInstance;
        request.path = names.paths.at(0);
        EXPECT_EQ(upcalls(request), count) << name;
    }
}

// What an enumeration costs beyond the provider: the class and the namespace of its path are read.
TEST_F(InstanceOperations, OfEnumerationTakeTwoLooksAtTheirPathMoreThanTheProvider) {
    OperationRequest request;
    request.path = path("KORVA_OperatingSystem");
    for (const Operation operation :
         {Operation::EnumerateInstances, Operation::EnumerateInstanceNames}) {
        request.operation = operation;
        const auto calls = [&](const ProviderLibrary& asked) {
            FaultPlan plan;
            broker.setFaultPlan(&plan);
            cmpihost::invoke(asked, broker, request);
            broker.setFaultPlan(nullptr);
            return plan.calls();
        };
        EXPECT_EQ(calls(facade), calls(library) + 4);
    }
}

}  // namespace
