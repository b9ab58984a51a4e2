#include <functional>
#include <memory>
#include <optional>
#include <sstream>

#include "CMPIElementCapabilities.h"
#include "CMPIInstalledOS.h"
#include "CMPIRunningOS.h"
#include "Linux/InstalledOS.h"
#include "provider/AdapterFixture.h"

// The adapters of associations, on their own.

namespace {

using namespace cmpihost;
using namespace VA::OSStatusProvider;
using Texts = std::vector<std::string>;

class AssociationAdapters : public Adapters {
  protected:
    template <class Adapter>
    std::unique_ptr<Adapter> built(const std::string& className, Keys keys = {}) {
        return std::make_unique<Adapter>(broker.cmpi(), context, made(className, std::move(keys)));
    }

    // What the adapter does when it is built from each of the paths: stands on something or not,
    // then moves on, a few times; there is no far end.
    template <class Adapter>
    void expectNoFarEnd(const std::vector<std::string>& classNames, bool standing) {
        for (const std::string& className : classNames) {
            SCOPED_TRACE(className);
            const auto adapter = built<Adapter>(className, {{"Name", "a"}, {"InstanceID", "a"}});
            for (int step = 0; step < 5; ++step, ++*adapter) {
                EXPECT_EQ(stands(*adapter), standing);
                EXPECT_EQ(adapter->getAssociatorNames(), nullptr);
                EXPECT_EQ(adapter->getAssociator(nullptr), nullptr);
            }
        }
    }

