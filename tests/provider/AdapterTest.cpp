#include <memory>
#include <string>
#include <vector>

#include "CMPIComputerSystem.h"
#include "CMPIElementCapabilities.h"
#include "CMPIInstalledOS.h"
#include "CMPIOperatingSystem.h"
#include "CMPIRunningOS.h"
#include "ProviderException.h"
#include "host/broker/ComputerSystemService.h"
#include "host/broker/Request.h"
#include "provider/SimulatedFixture.h"

namespace {

using namespace cmpihost;
using namespace VA::OSStatusProvider;

ObjectPathValue pathOf(const std::string& className, std::vector<KeyBinding> keys = {}) {
    return {"root/cimv2", className, std::move(keys)};
}

template <class Adapter>
bool stands(Adapter& adapter) {
    return static_cast<bool>(adapter);
}

/// The adapters on their own, within one request of a broker that serves one computer system.
class Adapters : public SimulatedFixture {
  protected:
    Adapters() {
        broker.route(ComputerSystemService::className, computers);
        addNode("a");
        addNode("b");
    }

    void TearDown() override { EXPECT_EQ(broker.takeViolations(), std::vector<std::string>{}); }

    CMPIObjectPath* made(const std::string& className, std::vector<KeyBinding> keys = {}) {
        return request.makePath(pathOf(className, std::move(keys)));
    }

    // The named key of a path, "(none)" for null, "(absent)" for a path without it.
    static std::string key(const CMPIObjectPath* path, const char* name) {
        if (path == nullptr) return "(none)";
        const ObjectPathValue value = valueOf(path);
        const Value* found = value.key(name);
        return found == nullptr ? "(absent)" : found->toText();
    }

    ComputerSystemService computers{"host1"};
    Broker broker;
    Request request{broker};
    CMPIContext* context = request.makeContext({}, "root/cimv2");
};

class ComputerSystemAdapter : public Adapters {
  protected:
    // Not a member itself: destroying an adapter may throw, destroying a fixture must not.
    std::unique_ptr<CMPIOSComputerSystem> owned =
        std::make_unique<CMPIOSComputerSystem>(broker.cmpi(), context, "root/cimv2");
    CMPIOSComputerSystem& adapter = *owned;
};

TEST_F(ComputerSystemAdapter, IsTrueOnceForTheOneComputer) {
    adapter.setObjectPath(made("KORVA_ComputerSystem"));
    EXPECT_TRUE(stands(adapter));
    EXPECT_FALSE(stands(adapter));
    EXPECT_FALSE(stands(adapter));
    // It still stands on the computer.
    EXPECT_EQ(key(adapter.getObjectPath(), "Name"), "host1");
}

TEST_F(ComputerSystemAdapter, IsTrueAgainWhileFurtherComputersArePending) {
    computers.setNames({"cs1", "cs2"});
    adapter.setObjectPath(made("KORVA_ComputerSystem"));
    EXPECT_TRUE(stands(adapter));
    EXPECT_TRUE(stands(adapter));
    EXPECT_TRUE(stands(adapter));
    ++adapter;
    EXPECT_FALSE(stands(adapter));
    EXPECT_EQ(key(adapter.getObjectPath(), "Name"), "cs2");
}

TEST_F(ComputerSystemAdapter, GivesTheSameInstanceEachTime) {
    adapter.setObjectPath(made("KORVA_ComputerSystem"));
    CMPIInstance* const first = adapter.getCMPIInstance(nullptr);
    ASSERT_NE(first, nullptr);
    const char* properties[] = {"Name", nullptr};
    EXPECT_EQ(adapter.getCMPIInstance(properties), first);
}

TEST_F(ComputerSystemAdapter, StandsOnNothingBeforeItHasAPath) {
    EXPECT_EQ(adapter.getObjectPath(), nullptr);
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
    EXPECT_FALSE(stands(adapter));
    ++adapter;
    EXPECT_FALSE(stands(adapter));
    EXPECT_EQ(adapter.getObjectPath(), nullptr);
}

TEST_F(ComputerSystemAdapter, StandsOnNothingPastTheLast) {
    adapter.setObjectPath(made("KORVA_ComputerSystem"));
    EXPECT_TRUE(stands(adapter));
    for (int step = 0; step < 2; ++step) {
        ++adapter;
        EXPECT_FALSE(stands(adapter));
        EXPECT_EQ(adapter.getObjectPath(), nullptr);
        EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
    }
}

TEST_F(ComputerSystemAdapter, HasNoPathWhenTheInstanceRefusesIt) {
    adapter.setObjectPath(made("KORVA_ComputerSystem"));
    for (const CMPIrc rc : {CMPI_RC_OK, CMPI_RC_ERR_FAILED}) {
        FaultPlan plan(Fault{"CMPIInstanceFT.getObjectPath", 1, 0, rc});
        broker.setFaultPlan(&plan);
        EXPECT_EQ(adapter.getObjectPath(), nullptr);
        EXPECT_EQ(plan.fired(), 1U);
        broker.setFaultPlan(nullptr);
    }
    EXPECT_EQ(key(adapter.getObjectPath(), "Name"), "host1");
}

TEST_F(ComputerSystemAdapter, ThrowsWhenTheBrokerHasNoneToGive) {
    CMPIObjectPath* const asked = made("KORVA_ComputerSystem");
    const auto message = [&] {
        try {
            adapter.setObjectPath(asked);
        } catch (const VA::ProviderException& caught) {
            return std::string(caught.what());
        }
        return std::string("(nothing thrown)");
    };
    const std::string expected = "Could not obtain an instance of Computer System";
    for (const CMPIrc rc : {CMPI_RC_OK, CMPI_RC_ERR_FAILED}) {
        FaultPlan plan(Fault{"enumerateInstances", 1, 0, rc});
        broker.setFaultPlan(&plan);
        EXPECT_EQ(message(), expected);
        EXPECT_EQ(plan.fired(), 1U);
        broker.setFaultPlan(nullptr);
    }
    computers.setNames({});
    EXPECT_EQ(message(), expected);
    EXPECT_FALSE(stands(adapter));
    EXPECT_EQ(adapter.getObjectPath(), nullptr);
}

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

TEST_F(Adapters, OfTheOperatingSystemIsNarrowedByEachFurtherPath) {
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

}  // namespace
