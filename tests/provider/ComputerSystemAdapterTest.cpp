#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <gtest/gtest.h>

#include <cstddef>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "CMPIComputerSystem.h"
#include "ProviderException.h"

// The adapter of the computer system, with a broker that is told what to answer.

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

/// A broker with one enumeration of some instances, whose calls answer what the test says, an
/// object beside an error included; keeps their names in order.
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
            return static_cast<CMPIBoolean>(of(self).pending > 0);
        };
        enumeration_.ft->getNext = [](const CMPIEnumeration* self, CMPIStatus* status) {
            ScriptedBroker& script = of(self);
            CMPIData data = {CMPI_instance, CMPI_goodValue, {}};
            data.value.inst = script.give("getNext", script.next, script.instance, status);
            if (script.pending > 0) --script.pending;
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
    int pending = 1;  ///< instances that the enumeration still has
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

class ComputerSystemAdapter : public testing::Test {
  protected:
    // Whether the adapter stands on an instance, and the calls that it made to find out.
    std::pair<bool, Texts> asked() {
        broker.takeAsked();
        const bool result = static_cast<bool>(adapter);
        return {result, broker.takeAsked()};
    }

    // The adapter has none.
    void expectNothing() {
        EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
        EXPECT_EQ(adapter.getObjectPath(), nullptr);
    }

    ScriptedBroker broker;
    // Not a member itself: destroying an adapter may throw, destroying a fixture must not.
    std::unique_ptr<CMPIOSComputerSystem> owned =
        std::make_unique<CMPIOSComputerSystem>(broker.cmpi(), nullptr, "root/cimv2");
    CMPIOSComputerSystem& adapter = *owned;
    const CMPIObjectPath path = {};
};

const Texts allCalls = {"enumerateInstances", "hasNext", "getNext"};
const std::pair<bool, Texts> trueWithoutAsking = {true, {}};
const std::pair<bool, Texts> falseWithoutAsking = {false, {}};
const std::pair<bool, Texts> thereIsAnother = {true, {"hasNext"}};
const std::pair<bool, Texts> thereIsNoOther = {false, {"hasNext"}};

TEST_F(ComputerSystemAdapter, StandsOnNothingAndAsksNobodyBeforeItHasAPath) {
    for (int step = 0; step < 2; ++step, ++adapter) {
        expectNothing();
        EXPECT_EQ(asked(), falseWithoutAsking);
    }
    EXPECT_EQ(broker.takeAsked(), Texts{});
}

TEST_F(ComputerSystemAdapter, IsTrueOnceForTheOneComputerAndStillStandsOnIt) {
    EXPECT_EQ(thrownBy(adapter, &path), "");
    EXPECT_EQ(broker.takeAsked(), allCalls);
    EXPECT_EQ(asked(), trueWithoutAsking);
    EXPECT_EQ(asked(), thereIsNoOther);
    EXPECT_EQ(asked(), thereIsNoOther);
    const char* properties[] = {"Name", nullptr};
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), &broker.instance);
    EXPECT_EQ(adapter.getCMPIInstance(properties), &broker.instance);
}

// Of several it never reports the last.
TEST_F(ComputerSystemAdapter, IsTrueWhileTheBrokerHasAnotherComputerToFetch) {
    broker.pending = 2;
    EXPECT_EQ(thrownBy(adapter, &path), "");
    EXPECT_EQ(asked(), trueWithoutAsking);
    EXPECT_EQ(asked(), thereIsAnother);
    EXPECT_EQ(asked(), thereIsAnother);
    ++adapter;
    EXPECT_EQ(broker.takeAsked(), Texts{"getNext"});
    EXPECT_EQ(asked(), thereIsNoOther);
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), &broker.instance);
}

TEST_F(ComputerSystemAdapter, AdvanceFetchesWithoutAskingWhetherThereIsAnother) {
    EXPECT_EQ(thrownBy(adapter, &path), "");
    broker.takeAsked();
    ++adapter;
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), &broker.instance);
    broker.next = givenWithAnError;
    ++adapter;
    EXPECT_EQ(broker.takeAsked(), (Texts{"getNext", "getNext"}));
    expectNothing();
}

TEST_F(ComputerSystemAdapter, NullPathAsksNobodyAndThrowsOnEveryCall) {
    EXPECT_EQ(thrownBy(adapter, nullptr), noComputerSystem);
    EXPECT_EQ(thrownBy(adapter, nullptr), noComputerSystem);
    EXPECT_EQ(broker.takeAsked(), Texts{});
    EXPECT_EQ(thrownBy(adapter, &path), "");
    broker.takeAsked();
    EXPECT_EQ(thrownBy(adapter, nullptr), noComputerSystem);
    EXPECT_EQ(broker.takeAsked(), Texts{});
    // It stands where it stood.
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), &broker.instance);
    EXPECT_EQ(asked(), trueWithoutAsking);
    EXPECT_EQ(asked(), thereIsNoOther);
}

TEST_F(ComputerSystemAdapter, ThrowsWithoutAFirstInstanceWhateverCameBesideAnError) {
    const struct {
        ScriptedBroker::Answer enumerate, next;
        int pending;
        std::ptrdiff_t calls;
    } rows[] = {
        {givenWithAnError, given, 1, 1},
        {refused, given, 1, 1},
        {none, given, 1, 1},
        {given, given, 0, 2},
        {given, refused, 1, 3},
        {given, givenWithAnError, 1, 3},
    };
    for (const auto& row : rows) {
        broker.enumerate = row.enumerate;
        broker.next = row.next;
        broker.pending = row.pending;
        EXPECT_EQ(thrownBy(adapter, &path), noComputerSystem);
        EXPECT_EQ(broker.takeAsked(), Texts(allCalls.begin(), allCalls.begin() + row.calls));
        expectNothing();
    }
    broker.next = given;
    broker.pending = 1;
    EXPECT_EQ(thrownBy(adapter, &path), "");
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), &broker.instance);
    // What it stood on is gone.
    broker.next = givenWithAnError;
    broker.pending = 1;
    EXPECT_EQ(thrownBy(adapter, &path), noComputerSystem);
    expectNothing();
}

TEST_F(ComputerSystemAdapter, EnumerationThatCameWithAFailureIsKept) {
    broker.enumerate = givenWithAnError;
    EXPECT_EQ(thrownBy(adapter, &path), noComputerSystem);
    EXPECT_EQ(asked(), thereIsAnother);
    ++adapter;
    EXPECT_EQ(broker.takeAsked(), Texts{"getNext"});
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), &broker.instance);
    // A null one replaces it.
    broker.enumerate = refused;
    EXPECT_EQ(thrownBy(adapter, &path), noComputerSystem);
    EXPECT_EQ(asked(), falseWithoutAsking);
    ++adapter;
    EXPECT_EQ(broker.takeAsked(), Texts{});
    expectNothing();
}

TEST_F(ComputerSystemAdapter, PathIsTheInstancesOwnOrNullWithAnyStatusButOK) {
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