    // Built from a path of the association itself.
    template <class Adapter>
    void expectPairsWithoutFarEnd(const char* className) {
        const auto adapter = built<Adapter>(className);
        EXPECT_TRUE(stands(*adapter)) << className;
        EXPECT_EQ(adapter->getAssociatorNames(), nullptr) << className;
        EXPECT_EQ(adapter->getAssociator(nullptr), nullptr) << className;
        EXPECT_NE(adapter->getObjectPath(), nullptr) << className;
    }
};

TEST_F(AssociationAdapters, FromTheirOwnPathHaveNoFarEnd) {
    expectPairsWithoutFarEnd<CMPIInstalledOS>("KORVA_InstalledOS");
    expectPairsWithoutFarEnd<CMPIRunningOS>("KORVA_RunningOS");
    expectPairsWithoutFarEnd<CMPIOSElementCapabilities>("KORVA_OSElementCapabilities");
}

TEST_F(AssociationAdapters, FromAnUnrelatedClassAreEmptyButThatOfCapabilitiesNeverEnds) {
    const char* const capabilities = "KORVA_OperatingSystemCapabilities";
    expectNoFarEnd<CMPIInstalledOS>({capabilities, "KORVA_RunningOS", "KORVA_Unknown"}, false);
    expectNoFarEnd<CMPIRunningOS>({capabilities, "KORVA_InstalledOS", "KORVA_Unknown"}, false);
    expectNoFarEnd<CMPIOSElementCapabilities>(
        {"KORVA_ComputerSystem", "KORVA_RunningOS", "KORVA_Unknown"}, true);
}

// From whatever class the adapter was built, the association's own path and instance have both
// ends.
TEST_F(AssociationAdapters, OfCapabilitiesSetBothReferencesWhateverClassWasRequested) {
    const std::string system =
        "root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\","
        "CSName=\"Host1\",CreationClassName=\"KORVA_OperatingSystem\",Name=\"a\"";
    const std::string capabilities =
        "root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"a\"";
    for (const char* className :
         {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities",
          "KORVA_OSElementCapabilities", "KORVA_ComputerSystem", "KORVA_Unknown"}) {
        const auto adapter = built<CMPIOSElementCapabilities>(className);
        CMPIObjectPath* const path = adapter->getObjectPath();
        EXPECT_EQ(key(path, "ManagedElement"), system) << className;
        EXPECT_EQ(key(path, "Capabilities"), capabilities) << className;
        const InstanceValue instance = valueOf(adapter->getCMPIInstance(nullptr));
        EXPECT_EQ(text(instance, "ManagedElement"), system) << className;
        EXPECT_EQ(text(instance, "Capabilities"), capabilities) << className;
    }
}

TEST_F(AssociationAdapters, HandThePropertyListToTheFarEnd) {
    const char* list[] = {"Name", nullptr};
    std::ostringstream address;
    address << " properties=" << list;
    // Each of the far end's entering and exiting records bears the list's address, in each channel.
    const auto expectRecorded = [&](auto adapter, const std::string& file) {
        recording::clear();
        EXPECT_NE(adapter->getAssociator(list), nullptr);
        unsigned found = 0;
        for (const recording::Record& record : recording::take())
            if (record.function == "getCMPIInstance" && record.file == file &&
                record.text.find(address.str()) != std::string::npos)
                ++found;
        EXPECT_EQ(found, 4U) << file;
    };
    expectRecorded(built<CMPIOSElementCapabilities>("KORVA_OperatingSystem"),
                   "CMPIOperatingSystemCapabilities.cpp");
    expectRecorded(built<CMPIOSElementCapabilities>("KORVA_OperatingSystemCapabilities"),
                   "CMPIOperatingSystem.cpp");
    expectRecorded(built<CMPIInstalledOS>("KORVA_ComputerSystem"), "CMPIOperatingSystem.cpp");
    expectRecorded(built<CMPIRunningOS>("KORVA_ComputerSystem"), "CMPIOperatingSystem.cpp");
}

// The framework sets the keys of a path as properties already.
TEST_F(AssociationAdapters, SetEachReferenceByACallOfTheirOwn) {
    const auto referencesOf = [this](auto adapter) {
        FaultPlan withoutKeys(Fault{"setProperty", 1, 2});
        broker.setFaultPlan(&withoutKeys);
        const CMPIInstance* const instance = adapter->getCMPIInstance(nullptr);
        broker.setFaultPlan(nullptr);
        EXPECT_EQ(withoutKeys.fired(), 2U);
        Texts names;
        for (const PropertyValue& each : valueOf(instance).properties) names.push_back(each.name);
        return names;
    };
    EXPECT_EQ(referencesOf(built<CMPIInstalledOS>("KORVA_InstalledOS")),
              (Texts{"GroupComponent", "PartComponent"}));
    EXPECT_EQ(referencesOf(built<CMPIRunningOS>("KORVA_RunningOS")),
              (Texts{"Antecedent", "Dependent"}));
    EXPECT_EQ(referencesOf(built<CMPIOSElementCapabilities>("KORVA_OSElementCapabilities")),
              (Texts{"ManagedElement", "Capabilities"}));
}

/// What InstalledOS::isPrimaryOS is to answer in place of its own; none: its own answer.
std::optional<bool> primaryAnswer;

TEST_F(AssociationAdapters, OfInstalledSystemsAskForPrimaryOSAndSetItWhereItIsKnown) {
    const auto installed = built<CMPIInstalledOS>("KORVA_InstalledOS");
    const auto running = built<CMPIRunningOS>("KORVA_RunningOS");
    const auto propertiesOf = [](auto& adapter) {
        Texts properties;
        for (const PropertyValue& each : valueOf(adapter.getCMPIInstance(nullptr)).properties)
            properties.push_back(
                each.value.type() == CMPI_ref ? each.name : each.name + " " + each.value.toText());
        return properties;
    };
    for (const bool primary : {true, false}) {
        primaryAnswer = primary;
        EXPECT_EQ(propertiesOf(*installed),
                  (Texts{"GroupComponent", "PartComponent",
                         primary ? "PrimaryOS true" : "PrimaryOS false"}));
        EXPECT_EQ(propertiesOf(*running), (Texts{"Antecedent", "Dependent"}));
    }
    primaryAnswer.reset();
    EXPECT_EQ(propertiesOf(*installed), (Texts{"GroupComponent", "PartComponent"}));
}

/// A path whose functions the test replaces, the others being absent.
template <class Content>
struct ScriptedPath {
    Content content;
    CMPIObjectPathFT calls = {};
    CMPIObjectPath cmpi = {this, &calls};

