// Another header may name an adapter or an element without knowing more of it than that it is a
// class.
namespace VA::OSStatusProvider {
class CMPIInstalledOS;
class CMPIOSComputerSystem;
class CMPIOSElementCapabilities;
class CMPIOperatingSystem;
class CMPIOperatingSystemCapabilities;
class CMPIRunningOS;
class InstalledOS;
class OSElementCapabilities;
class OperatingSystem;
class OperatingSystemCapabilities;
class RunningOS;
}  // namespace VA::OSStatusProvider

#include "CMPIComputerSystem.h"
#include "CMPIElementCapabilities.h"
#include "CMPIInstalledOS.h"
#include "CMPIOperatingSystem.h"
#include "CMPIOperatingSystemCapabilities.h"
#include "CMPIRunningOS.h"
#include "Linux/ElementCapabilities.h"
#include "Linux/InstalledOS.h"
#include "Linux/OperatingSystem.h"
#include "Linux/OperatingSystemCapabilities.h"
#include "Linux/RunningOS.h"
#include "host/mof/Schema.h"
#include "provider/AdapterFixture.h"

// The adapters of elements, on their own.

namespace {

using namespace cmpihost;
using namespace VA::NodeLexicon;
using namespace VA::OSStatusProvider;
using Texts = std::vector<std::string>;

template <class... Classes>
constexpr bool arePlain = (!std::is_polymorphic_v<Classes> && ...);

TEST(ProviderClasses, ArePlainClassesWithoutVirtualOperations) {
    EXPECT_TRUE(
        (arePlain<CMPIInstalledOS, CMPIOSComputerSystem, CMPIOSElementCapabilities,
                  CMPIOperatingSystem, CMPIOperatingSystemCapabilities, CMPIRunningOS, InstalledOS,
                  OSElementCapabilities, OperatingSystem, OperatingSystemCapabilities, RunningOS>));
}

// The CIM type that each type of a getter's output stands for.
CMPIType cimTypeOf(const std::string*) {
    return CMPI_string;
}
CMPIType cimTypeOf(const unsigned short*) {
    return CMPI_uint16;
}
CMPIType cimTypeOf(const unsigned int*) {
    return CMPI_uint32;
}
CMPIType cimTypeOf(const unsigned long long*) {
    return CMPI_uint64;
}
CMPIType cimTypeOf(const short*) {
    return CMPI_sint16;
}
CMPIType cimTypeOf(const bool*) {
    return CMPI_boolean;
}
template <class Item>
CMPIType cimTypeOf(const std::vector<Item>*) {
    return cimTypeOf(static_cast<const Item*>(nullptr)) | CMPI_ARRAY;
}
template <class Element, class Value>
CMPIType cimTypeOf(bool (Element::*)(Value&)) {
    return cimTypeOf(static_cast<const Value*>(nullptr));
}

// Holds an adapter's tables against the class that schema/ declares.
template <class Element>
void expectDeclared(const ElementTraits<Element>& traits) {
    static const SchemaCatalogue catalogue(Schema::load(KORVA_SOURCE_DIR "/schema"));
    Texts declared;
    Texts declaredKeys;
    for (const PropertyDeclaration& property : catalogue.find(traits.className)->properties) {
        declared.push_back(cimTypeName(property.type) + " " + property.name);
        if (property.key) declaredKeys.push_back(property.name);
    }
    Texts properties;
    for (const Property<Element>& property : traits.properties) {
        const CMPIType type =
            std::visit([](auto getter) { return cimTypeOf(getter); }, property.getter);
        properties.push_back(
            cimTypeName(property.form == TextForm::dateTime ? CMPIType{CMPI_dateTime} : type) +
            " " + property.name);
    }
    Texts keys;
    for (const Key<Element>& key : traits.keys) keys.push_back(key.name);
    EXPECT_EQ(properties, declared);
    EXPECT_EQ(keys, declaredKeys);
}

TEST(ElementTraitsTables, AreThoseOfTheDeclaredClasses) {
    expectDeclared(CMPIOperatingSystem::traits);
    expectDeclared(CMPIOperatingSystemCapabilities::traits);
}

TEST_F(Adapters, OfTheOperatingSystemAreNarrowedByEachFurtherPath) {
    CMPIOperatingSystem adapter(broker.cmpi(), context, "root/cimv2");
    EXPECT_EQ(key(adapter.getObjectPath(), "Name"), "a");
    adapter.setObjectPath(made("KORVA_OperatingSystem", {{"Name", "b"}}));
    EXPECT_TRUE(stands(adapter));
    EXPECT_EQ(key(adapter.getObjectPath(), "Name"), "b");
    adapter.setObjectPath(made("KORVA_OperatingSystem", {{"CSName", "Host1"}}));
    EXPECT_TRUE(stands(adapter));
    EXPECT_EQ(key(adapter.getObjectPath(), "Name"), "b");
    adapter.setObjectPath(made("KORVA_OperatingSystem"));
    EXPECT_EQ(key(adapter.getObjectPath(), "Name"), "b");
    adapter.setObjectPath(made("KORVA_OperatingSystem", {{"CSName", "elsewhere"}}));
    EXPECT_FALSE(stands(adapter));
}

/// One node of which every value is known; but only the first two readings of its name, and the
/// number of licensed users, are written.
class TaciturnCursor final : public VA::NodeCursor {
  public:
    bool select(NodeType) override { return true; }
    bool valid() override { return true; }
    void next() override {}
    bool readProperty(Properties id, std::string& value) override {
        if (id == Name && ++namesRead_ <= 2) value = "Linux";
        return true;
    }
    bool readProperty(Properties id, unsigned int& value) override {
        if (id == NumberOfLicensedUsers) value = 7;
        return true;
    }
    bool readProperty(Properties, bool&) override { return true; }
    bool isPropertyReadOnly(Properties, bool&) override { return true; }
    unsigned int nodeStatus() override { return 1; }
    bool readComputerName(std::string&) override { return true; }

