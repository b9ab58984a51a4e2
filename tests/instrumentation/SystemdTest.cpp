// Systemd's state: through a fake libsystemd, and through the host's own, which talks to a bus of
// the test.
#include "framework/instrumentation/Linux/Systemd.h"

#include <dlfcn.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <thread>
#include <vector>

#include "support/TestHost.h"
#include "tests/instrumentation/FakeDBus.h"
#include "tests/instrumentation/FakeSystemd.h"

namespace {

using namespace std::chrono_literals;
using testing::HasSubstr;
using VA::Linux::SystemdBus;
using Behaviour = FakeSystemd::Behaviour;

// Long enough for an answer on a machine under any load.
constexpr auto longTimeout = 30s;

const std::pair<std::string, unsigned int> states[] = {
    {"running", 1},     {"initializing", 2}, {"starting", 2}, {"degraded", 21}, {"stopping", 16},
    {"maintenance", 8}, {"offline", 12},     {"unknown", 0},  {"", 0},          {"RUNNING", 0},
    {"running\n", 0},   {"running ", 0},     {"run", 0},      {"degraded2", 0}};

TEST(NodeStatus, IsThatOfTheStateAndOfAnyOtherWordNone) {
    for (const auto& [state, status] : states)
        EXPECT_EQ(VA::Linux::nodeStatusOf(state), status) << state;
}

// The library stays loaded while a test runs; each test finds it as new.
class SystemdBusTest : public testing::Test {
  protected:
    SystemdBusTest() : library_(::dlopen(FAKE_SYSTEMD, RTLD_NOW | RTLD_LOCAL)) {
        using Control = FakeSystemd*();
        control = reinterpret_cast<Control*>(::dlsym(library_, fakeSystemdSymbol))();
    }
    ~SystemdBusTest() override {
        EXPECT_EQ(control->closed, control->connections);
        EXPECT_EQ(control->released, control->connections);
        ::dlclose(library_);
    }

    static std::chrono::milliseconds timed(SystemdBus& bus) {
        const auto start = std::chrono::steady_clock::now();
        EXPECT_EQ(bus.systemState(), std::nullopt);
        return std::chrono::duration_cast<std::chrono::milliseconds>(
            std::chrono::steady_clock::now() - start);
    }