    static Content& of(const CMPIObjectPath* self) {
        return static_cast<ScriptedPath*>(self->hdl)->content;
    }
};

/// A path with keys, and where to note the names that it is asked for.
struct AskedPath {
    const CMPIObjectPath* path;
    Texts& notes;
};

TEST_F(AssociationAdapters, OfCapabilitiesReadApplyAndMapCapabilitiesBeforeTheyReadManagedElement) {
    const auto adapter = built<CMPIOSElementCapabilities>("KORVA_Unknown");
    const CMPIObjectPath* const system = made("KORVA_OperatingSystem", {{"Name", "a"}});
    const CMPIObjectPath* const capabilities =
        made("KORVA_OperatingSystemCapabilities", {{"InstanceID", "a"}});
    Texts sequence;
    ScriptedPath<AskedPath> path = {
        {made("KORVA_OSElementCapabilities",
              {{"ManagedElement", Value::fromReference(valueOf(system))},
               {"Capabilities", Value::fromReference(valueOf(capabilities))}}),
         sequence}};
    path.calls.getKeyCount = [](const CMPIObjectPath* self, CMPIStatus* status) {
        const CMPIObjectPath* const asked = ScriptedPath<AskedPath>::of(self).path;
        return asked->ft->getKeyCount(asked, status);
    };
    path.calls.getKey = [](const CMPIObjectPath* self, const char* name, CMPIStatus* status) {
        const AskedPath& asked = ScriptedPath<AskedPath>::of(self);
        asked.notes.push_back(std::string("key ") + name);
        return asked.path->ft->getKey(asked.path, name, status);
    };
    recording::setHook([&](const recording::Record& record) {
        if (record.channel == "log" && record.text.rfind("ENTERING: ", 0) == 0)
            sequence.push_back(record.file + ' ' + record.function);
    });
    EXPECT_TRUE(adapter->setObjectPath(&path.cmpi));
    recording::setHook({});
    EXPECT_EQ(sequence, (Texts{"CMPIElementCapabilities.cpp setObjectPath", "key Capabilities",
                               "CMPIOperatingSystemCapabilities.cpp setObjectPath",
                               "CMPIElementCapabilities.cpp locateOperatingSystem",
                               "Linux/ElementCapabilities.cpp getOperatingSystemMoniker",
                               "key ManagedElement", "CMPIOperatingSystem.cpp setObjectPath"}));
}

/// An operation that makes a far end's path: its near end's class, and the far end without keys and
/// with the one that `keys` below lead to.
struct LocateOperation {
    const char* name;
    const char* nearEnd;
    std::string farClass;
    std::string farKey;
    bool countsIn16Bits;
    std::function<CMPIObjectPath*(const CMPIObjectPath*)> locate;
};

class Locate : public AssociationAdapters {
  protected:
    const Keys keys = {{"Other", "x"}, {"Name", "n"}, {"InstanceID", "i"}};

    // Built from a path of no class of theirs, they have asked for nothing yet.
    std::unique_ptr<CMPIInstalledOS> installed = built<CMPIInstalledOS>("KORVA_Unknown");
    std::unique_ptr<CMPIRunningOS> running = built<CMPIRunningOS>("KORVA_Unknown");
    std::unique_ptr<CMPIOSElementCapabilities> element =
        built<CMPIOSElementCapabilities>("KORVA_Unknown");