  private:
    int namesRead_ = 0;
};

class TaciturnHost final : public VA::HostSource {
  public:
    std::unique_ptr<VA::NodeCursor> openCursor() override {
        return std::make_unique<TaciturnCursor>();
    }
};

// The operating system has one value of each type for all its rows, the capabilities a fresh one
// for each row.
TEST_F(Adapters, PublishUnwrittenValuesAsTheRowsBeforeLeftThemOrEmpty) {
    VA::setHostSource(std::make_shared<TaciturnHost>());
    CMPIOperatingSystem system(broker.cmpi(), context, "root/cimv2");
    const InstanceValue instance = valueOf(system.getCMPIInstance(nullptr));
    const std::pair<const char*, const char*> expected[] = {
        {"Description", ""},
        {"CSCreationClassName", "KORVA_ComputerSystem"},
        {"CSName", "KORVA_ComputerSystem"},
        {"Name", "Linux"},
        {"Version", "Linux"},
        {"OSType", "0"},
        {"NumberOfLicensedUsers", "7"},
        {"NumberOfUsers", "7"},
        {"NumberOfProcesses", "7"},
        {"MaxNumberOfProcesses", "7"},
        {"TotalSwapSpaceSize", "0"},
        {"Distributed", "false"},
    };
    for (const auto& [name, value] : expected) EXPECT_EQ(text(instance, name), value) << name;
    CMPIOperatingSystemCapabilities capabilities(broker.cmpi(), context, "root/cimv2");
    const InstanceValue ofCapabilities = valueOf(capabilities.getCMPIInstance(nullptr));
    EXPECT_EQ(text(ofCapabilities, "InstanceID"), "Linux");
    EXPECT_EQ(text(ofCapabilities, "ElementName"), "");
}

}  // namespace
