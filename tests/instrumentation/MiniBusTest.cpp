// The host's own libsystemd, where there is one, talks to a bus of the test.
#include "MiniBus.h"

#include <dlfcn.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>

#include "framework/instrumentation/Linux/Systemd.h"
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

    // What a host under the tree says of its state while `bus` answers, or nobody does.
    unsigned int status(std::chrono::milliseconds deadline = patience) const {
        auto systemd = std::make_shared<SystemdBus>(socket(), SystemdBus::defaultLibrary,
                                                    SystemdBus::Lookup(), deadline);
        VA::LinuxHost host(VA::Linux::HostParts{std::make_shared<VA::Linux::HostFiles>(tree.root()),
                                                std::make_shared<VA::Linux::Kernel>(),
                                                std::move(systemd)});
        const auto cursor = host.openCursor();
        cursor->select(VA::NodeLexicon::OperatingSystemNode);
        return cursor->nodeStatus();
    }

    unsigned int statusWith(Behaviour behaviour, const std::string& state) const {
        const MiniBus bus(socket(), behaviour, state);
        const unsigned int found = status();
        std::filesystem::remove(socket());
        return found;
    }

    FixtureTree tree;

  private:
    void* library_ = nullptr;
};

TEST_F(MiniBusTest, EachStateOfTheManagerHasItsCodeAndAnyOtherWordHasNone) {
    const std::pair<const char*, unsigned int> states[] = {
        {"running", 1},   {"initializing", 2}, {"starting", 2}, {"degraded", 21},
        {"stopping", 16}, {"maintenance", 8},  {"offline", 12}, {"unknown", 0},
        {"", 0},          {"RUNNING", 0},      {"running\n", 0}};
    for (const auto& [state, code] : states) {
        EXPECT_EQ(statusWith(Behaviour::Answer, state), code) << state;
    }
    // What is read of a word ends after 31 bytes: neither more nor less may be taken for a state.
    EXPECT_EQ(statusWith(Behaviour::Answer, std::string(5000, 'r')), 0u);
    EXPECT_EQ(statusWith(Behaviour::Answer, "running" + std::string(5000, ' ')), 0u);
}

TEST_F(MiniBusTest, BusOfALinuxHostIsTheOneUnderItsRoot) {
    MiniBus bus(socket(), Behaviour::Answer, "stopping");
    const auto host = VA::makeLinuxHost(tree.root());
    unsigned int status = 0;
    // A machine under load may miss the short deadline now and then.
    for (int attempt = 0; attempt < 20 && status == 0; ++attempt) {
        auto cursor = host->openCursor();
        cursor->select(VA::NodeLexicon::OperatingSystemNode);
        status = cursor->nodeStatus();
    }
    EXPECT_EQ(status, 16u);
}

TEST_F(MiniBusTest, ClientGreetsAsksOnePropertyAndLeaves) {
    MiniBus bus(socket(), Behaviour::Answer, "running");
    EXPECT_EQ(status(), 1u);
    const auto& messages = bus.stop();
    ASSERT_EQ(messages.size(), 2u);
    EXPECT_THAT(messages[0], HasSubstr("Hello"));
    for (const char* part : {"org.freedesktop.systemd1", "/org/freedesktop/systemd1", "Get",
                             "org.freedesktop.systemd1.Manager", "SystemState"}) {
        EXPECT_THAT(messages[1], HasSubstr(part));
    }
}

TEST_F(MiniBusTest, GarbageIsNoAnswerAtOnce) {
    for (const auto behaviour : {Behaviour::ErrorReply, Behaviour::OtherType, Behaviour::HangsUp,
                                 Behaviour::Garbage, Behaviour::GarbageAtTheDoor}) {
        const auto start = std::chrono::steady_clock::now();
        EXPECT_EQ(statusWith(behaviour, "running"), 0u) << static_cast<int>(behaviour);
        EXPECT_LT(std::chrono::steady_clock::now() - start, patience / 2);
    }
}

TEST_F(MiniBusTest, LateAnswerCountsBeforeTheDeadlineAndNotAfterIt) {
    {
        const MiniBus bus(socket(), Behaviour::Answer, "degraded", 400ms);
        const auto start = std::chrono::steady_clock::now();
        EXPECT_EQ(status(), 21u);
        EXPECT_GE(std::chrono::steady_clock::now() - start, 395ms);
    }
    std::filesystem::remove(socket());
    const MiniBus bus(socket(), Behaviour::Answer, "degraded", patience);
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(status(SystemdBus::defaultDeadline), 0u);
    EXPECT_LT(std::chrono::steady_clock::now() - start, 3000ms);
}

TEST_F(MiniBusTest, BusThatDoesNotAnswerCostsTheDeadlineAndNoMore) {
    for (const auto behaviour :
         {Behaviour::SilentFromTheStart, Behaviour::SilentAfterGreeting, Behaviour::OtherReply}) {
        const MiniBus bus(socket(), behaviour);
        const auto start = std::chrono::steady_clock::now();
        EXPECT_EQ(status(SystemdBus::defaultDeadline), 0u);
        const auto time = std::chrono::steady_clock::now() - start;
        EXPECT_GE(time, 295ms);
        EXPECT_LT(time, 3000ms);
        std::filesystem::remove(socket());
    }
}

TEST_F(MiniBusTest, HostWithoutABusHasNoAnswerAtOnce) {
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(status(), 0u);
    tree.write("run/dbus/system_bus_socket", "a file is no socket");
    EXPECT_EQ(status(), 0u);
    EXPECT_LT(std::chrono::steady_clock::now() - start, patience / 2);
}

}  // namespace