    void* library_;
    FakeSystemd* control;
    SystemdBus bus{"/run/dbus/system_bus_socket", FAKE_SYSTEMD, {}, longTimeout};
};

TEST_F(SystemdBusTest, TellsTheStateThatTheManagerTells) {
    for (const char* state :
         {"running", "degraded", "initializing", "a state of the future", "r"}) {
        control->state = state;
        EXPECT_EQ(bus.systemState(), state);
    }
}

TEST_F(SystemdBusTest, AsksOneQuestionAsAClientOfTheSystemBus) {
    bus.systemState();
    EXPECT_STREQ(control->address, "unix:path=/run/dbus/system_bus_socket");
    EXPECT_STREQ(control->question,
                 "org.freedesktop.systemd1 /org/freedesktop/systemd1 "
                 "org.freedesktop.DBus.Properties Get(org.freedesktop.systemd1.Manager, "
                 "SystemState)");
    EXPECT_EQ(control->questions, 1);
    EXPECT_EQ(control->busClients, 1);
    EXPECT_EQ(control->connections, 1);
}

TEST_F(SystemdBusTest, WritesUnusualBytesOfThePathInHexadecimal) {
    SystemdBus unusual("/tmp/a b,c;d=%\xc3\xb6*", FAKE_SYSTEMD);
    unusual.systemState();
    EXPECT_STREQ(control->address, "unix:path=/tmp/a%20b%2cc%3bd%3d%25%c3%b6%2a");
}

TEST_F(SystemdBusTest, HasNoAnswerWhenAnyFunctionFails) {
    for (const char* function :
         {"sd_bus_new", "sd_bus_set_address", "sd_bus_set_bus_client", "sd_bus_start",
          "sd_bus_call_method_async", "sd_bus_process", "sd_bus_wait", "sd_bus_message_read"}) {
        control->failingFunction = function;
        EXPECT_LT(timed(bus), longTimeout / 2) << function;
    }
    control->failingFunction = "";
    EXPECT_EQ(bus.systemState(), "running");
}

TEST_F(SystemdBusTest, HasNoAnswerWhenTheReplyIsAnErrorOrTheConnectionFails) {
    for (const Behaviour behaviour :
         {Behaviour::ErrorReply, Behaviour::LosesConnection, Behaviour::WaitFails}) {
        control->behaviour = behaviour;
        EXPECT_EQ(bus.systemState(), std::nullopt);
    }
}

TEST_F(SystemdBusTest, SilentBusCostsTheDeadlineAndNoMore) {
    control->behaviour = Behaviour::Silent;
    SystemdBus asInProduction("/socket", FAKE_SYSTEMD);
    const auto time = timed(asInProduction);
    EXPECT_GE(time, 295ms);
    EXPECT_LT(time, 3000ms);
    EXPECT_LE(control->longestWaitMicroseconds, 300000u);
}

TEST_F(SystemdBusTest, BusyBusThatNeverRepliesCostsTheDeadlineToo) {
    control->behaviour = Behaviour::Busy;
    SystemdBus hurried("/socket", FAKE_SYSTEMD, {}, 50ms);
    const auto time = timed(hurried);
    EXPECT_GE(time, 50ms);
    EXPECT_LT(time, 3000ms);
}

TEST_F(SystemdBusTest, WaitsOnAfterASignal) {
    control->behaviour = Behaviour::Interrupted;
    EXPECT_EQ(bus.systemState(), "running");
}

TEST_F(SystemdBusTest, StateOfAnyLengthIsSafe) {
    const std::string state(5000, 's');
    control->state = state.c_str();
    const auto answer = bus.systemState();
    EXPECT_EQ(answer, std::string(31, 's'));
}

TEST_F(SystemdBusTest, HasNoAnswerWithoutTheLibraryOrFromOneWithoutTheFunctions) {
    for (const char* library : {"libsystemd-is-not-here.so.0", "libm.so.6"}) {
        SystemdBus other("/socket", library, {}, longTimeout);
        EXPECT_LT(timed(other), longTimeout / 2) << library;
    }
}

TEST_F(SystemdBusTest, HasNoAnswerWhenAnyOneFunctionIsMissing) {
    std::vector<std::string> symbols;
    const auto record = [&](void* library, const char* symbol) {
        symbols.push_back(symbol);
        return ::dlsym(library, symbol);
    };
    EXPECT_EQ(SystemdBus("/socket", FAKE_SYSTEMD, record, longTimeout).systemState(), "running");
    EXPECT_EQ(symbols.size(), 10u);
    for (const std::string& missing : symbols) {
        const auto hide = [&](void* library, const char* symbol) {
            return symbol == missing ? nullptr : ::dlsym(library, symbol);
        };
        SystemdBus incomplete("/socket", FAKE_SYSTEMD, hide);
        EXPECT_EQ(incomplete.systemState(), std::nullopt) << missing;
    }
}

TEST_F(SystemdBusTest, AnswersManyThreadsAtOnce) {
    std::vector<std::thread> threads;
    for (int i = 0; i < 8; ++i) {
        threads.emplace_back([&] {
            for (int round = 0; round < 20; ++round) EXPECT_EQ(bus.systemState(), "running");
        });
    }
    for (auto& thread : threads) thread.join();
    EXPECT_EQ(control->questions, 160);
}

TEST(SystemdBusLibrary, IsLoadedWhenFirstNeededAndClosedWithTheObject) {
    const auto loaded = [] {
        void* handle = ::dlopen(FAKE_SYSTEMD, RTLD_NOW | RTLD_NOLOAD);
        if (handle) ::dlclose(handle);
        return handle != nullptr;
    };
    {
        SystemdBus bus("/socket", FAKE_SYSTEMD, {}, longTimeout);
        EXPECT_FALSE(loaded());
        EXPECT_EQ(bus.systemState(), "running");
        EXPECT_EQ(bus.systemState(), "running");
        EXPECT_TRUE(loaded());
    }
    EXPECT_FALSE(loaded());
}

// The host's own libsystemd, where there is one, on a bus of the test

using Reply = FakeDBus::Behaviour;

class SystemBusTest : public testing::Test {
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
    unsigned int status(std::chrono::milliseconds deadline = longTimeout) const {
        auto systemd = std::make_shared<SystemdBus>(socket(), SystemdBus::defaultLibrary,
                                                    SystemdBus::Lookup(), deadline);
        VA::LinuxHost host(VA::Linux::HostParts{std::make_shared<VA::Linux::HostFiles>(tree.root()),
                                                std::make_shared<VA::Linux::Kernel>(),
                                                std::move(systemd)});
        const auto cursor = host.openCursor();
        cursor->select(VA::NodeLexicon::OperatingSystemNode);
        return cursor->nodeStatus();
    }

