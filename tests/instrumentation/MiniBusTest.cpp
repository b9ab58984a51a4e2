// The host's own libsystemd, where there is one, talks to a bus of the test.
#include "MiniBus.h"

#include <dlfcn.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>

#include "framework/instrumentation/Linux/SystemdBus.h"
#include "framework/instrumentation/LinuxHost.h"
#include "tests/instrumentation/FixtureTree.h"

namespace {

using namespace std::chrono_literals;
using testing::HasSubstr;
using VA::Linux::SystemdBus;
using Behaviour = MiniBus::Behaviour;

// Long enough for an answer on a machine under any load.
constexpr auto patience = 30s;

class MiniBusTest : public testing::Test {
  protected:
    void SetUp() override {
        library_ = ::dlopen(SystemdBus::defaultLibrary, RTLD_NOW | RTLD_LOCAL);
        if (!library_) GTEST_SKIP() << "this host has no " << SystemdBus::defaultLibrary;
        tree.makeFolder("run/systemd/system");
        tree.makeFolder("run/dbus");
    }
    void TearDown() override {
        if (library_) ::dlclose(library_);
    }

    std::string socket() const { return tree.path("run/dbus/system_bus_socket"); }

    std::optional<std::string> state(std::chrono::milliseconds deadline = patience) const {
        return SystemdBus(socket(), SystemdBus::defaultLibrary, {}, deadline).systemState();
    }

    FixtureTree tree;

  private:
    void* library_ = nullptr;
};

TEST_F(MiniBusTest, TellsTheStateOfTheManager) {
    for (const char* expected : {"running", "degraded", "maintenance"}) {
        MiniBus bus(socket(), Behaviour::Answer, expected);
        EXPECT_EQ(state(), expected);
        std::filesystem::remove(socket());
    }
}

TEST_F(MiniBusTest, BusOfALinuxHostIsTheOneUnderItsRoot) {
    MiniBus bus(socket(), Behaviour::Answer, "stopping");
    VA::LinuxHost host(tree.root());
    unsigned int status = 0;
    // A machine under load may miss the short deadline now and then.
    for (int attempt = 0; attempt < 20 && status == 0; ++attempt) {
        auto cursor = host.openCursor();
        cursor->select(VA::NodeLexicon::OperatingSystemNode);
        status = cursor->nodeStatus();
    }
    EXPECT_EQ(status, 16u);
}

TEST_F(MiniBusTest, ClientGreetsAsksOnePropertyAndLeaves) {
    MiniBus bus(socket(), Behaviour::Answer, "running");
    EXPECT_EQ(state(), "running");
    const auto& messages = bus.stop();
    ASSERT_EQ(messages.size(), 2u);
    EXPECT_THAT(messages[0], HasSubstr("Hello"));
    for (const char* part : {"org.freedesktop.systemd1", "/org/freedesktop/systemd1", "Get",
                             "org.freedesktop.systemd1.Manager", "SystemState"}) {
        EXPECT_THAT(messages[1], HasSubstr(part));
    }
}

TEST_F(MiniBusTest, ErrorOrOtherTypeOrLostConnectionIsNoAnswerAtOnce) {
    for (const auto behaviour : {Behaviour::ErrorReply, Behaviour::OtherType, Behaviour::HangsUp}) {
        MiniBus bus(socket(), behaviour, "running");
        const auto start = std::chrono::steady_clock::now();
        EXPECT_EQ(state(), std::nullopt);
        EXPECT_LT(std::chrono::steady_clock::now() - start, patience / 2);
        std::filesystem::remove(socket());
    }
}

TEST_F(MiniBusTest, BusThatDiedWithItsSocketOpenCostsTheDeadlineAndNoMore) {
    for (const auto behaviour : {Behaviour::SilentFromTheStart, Behaviour::SilentAfterGreeting}) {
        MiniBus bus(socket(), behaviour, "running");
        const auto start = std::chrono::steady_clock::now();
        EXPECT_EQ(state(SystemdBus::defaultDeadline), std::nullopt);
        const auto time = std::chrono::steady_clock::now() - start;
        EXPECT_GE(time, 295ms);
        EXPECT_LT(time, 3000ms);
        std::filesystem::remove(socket());
    }
}

TEST_F(MiniBusTest, HostWithoutABusHasNoAnswerAtOnce) {
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(state(), std::nullopt);
    EXPECT_LT(std::chrono::steady_clock::now() - start, patience / 2);
}

}  // namespace
