#include "CMPIOperatingSystem.h"
#include "CMPIOperatingSystemCapabilities.h"
#include "provider/AdapterFixture.h"

// What an instance holds where a getter succeeds without writing its output.

namespace {

using namespace cmpihost;
using namespace VA::NodeLexicon;
using namespace VA::OSStatusProvider;

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
    bool readOnlyProperty(Properties, bool&) override { return true; }
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

class UnwrittenValues : public Adapters {
  protected:
    UnwrittenValues() { VA::setHostSource(std::make_shared<TaciturnHost>()); }
};

// One value of each type serves all its rows.
TEST_F(UnwrittenValues, OfTheOperatingSystemAreThoseOfTheRowsBefore) {
    CMPIOperatingSystem adapter(broker.cmpi(), context, "root/cimv2");
    const InstanceValue instance = valueOf(adapter.getCMPIInstance(nullptr));
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
}

// Each row has its own.
TEST_F(UnwrittenValues, OfTheCapabilitiesAreEmpty) {
    CMPIOperatingSystemCapabilities adapter(broker.cmpi(), context, "root/cimv2");
    const InstanceValue instance = valueOf(adapter.getCMPIInstance(nullptr));
    EXPECT_EQ(text(instance, "InstanceID"), "Linux");
    EXPECT_EQ(text(instance, "ElementName"), "");
}

}  // namespace