    unsigned int statusWith(Reply reply, const std::string& state) const {
        const FakeDBus bus(socket(), reply, state);
        const unsigned int found = status();
        std::filesystem::remove(socket());
        return found;
    }

    FixtureTree tree;

  private:
    void* library_ = nullptr;
};

TEST_F(SystemBusTest, EachStateOfTheManagerHasItsCodeAndAnyOtherWordHasNone) {
    for (const auto& [state, code] : states) {
        EXPECT_EQ(statusWith(Reply::Answer, state), code) << state;
    }
    // What is read of a word ends after 31 bytes: neither more nor less may be taken for a state.
    EXPECT_EQ(statusWith(Reply::Answer, std::string(5000, 'r')), 0u);
    EXPECT_EQ(statusWith(Reply::Answer, "running" + std::string(5000, ' ')), 0u);
}

TEST_F(SystemBusTest, BusOfALinuxHostIsTheOneUnderItsRoot) {
    FakeDBus bus(socket(), Reply::Answer, "stopping");
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

TEST_F(SystemBusTest, ClientGreetsAsksOnePropertyAndLeaves) {
    FakeDBus bus(socket(), Reply::Answer, "running");
    EXPECT_EQ(status(), 1u);
    const auto& messages = bus.stop();
    ASSERT_EQ(messages.size(), 2u);
    EXPECT_THAT(messages[0], HasSubstr("Hello"));
    for (const char* part : {"org.freedesktop.systemd1", "/org/freedesktop/systemd1", "Get",
                             "org.freedesktop.systemd1.Manager", "SystemState"}) {
        EXPECT_THAT(messages[1], HasSubstr(part));
    }
}

TEST_F(SystemBusTest, GarbageIsNoAnswerAtOnce) {
    for (const auto reply : {Reply::ErrorReply, Reply::OtherType, Reply::HangsUp, Reply::Garbage,
                             Reply::GarbageAtTheDoor}) {
        const auto start = std::chrono::steady_clock::now();
        EXPECT_EQ(statusWith(reply, "running"), 0u) << static_cast<int>(reply);
        EXPECT_LT(std::chrono::steady_clock::now() - start, longTimeout / 2);
    }
}

TEST_F(SystemBusTest, LateAnswerCountsBeforeTheDeadlineAndNotAfterIt) {
    {
        const FakeDBus bus(socket(), Reply::Answer, "degraded", 400ms);
        const auto start = std::chrono::steady_clock::now();
        EXPECT_EQ(status(), 21u);
        EXPECT_GE(std::chrono::steady_clock::now() - start, 395ms);
    }
    std::filesystem::remove(socket());
    const FakeDBus bus(socket(), Reply::Answer, "degraded", longTimeout);
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(status(SystemdBus::defaultDeadline), 0u);
    EXPECT_LT(std::chrono::steady_clock::now() - start, 3000ms);
}

TEST_F(SystemBusTest, BusThatDoesNotAnswerCostsTheDeadlineAndNoMore) {
    for (const auto reply :
         {Reply::SilentFromTheStart, Reply::SilentAfterGreeting, Reply::OtherReply}) {
        const FakeDBus bus(socket(), reply);
        const auto start = std::chrono::steady_clock::now();
        EXPECT_EQ(status(SystemdBus::defaultDeadline), 0u);
        const auto time = std::chrono::steady_clock::now() - start;
        EXPECT_GE(time, 295ms);
        EXPECT_LT(time, 3000ms);
        std::filesystem::remove(socket());
    }
}

TEST_F(SystemBusTest, HostWithoutABusHasNoAnswerAtOnce) {
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(status(), 0u);
    tree.write("run/dbus/system_bus_socket", "a file is no socket");
    EXPECT_EQ(status(), 0u);
    EXPECT_LT(std::chrono::steady_clock::now() - start, longTimeout / 2);
}

}  // namespace
