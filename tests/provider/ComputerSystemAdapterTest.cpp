#include <memory>

#include "CMPIComputerSystem.h"
#include "ProviderException.h"
#include "provider/AdapterFixture.h"

namespace {

using VA::OSStatusProvider::CMPIOSComputerSystem;
using Texts = std::vector<std::string>;

constexpr const char* noComputerSystem = "Could not obtain an instance of Computer System";

// What setObjectPath throws, "" if nothing.
std::string thrownBy(CMPIOSComputerSystem& adapter, const CMPIObjectPath* path) {
    try {
        adapter.setObjectPath(path);
    } catch (const VA::ProviderException& caught) {
        return caught.what();
    }
    return "";
}

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

TEST_F(ComputerSystemAdapter, ThrowsWhenTheBrokerHasNoneToGive) {
    computers.setNames({});
    EXPECT_EQ(thrownBy(adapter, made("KORVA_ComputerSystem")), noComputerSystem);
    EXPECT_FALSE(stands(adapter));
    EXPECT_EQ(adapter.getObjectPath(), nullptr);
}

/// A broker with one enumeration and one instance, whose calls answer what the test says, an object
/// beside an error included; keeps their names in order.
class ScriptedBroker {
  public:
    struct Answer {
        CMPIrc rc = CMPI_RC_OK;
        bool null = false;
    };

    ScriptedBroker() {
        broker_.bft->enumerateInstances = [](const CMPIBroker* self, const CMPIContext*,
                                             const CMPIObjectPath*, const char**,
                                             CMPIStatus* status) {
            ScriptedBroker& script = of(self);
            return script.give("enumerateInstances", script.enumerate, script.enumeration_, status);
        };
        enumeration_.ft->hasNext = [](const CMPIEnumeration* self, CMPIStatus*) {
            of(self).asked_.push_back("hasNext");
            return static_cast<CMPIBoolean>(of(self).more);
        };
        enumeration_.ft->getNext = [](const CMPIEnumeration* self, CMPIStatus* status) {
            ScriptedBroker& script = of(self);
            CMPIData data = {CMPI_instance, CMPI_goodValue, {}};
            data.value.inst = script.give("getNext", script.next, script.instance, status);
            return data;
        };
        instance.ft->getObjectPath = [](const CMPIInstance* self, CMPIStatus* status) {
            ScriptedBroker& script = of(self);
            return script.give("getObjectPath", script.pathOfInstance, script.path, status);
        };
    }

    const CMPIBroker* cmpi() const { return &broker_; }
    Texts takeAsked() { return std::exchange(asked_, {}); }

    Answer enumerate;
    Answer next;
    Answer pathOfInstance;
    bool more = true;
    CMPIInstance instance = {this, &instanceCalls_};
    CMPIObjectPath path = {};

  private:
    template <class Object>
    static ScriptedBroker& of(const Object* self) {
        return *static_cast<ScriptedBroker*>(self->hdl);
    }

    template <class Object>
    Object* give(const char* call, const Answer& answer, Object& object, CMPIStatus* status) {
        asked_.push_back(call);
        *status = {answer.rc, nullptr};
        return answer.null ? nullptr : &object;
    }

    CMPIBrokerFT calls_ = {};
    CMPIEnumerationFT enumerationCalls_ = {};
    CMPIInstanceFT instanceCalls_ = {};
    CMPIBroker broker_ = {this, &calls_, nullptr, nullptr, nullptr};
    CMPIEnumeration enumeration_ = {this, &enumerationCalls_};
    Texts asked_;
};

constexpr ScriptedBroker::Answer given = {};
constexpr ScriptedBroker::Answer none = {CMPI_RC_OK, true};
constexpr ScriptedBroker::Answer refused = {CMPI_RC_ERR_FAILED, true};
constexpr ScriptedBroker::Answer givenWithAnError = {CMPI_RC_ERR_FAILED, false};

class ComputerSystemCalls : public testing::Test {
  protected:
    ScriptedBroker broker;
    std::unique_ptr<CMPIOSComputerSystem> owned =
        std::make_unique<CMPIOSComputerSystem>(broker.cmpi(), nullptr, "root/cimv2");
    CMPIOSComputerSystem& adapter = *owned;
    const CMPIObjectPath path = {};
};

const Texts allCalls = {"enumerateInstances", "hasNext", "getNext"};

TEST_F(ComputerSystemCalls, NullPathAsksNobodyAndThrowsOnEveryCall) {
    EXPECT_EQ(thrownBy(adapter, nullptr), noComputerSystem);
    EXPECT_EQ(thrownBy(adapter, nullptr), noComputerSystem);
    EXPECT_EQ(broker.takeAsked(), Texts{});
    EXPECT_EQ(thrownBy(adapter, &path), "");
    EXPECT_EQ(broker.takeAsked(), allCalls);
    EXPECT_EQ(thrownBy(adapter, nullptr), noComputerSystem);
    EXPECT_EQ(broker.takeAsked(), Texts{});
    // It stands where it stood.
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), &broker.instance);
    EXPECT_TRUE(stands(adapter));
    EXPECT_TRUE(stands(adapter));
    EXPECT_EQ(broker.takeAsked(), Texts{"hasNext"});
}

