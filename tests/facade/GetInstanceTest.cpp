#include "facade/FacadeFixture.h"

// Which instance the keys of a request name, and what is said when they name none.

namespace {

using namespace facade;
using testing::ElementsAre;

const std::string cs = "KORVA_ComputerSystem";
const std::string os = "KORVA_OperatingSystem";

Value to(const ObjectPathValue& path) {
    return Value::fromReference(path);
}

ObjectPathValue operatingSystemWith(std::vector<KeyBinding> changes) {
    ObjectPathValue result = operatingSystemPath("host1", "Linux");
    for (const KeyBinding& change : changes)
        for (KeyBinding& key : result.keys)
            if (key.name == change.name) key.value = change.value;
    return result;
}

ObjectPathValue inNamespace(ObjectPathValue path, const std::string& nameSpace,
                            const std::string& host = "") {
    path.nameSpace = nameSpace;
    path.hostName = host;
    return path;
}

ObjectPathValue installed(const ObjectPathValue& system, const ObjectPathValue& part) {
    return path("KORVA_InstalledOS", {{"GroupComponent", to(system)}, {"PartComponent", to(part)}});
}

ObjectPathValue elementCapabilities(const ObjectPathValue& element, const ObjectPathValue& end) {
    return path("KORVA_OSElementCapabilities",
                {{"ManagedElement", to(element)}, {"Capabilities", to(end)}});
}

class GetInstance : public FacadeFixture {
  protected:
    static OperationRequest requestFor(const ObjectPathValue& path) {
        OperationRequest request;
        request.operation = Operation::GetInstance;
        request.path = path;
        return request;
    }
};

TEST_F(GetInstance, EveryEnumeratedPathNamesTheInstanceThatIsEnumerated) {
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

TEST_F(GetInstance, TakesTheOneOfSeveralThatAllKeysName) {
    setNodes({"a", "b", "c"});
    computers.setNames({"host1", "host2", "host3", "host4"});
    EXPECT_THAT(delivered(requestFor(operatingSystemPath("host1", "b"))), testing::SizeIs(1));
    EXPECT_THAT(delivered(requestFor(capabilitiesPath("c"))),
                ElementsAre("root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"c\""));
    EXPECT_THAT(delivered(requestFor(
                    installed(computerSystemPath("host2"), operatingSystemPath("host1", "b")))),
                testing::SizeIs(1));
    EXPECT_THAT(delivered(requestFor(
                    elementCapabilities(operatingSystemPath("host1", "a"), capabilitiesPath("b")))),
                testing::SizeIs(1));
    EXPECT_EQ(refusal(requestFor(
                  installed(computerSystemPath("host1"), operatingSystemPath("host1", "b")))),
              "6 no instance of KORVA_InstalledOS has this GroupComponent, PartComponent");
}

TEST_F(GetInstance, SpellingOfNamesAndNamespacesPlaysNoPart) {
    const ObjectPathValue system = computerSystemPath("host1");
    const ObjectPathValue part = operatingSystemPath("host1", "Linux");
    const ObjectPathValue rows[] = {
        path("korva_operatingsystem", {{"NAME", "LINUX"},
                                       {"creationclassname", os},
                                       {"csNAME", "HOST1"},
                                       {"CSCREATIONCLASSNAME", cs}}),
        inNamespace(part, "root/cimv2", "host.example"),
        path("korva_INSTALLEDOS", {{"partcomponent", to(part)}, {"GROUPCOMPONENT", to(system)}}),
        installed(inNamespace(system, ""), inNamespace(part, "", "host.example")),
        installed(inNamespace(system, "ROOT/CIMV2", "192.0.2.1"), part),
        installed(computerSystemPath("HOST1"), operatingSystemPath("Host1", "linux")),
        elementCapabilities(operatingSystemPath("HOST1", "LINUX"), capabilitiesPath("Linux")),
    };
    for (const ObjectPathValue& row : rows)
        EXPECT_THAT(delivered(requestFor(row)), testing::SizeIs(1)) << toString(row);
}

TEST_F(GetInstance, SaysWhichKeyIsNotAsItMustBe) {
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
        {installed(system, path(os, {{"Name", "Linux"}})),
         "4 PartComponent: key CSCreationClassName of KORVA_OperatingSystem is missing"},
        {installed(path("Other_ComputerSystem", {{"Itself", to(system)}}), part),
         "4 GroupComponent: key Itself is a reference"},

        {installed(installed(system, part), part),
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
        {installed(computerSystemPath("host2"), part),
         "6 no instance of KORVA_InstalledOS has this GroupComponent"},
        {installed(system, inNamespace(part, "root/other")),
         "6 no instance of KORVA_InstalledOS has this PartComponent"},
        {installed(path("Other_ComputerSystem", system.keys), part),
         "6 no instance of KORVA_InstalledOS has this GroupComponent"},
        {elementCapabilities(part, capabilitiesPath("linux")),
         "6 no instance of KORVA_OSElementCapabilities has this Capabilities"},
        {elementCapabilities(system, capabilitiesPath("Linux")),
         "6 no instance of KORVA_OSElementCapabilities has this ManagedElement"},
        {path("Other_OperatingSystem", part.keys), "5 Other_OperatingSystem is not served here"},
        {system, "5 KORVA_ComputerSystem is not served here"},
        {path(""), "5  is not served here"},
    };
    for (const Row& row : rows)
        EXPECT_EQ(refusal(requestFor(row.path)), row.refusal) << toString(row.path);
}

TEST_F(GetInstance, OfWhatIsNowhereSaysSo) {
    computers.setNames({});
    EXPECT_EQ(refusal(requestFor(
                  installed(computerSystemPath("host1"), operatingSystemPath("host1", "Linux")))),
              "6 no instance of KORVA_InstalledOS has this GroupComponent, PartComponent");
    setNodes({});
    EXPECT_EQ(refusal(requestFor(capabilitiesPath("Linux"))),
              "6 no instance of KORVA_OperatingSystemCapabilities has this InstanceID");
}

TEST_F(GetInstance, TellsAClientsTextBoundedAndPrintable) {
    EXPECT_EQ(refusal(requestFor(path(os, {{"a\nb\x01\xFF<\"\xC3\xA9", "x"}}))),
              "4 KORVA_OperatingSystem has no key a\\x0Ab\\x01\\xFF<\"\\xC3\\xA9");
    EXPECT_EQ(refusal(requestFor(path(os, {{std::string(100000, 'k'), "x"}}))),
              "4 KORVA_OperatingSystem has no key " + std::string(64, 'k') + "...");
    EXPECT_EQ(
        refusal(requestFor(path(std::string(100000, '\n')))), "5 " + [] {
            std::string escapes;
            for (int count = 0; count < 64; ++count) escapes += "\\x0A";
            return escapes;
        }() + "... is not served here");
}

}  // namespace
