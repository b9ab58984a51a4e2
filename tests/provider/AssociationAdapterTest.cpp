#include <memory>
#include <optional>
#include <sstream>

#include "CMPIElementCapabilities.h"
#include "CMPIInstalledOS.h"
#include "CMPIOperatingSystem.h"
#include "CMPIRunningOS.h"
#include "Linux/InstalledOS.h"
#include "provider/AdapterFixture.h"

namespace {

using namespace cmpihost;
using namespace VA::OSStatusProvider;
using Texts = std::vector<std::string>;

TEST_F(Adapters, OfCapabilitiesFromAnotherClassNeverEndsAndHasNoFarEnd) {
    for (const char* className : {"KORVA_ComputerSystem", "KORVA_RunningOS", "KORVA_Unknown"}) {
        CMPIOSElementCapabilities adapter(broker.cmpi(), context, made(className, {{"Name", "a"}}));
        for (int step = 0; step < 5; ++step) {
            EXPECT_TRUE(stands(adapter)) << className;
            EXPECT_EQ(adapter.getAssociatorNames(), nullptr) << className;
            EXPECT_EQ(adapter.getAssociator(nullptr), nullptr) << className;
            ++adapter;
        }
    }
}

// From whatever class the adapter was built, the association's own path and instance have both
// ends.
TEST_F(Adapters, OfCapabilitiesSetBothReferencesWhateverClassWasRequested) {
    for (const char* className :
         {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities",
          "KORVA_OSElementCapabilities", "KORVA_ComputerSystem", "KORVA_Unknown"}) {
        CMPIOSElementCapabilities adapter(broker.cmpi(), context, made(className));
        const std::string system =
            "root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\","
            "CSName=\"Host1\",CreationClassName=\"KORVA_OperatingSystem\",Name=\"a\"";
        const std::string capabilities =
            "root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"a\"";
        CMPIObjectPath* const path = adapter.getObjectPath();
        EXPECT_EQ(key(path, "ManagedElement"), system) << className;
        EXPECT_EQ(key(path, "Capabilities"), capabilities) << className;
        const InstanceValue instance = valueOf(adapter.getCMPIInstance(nullptr));
        EXPECT_EQ(text(instance, "ManagedElement"), system) << className;
        EXPECT_EQ(text(instance, "Capabilities"), capabilities) << className;
    }
}

TEST_F(Adapters, OfAssociationsHandThePropertyListToTheFarEnd) {
    const char* list[] = {"Name", nullptr};
    std::ostringstream address;
    address << list;
    // The records of the far end's getCMPIInstance that bear the list's address.
    const auto recorded = [&](auto& adapter, const std::string& file) {
        recording::clear();
        EXPECT_NE(adapter.getAssociator(list), nullptr);
        unsigned found = 0;
        for (const recording::Record& record : recording::take())
            if (record.function == "getCMPIInstance" && record.file == file &&
                record.text.find(" properties=" + address.str()) != std::string::npos)
                ++found;
        return found;
    };
    CMPIOSElementCapabilities ofSystem(broker.cmpi(), context, made("KORVA_OperatingSystem"));
    EXPECT_EQ(recorded(ofSystem, "CMPIOperatingSystemCapabilities.cpp"), 4U);
    CMPIOSElementCapabilities ofCapabilities(broker.cmpi(), context,
                                             made("KORVA_OperatingSystemCapabilities"));
    EXPECT_EQ(recorded(ofCapabilities, "CMPIOperatingSystem.cpp"), 4U);
    CMPIInstalledOS installed(broker.cmpi(), context, made("KORVA_ComputerSystem"));
    EXPECT_EQ(recorded(installed, "CMPIOperatingSystem.cpp"), 4U);
    CMPIRunningOS running(broker.cmpi(), context, made("KORVA_ComputerSystem"));
    EXPECT_EQ(recorded(running, "CMPIOperatingSystem.cpp"), 4U);
}

template <class Association>
class ComputerAssociationAdapter : public Adapters {};

struct Installed {
    using Adapter = CMPIInstalledOS;
    static constexpr const char* className = "KORVA_InstalledOS";
};
struct Running {
    using Adapter = CMPIRunningOS;
    static constexpr const char* className = "KORVA_RunningOS";
};
using ComputerAssociations = testing::Types<Installed, Running>;
TYPED_TEST_SUITE(ComputerAssociationAdapter, ComputerAssociations, );

TYPED_TEST(ComputerAssociationAdapter, FromItsOwnPathHasNoFarEnd) {
    typename TypeParam::Adapter adapter(this->broker.cmpi(), this->context,
                                        this->made(TypeParam::className));
    EXPECT_TRUE(stands(adapter));
    EXPECT_EQ(adapter.getAssociatorNames(), nullptr);
    EXPECT_EQ(adapter.getAssociator(nullptr), nullptr);
    EXPECT_NE(adapter.getObjectPath(), nullptr);
}

TYPED_TEST(ComputerAssociationAdapter, FromAnUnrelatedClassIsEmpty) {
    for (const char* className : {"KORVA_OperatingSystemCapabilities", "KORVA_Unknown"}) {
        typename TypeParam::Adapter adapter(this->broker.cmpi(), this->context,
                                            this->made(className, {{"InstanceID", "a"}}));
        EXPECT_FALSE(stands(adapter)) << className;
        ++adapter;
        EXPECT_FALSE(stands(adapter)) << className;
        EXPECT_EQ(adapter.getAssociatorNames(), nullptr) << className;
        EXPECT_EQ(adapter.getAssociator(nullptr), nullptr) << className;
    }
}

// The framework sets the keys of a path as properties already.
TEST_F(Adapters, OfAssociationsSetEachReferenceByACallOfTheirOwn) {
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
    const CMPIBroker* const cmpi = broker.cmpi();
    EXPECT_EQ(
        referencesOf(std::make_unique<CMPIInstalledOS>(cmpi, context, made("KORVA_InstalledOS"))),
        (Texts{"GroupComponent", "PartComponent"}));
    EXPECT_EQ(referencesOf(std::make_unique<CMPIRunningOS>(cmpi, context, made("KORVA_RunningOS"))),
              (Texts{"Antecedent", "Dependent"}));
    EXPECT_EQ(referencesOf(std::make_unique<CMPIOSElementCapabilities>(
                  cmpi, context, made("KORVA_OSElementCapabilities"))),
              (Texts{"ManagedElement", "Capabilities"}));
}

/// A path with keys that notes the names that it is asked for.
class AskedPath {
  public:
    AskedPath(const CMPIObjectPath* path, Texts& notes) : path_(path), notes_(notes) {
        calls_.getKeyCount = [](const CMPIObjectPath* self, CMPIStatus* status) {
            const CMPIObjectPath* const asked = of(self).path_;
            return asked->ft->getKeyCount(asked, status);
        };
        calls_.getKey = [](const CMPIObjectPath* self, const char* name, CMPIStatus* status) {
            of(self).notes_.push_back(std::string("key ") + name);
            const CMPIObjectPath* const asked = of(self).path_;
            return asked->ft->getKey(asked, name, status);
        };
    }
    const CMPIObjectPath* cmpi() const { return &asking_; }