TEST_F(ComputerSystemCalls, AnyStatusButOKThrowsWhateverCameBesideIt) {
    for (const auto& answer : {givenWithAnError, refused}) {
        broker.enumerate = answer;
        EXPECT_EQ(thrownBy(adapter, &path), noComputerSystem);
        EXPECT_EQ(broker.takeAsked(), Texts{"enumerateInstances"});
    }
    broker.enumerate = given;
    broker.next = givenWithAnError;
    EXPECT_EQ(thrownBy(adapter, &path), noComputerSystem);
    EXPECT_EQ(broker.takeAsked(), allCalls);
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
}

TEST_F(ComputerSystemCalls, EnumerationThatIsNullOrHasNoElementThrows) {
    broker.enumerate = none;
    EXPECT_EQ(thrownBy(adapter, &path), noComputerSystem);
    EXPECT_EQ(broker.takeAsked(), Texts{"enumerateInstances"});
    broker.enumerate = given;
    broker.more = false;
    EXPECT_EQ(thrownBy(adapter, &path), noComputerSystem);
    EXPECT_EQ(broker.takeAsked(), (Texts{"enumerateInstances", "hasNext"}));
}

TEST_F(ComputerSystemCalls, EnumerationThatCameWithAFailureIsKept) {
    broker.enumerate = givenWithAnError;
    EXPECT_EQ(thrownBy(adapter, &path), noComputerSystem);
    broker.takeAsked();
    EXPECT_TRUE(stands(adapter));
    ++adapter;
    EXPECT_EQ(broker.takeAsked(), (Texts{"hasNext", "getNext"}));
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), &broker.instance);
    // A null one replaces it.
    broker.enumerate = refused;
    EXPECT_EQ(thrownBy(adapter, &path), noComputerSystem);
    broker.takeAsked();
    EXPECT_FALSE(stands(adapter));
    ++adapter;
    EXPECT_EQ(broker.takeAsked(), Texts{});
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
}

TEST_F(ComputerSystemCalls, InstanceIsNullAfterAFailedFetch) {
    EXPECT_EQ(thrownBy(adapter, &path), "");
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), &broker.instance);
    broker.next = givenWithAnError;
    EXPECT_EQ(thrownBy(adapter, &path), noComputerSystem);
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
    broker.next = given;
    EXPECT_EQ(thrownBy(adapter, &path), "");
    broker.next = givenWithAnError;
    ++adapter;
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
    EXPECT_EQ(adapter.getObjectPath(), nullptr);
}

TEST_F(ComputerSystemCalls, AdvanceFetchesWithoutAskingWhetherThereIsAnother) {
    EXPECT_EQ(thrownBy(adapter, &path), "");
    broker.takeAsked();
    for (const bool more : {true, false}) {
        broker.more = more;
        ++adapter;
        EXPECT_EQ(broker.takeAsked(), Texts{"getNext"});
        EXPECT_EQ(adapter.getCMPIInstance(nullptr), &broker.instance);
    }
}

TEST_F(ComputerSystemCalls, PathIsTheInstancesOwnOrNullWithAnyStatusButOK) {
    EXPECT_EQ(thrownBy(adapter, &path), "");
    broker.takeAsked();
    EXPECT_EQ(adapter.getObjectPath(), &broker.path);
    for (const auto& answer : {none, refused, givenWithAnError}) {
        broker.pathOfInstance = answer;
        EXPECT_EQ(adapter.getObjectPath(), nullptr);
    }
    EXPECT_EQ(broker.takeAsked(), Texts(4, "getObjectPath"));
}

}  // namespace
