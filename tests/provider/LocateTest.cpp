#include <functional>
#include <memory>

#include "CMPIElementCapabilities.h"
#include "CMPIInstalledOS.h"
#include "CMPIRunningOS.h"
#include "provider/AdapterFixture.h"

// The operations of the association adapters that make a far end's path, each called by itself.

namespace {

using namespace VA::OSStatusProvider;
using Texts = std::vector<std::string>;

/// One operation: its near end's class, and the path that it makes of the keys below.
struct Operation {
    const char* name;
    const char* nearEnd;
    std::string farEndWithoutKeys;
    std::string farEnd;
    bool countsIn16Bits;
    std::function<CMPIObjectPath*(const CMPIObjectPath*)> locate;
};

class Locate : public Adapters {
  protected:
    std::vector<Operation> operations() {
        const auto of = [](auto& adapter, auto operation) {
            return [&adapter, operation](const CMPIObjectPath* path) {
                return (*adapter.*operation)(path);
            };
        };
        const char* const system = "KORVA_OperatingSystem";
        const char* const computer = "KORVA_ComputerSystem";
        const char* const capabilities = "KORVA_OperatingSystemCapabilities";
        const std::string toSystem = "root/cimv2:KORVA_OperatingSystem";
        const std::string toComputer = "root/cimv2:KORVA_ComputerSystem";
        const std::string toCapabilities = "root/cimv2:KORVA_OperatingSystemCapabilities";
        return {
            {"InstalledOS, computer", system, toComputer, toComputer + ".Name=\"n\"", true,
             of(installed, &CMPIInstalledOS::locateComputerSystem)},
            {"InstalledOS, system", computer, toSystem, toSystem + ".CSName=\"n\"", true,
             of(installed, &CMPIInstalledOS::locateOperatingSystem)},
            {"RunningOS, computer", system, toComputer, toComputer + ".Name=\"n\"", true,
             of(running, &CMPIRunningOS::locateComputerSystem)},
            {"RunningOS, system", computer, toSystem, toSystem + ".CSName=\"n\"", true,
             of(running, &CMPIRunningOS::locateOperatingSystem)},
            {"OSElementCapabilities, capabilities", system, toCapabilities,
             toCapabilities + ".InstanceID=\"n\"", false,
             of(element, &CMPIOSElementCapabilities::locateCapabilities)},
            {"OSElementCapabilities, system", capabilities, toSystem, toSystem + ".Name=\"i\"",
             false, of(element, &CMPIOSElementCapabilities::locateOperatingSystem)},
        };
    }

    const Keys keys = {{"Other", "x"}, {"Name", "n"}, {"InstanceID", "i"}};

    // Built from a path of no class of theirs, they have asked for nothing yet.
    template <class Adapter>
    std::unique_ptr<Adapter> built() {
        return std::make_unique<Adapter>(broker.cmpi(), context, made("KORVA_Unknown"));
    }
    std::unique_ptr<CMPIInstalledOS> installed = built<CMPIInstalledOS>();
    std::unique_ptr<CMPIRunningOS> running = built<CMPIRunningOS>();
    std::unique_ptr<CMPIOSElementCapabilities> element = built<CMPIOSElementCapabilities>();
};

TEST_F(Locate, MakesAPathOfTheFarEndsClassWithTheOneKeyThatIsKnown) {
    for (const Operation& each : operations()) {
        EXPECT_EQ(textOf(each.locate(made(each.nearEnd, keys))), each.farEnd) << each.name;
        EXPECT_EQ(textOf(each.locate(made(each.nearEnd))), each.farEndWithoutKeys) << each.name;
    }
}

TEST_F(Locate, MakesThePathBeforeItCountsTheKeys) {
    for (const Operation& each : operations()) {
        const CMPIObjectPath* const nearEnd = made(each.nearEnd, keys);
        cmpihost::FaultPlan plan(cmpihost::Fault{"newObjectPath", 1, 0});
        plan.add(cmpihost::Fault{"getKeyCount", 1, 0});
        broker.setFaultPlan(&plan);
        EXPECT_EQ(each.locate(nearEnd), nullptr) << each.name;
        broker.setFaultPlan(nullptr);
        EXPECT_EQ(plan.firedCalls(),
                  (Texts{"CMPIBrokerEncFT.newObjectPath", "CMPIObjectPathFT.getKeyCount"}))
            << each.name;
    }
}

/// A path that tells of `count` keys and has the two that operations look for.
class CrowdedPath {
  public:
    CrowdedPath(cmpihost::Request& request, CMPICount count)
        : count_(count), names_{request.makeString("Name"), request.makeString("InstanceID")} {
        calls_.getKeyCount = [](const CMPIObjectPath* self, CMPIStatus*) {
            return of(self).count_;
        };
        calls_.getKeyAt = [](const CMPIObjectPath* self, CMPICount index, CMPIString** name,
                             CMPIStatus* status) {
            CMPIData data = {CMPI_chars, CMPI_goodValue, {}};
            if (index > 1) {
                status->rc = CMPI_RC_ERR_NO_SUCH_PROPERTY;
                return data;
            }
            *name = of(self).names_[index];
            data.value.chars = index == 0 ? of(self).name_ : of(self).instanceId_;
            return data;
        };
    }
    const CMPIObjectPath* cmpi() const { return &path_; }

  private:
    static CrowdedPath& of(const CMPIObjectPath* self) {
        return *static_cast<CrowdedPath*>(self->hdl);
    }

    CMPICount count_;
    CMPIString* names_[2];
    char name_[2] = "n";
    char instanceId_[2] = "i";
    CMPIObjectPathFT calls_ = {};
    CMPIObjectPath path_ = {this, &calls_};
};

TEST_F(Locate, CountsKeysIn16BitsForTheComputersAssociationsAlone) {
    for (const Operation& each : operations()) {
        EXPECT_EQ(textOf(each.locate(CrowdedPath(request, 65535).cmpi())), each.farEnd);
        EXPECT_EQ(textOf(each.locate(CrowdedPath(request, 65536).cmpi())),
                  each.countsIn16Bits ? each.farEndWithoutKeys : each.farEnd)
            << each.name;
        EXPECT_EQ(textOf(each.locate(CrowdedPath(request, 65537).cmpi())), each.farEnd);
    }
}

}  // namespace