  private:
    static AskedPath& of(const CMPIObjectPath* self) { return *static_cast<AskedPath*>(self->hdl); }

    const CMPIObjectPath* path_;
    Texts& notes_;
    CMPIObjectPathFT calls_ = {};
    CMPIObjectPath asking_ = {this, &calls_};
};

TEST_F(Adapters, OfCapabilitiesReadApplyAndMapCapabilitiesBeforeTheyReadManagedElement) {
    CMPIOSElementCapabilities adapter(broker.cmpi(), context, made("KORVA_Unknown"));
    const CMPIObjectPath* const system = made("KORVA_OperatingSystem", {{"Name", "a"}});
    const CMPIObjectPath* const capabilities =
        made("KORVA_OperatingSystemCapabilities", {{"InstanceID", "a"}});
    Texts sequence;
    recording::setHook([&](const recording::Record& record) {
        if (record.channel == "log" && record.text.rfind("ENTERING: ", 0) == 0)
            sequence.push_back(record.file + ' ' + record.function);
    });
    const AskedPath path(made("KORVA_OSElementCapabilities",
                              {{"ManagedElement", Value::fromReference(valueOf(system))},
                               {"Capabilities", Value::fromReference(valueOf(capabilities))}}),
                         sequence);
    EXPECT_TRUE(adapter.setObjectPath(path.cmpi()));
    recording::setHook({});
    EXPECT_EQ(sequence, (Texts{"CMPIElementCapabilities.cpp setObjectPath", "key Capabilities",
                               "CMPIOperatingSystemCapabilities.cpp setObjectPath",
                               "CMPIElementCapabilities.cpp locateOperatingSystem",
                               "Linux/ElementCapabilities.cpp getOperatingSystemMoniker",
                               "key ManagedElement", "CMPIOperatingSystem.cpp setObjectPath"}));
}

/// What InstalledOS::isPrimaryOS is to answer in place of its own; none: its own answer.
std::optional<bool> primaryAnswer;

TEST_F(Adapters, OfInstalledSystemsAskForPrimaryOSAndSetItWhereItIsKnown) {
    CMPIInstalledOS installed(broker.cmpi(), context, made("KORVA_InstalledOS"));
    CMPIRunningOS running(broker.cmpi(), context, made("KORVA_RunningOS"));
    const auto propertiesOf = [](auto& adapter) {
        Texts properties;
        for (const PropertyValue& each : valueOf(adapter.getCMPIInstance(nullptr)).properties)
            properties.push_back(
                each.value.type() == CMPI_ref ? each.name : each.name + " " + each.value.toText());
        return properties;
    };
    for (const bool primary : {true, false}) {
        primaryAnswer = primary;
        EXPECT_EQ(propertiesOf(installed), (Texts{"GroupComponent", "PartComponent",
                                                  primary ? "PrimaryOS true" : "PrimaryOS false"}));
        EXPECT_EQ(propertiesOf(running), (Texts{"Antecedent", "Dependent"}));
    }
    primaryAnswer.reset();
    EXPECT_EQ(propertiesOf(installed), (Texts{"GroupComponent", "PartComponent"}));
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