    const std::string system = "KORVA_OperatingSystem";
    const std::string computer = "KORVA_ComputerSystem";
    const std::string capabilities = "KORVA_OperatingSystemCapabilities";
    const LocateOperation operations[6] = {
        {"InstalledOS, computer", system.c_str(), computer, ".Name=\"n\"", true,
         [this](auto path) { return installed->locateComputerSystem(path); }},
        {"InstalledOS, system", computer.c_str(), system, ".CSName=\"n\"", true,
         [this](auto path) { return installed->locateOperatingSystem(path); }},
        {"RunningOS, computer", system.c_str(), computer, ".Name=\"n\"", true,
         [this](auto path) { return running->locateComputerSystem(path); }},
        {"RunningOS, system", computer.c_str(), system, ".CSName=\"n\"", true,
         [this](auto path) { return running->locateOperatingSystem(path); }},
        {"OSElementCapabilities, capabilities", system.c_str(), capabilities, ".InstanceID=\"n\"",
         false, [this](auto path) { return element->locateCapabilities(path); }},
        {"OSElementCapabilities, system", capabilities.c_str(), system, ".Name=\"i\"", false,
         [this](auto path) { return element->locateOperatingSystem(path); }},
    };
};

TEST_F(Locate, MakesAPathOfTheFarEndsClassWithTheOneKeyThatIsKnown) {
    for (const LocateOperation& each : operations) {
        const std::string far = "root/cimv2:" + each.farClass;
        EXPECT_EQ(textOf(each.locate(made(each.nearEnd, keys))), far + each.farKey) << each.name;
        EXPECT_EQ(textOf(each.locate(made(each.nearEnd))), far) << each.name;
    }
}

TEST_F(Locate, MakesThePathBeforeItCountsTheKeys) {
    for (const LocateOperation& each : operations) {
        const CMPIObjectPath* const nearEnd = made(each.nearEnd, keys);
        FaultPlan plan(Fault{"newObjectPath", 1, 0});
        plan.add(Fault{"getKeyCount", 1, 0});
        broker.setFaultPlan(&plan);
        EXPECT_EQ(each.locate(nearEnd), nullptr) << each.name;
        broker.setFaultPlan(nullptr);
        EXPECT_EQ(plan.firedCalls(),
                  (Texts{"CMPIBrokerEncFT.newObjectPath", "CMPIObjectPathFT.getKeyCount"}))
            << each.name;
    }
}

/// What a path tells of itself that has the two keys that operations look for.
struct CrowdedPath {
    CMPICount count;
    CMPIString* names[2];
    char values[2][2] = {"n", "i"};
};

TEST_F(Locate, CountsKeysIn16BitsForTheComputersAssociationsAlone) {
    ScriptedPath<CrowdedPath> path = {
        {0, {request.makeString("Name"), request.makeString("InstanceID")}}};
    path.calls.getKeyCount = [](const CMPIObjectPath* self, CMPIStatus*) {
        return ScriptedPath<CrowdedPath>::of(self).count;
    };
    path.calls.getKeyAt = [](const CMPIObjectPath* self, CMPICount index, CMPIString** name,
                             CMPIStatus* status) {
        CMPIData data = {CMPI_chars, CMPI_goodValue, {}};
        if (index > 1) {
            status->rc = CMPI_RC_ERR_NO_SUCH_PROPERTY;
            return data;
        }
        CrowdedPath& crowded = ScriptedPath<CrowdedPath>::of(self);
        *name = crowded.names[index];
        data.value.chars = crowded.values[index];
        return data;
    };
    for (const LocateOperation& each : operations)
        for (const CMPICount count : {65535U, 65536U, 65537U}) {
            path.content.count = count;
            const bool none = each.countsIn16Bits && count == 65536;
            EXPECT_EQ(textOf(each.locate(&path.cmpi)),
                      "root/cimv2:" + each.farClass + (none ? "" : each.farKey))
                << each.name << ' ' << count;
        }
}

}  // namespace

// The linker binds the provider's call of InstalledOS::isPrimaryOS to the first, and the second to
// the function itself.
extern "C" {
bool __real__ZN2VA16OSStatusProvider11InstalledOS11isPrimaryOSERb(InstalledOS* self, bool& primary);
bool __wrap__ZN2VA16OSStatusProvider11InstalledOS11isPrimaryOSERb(InstalledOS* self,
                                                                  bool& primary) {
    if (!primaryAnswer)
        return __real__ZN2VA16OSStatusProvider11InstalledOS11isPrimaryOSERb(self, primary);
    primary = *primaryAnswer;
    return true;
}
}
