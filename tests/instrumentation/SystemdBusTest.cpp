#include "framework/instrumentation/Linux/Systemd.h"

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <thread>
#include <vector>

#include "tests/instrumentation/HostParts.h"
#include "tests/instrumentation/SystemdStandIn.h"

namespace {

using namespace std::chrono_literals;
using VA::Linux::SystemdBus;
using Behaviour = SystemdStandIn::Behaviour;

// Long enough for an answer on a machine under any load.
constexpr auto patience = 30s;

// The library stays loaded while a test runs; each test finds it as new.
class SystemdBusTest : public testing::Test {
  protected:
    SystemdBusTest() : library_(::dlopen(SYSTEMD_STAND_IN, RTLD_NOW | RTLD_LOCAL)) {
        using Control = SystemdStandIn*();
        control = reinterpret_cast<Control*>(::dlsym(library_, systemdStandInSymbol))();
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
    SystemdStandIn* control;
    SystemdBus bus{"/run/dbus/system_bus_socket", SYSTEMD_STAND_IN, {}, patience};
};

TEST_F(SystemdBusTest, TellsTheStateThatTheManagerTells) {
    for (const char* state :
         {"running", "degraded", "initializing", "a state of the future", "r"}) {
        control->state = state;
        EXPECT_EQ(bus.systemState(), state);
    }
}

TEST_F(SystemdBusTest, EveryStateReachesTheNodeStatus) {
    FixtureTree tree;
    tree.makeFolder("run/systemd/system");
    auto files = std::make_shared<VA::Linux::HostFiles>(tree.root());
    auto kernel = std::make_shared<FixedKernel>();
    auto manager = std::make_shared<SystemdBus>("/socket", SYSTEMD_STAND_IN, nullptr, patience);
    VA::LinuxHost host(VA::Linux::HostParts{files, kernel, manager});
    const std::pair<const char*, unsigned int> states[] = {
        {"running", 1},   {"initializing", 2}, {"starting", 2},
        {"degraded", 21}, {"maintenance", 8},  {"stopping", 16},
        {"offline", 12},  {"unknown", 0},      {"", 0}};
    for (const auto& [state, status] : states) {
        control->state = state;
        auto cursor = host.openCursor();
        cursor->select(VA::NodeLexicon::OperatingSystemNode);
        EXPECT_EQ(cursor->nodeStatus(), status) << state;
        EXPECT_EQ(cursor->nodeStatus(), status) << state;
    }
    EXPECT_EQ(control->questions, 9);
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
    SystemdBus unusual("/tmp/a b,c;d=%\xc3\xb6*", SYSTEMD_STAND_IN);
    unusual.systemState();
    EXPECT_STREQ(control->address, "unix:path=/tmp/a%20b%2cc%3bd%3d%25%c3%b6%2a");
}

TEST_F(SystemdBusTest, HasNoAnswerWhenTheReplyIsAnError) {
    control->behaviour = Behaviour::ErrorReply;
    EXPECT_EQ(bus.systemState(), std::nullopt);
}

TEST_F(SystemdBusTest, HasNoAnswerWhenAnyFunctionFails) {
    for (const char* function :
         {"sd_bus_new", "sd_bus_set_address", "sd_bus_set_bus_client", "sd_bus_start",
          "sd_bus_call_method_async", "sd_bus_process", "sd_bus_wait", "sd_bus_message_read"}) {
        control->failingFunction = function;
        EXPECT_LT(timed(bus), patience / 2) << function;
    }
    control->failingFunction = "";
    EXPECT_EQ(bus.systemState(), "running");
}

TEST_F(SystemdBusTest, HasNoAnswerWhenTheConnectionIsLostOrCannotBeWaitedFor) {
    for (const Behaviour behaviour : {Behaviour::LosesConnection, Behaviour::WaitFails}) {
        control->behaviour = behaviour;
        EXPECT_EQ(bus.systemState(), std::nullopt);
    }
}

TEST_F(SystemdBusTest, SilentBusCostsTheDeadlineAndNoMore) {
    control->behaviour = Behaviour::Silent;
    SystemdBus asInProduction("/socket", SYSTEMD_STAND_IN);
    const auto time = timed(asInProduction);
    EXPECT_GE(time, 295ms);
    EXPECT_LT(time, 3000ms);
    EXPECT_LE(control->longestWaitMicroseconds, 300000u);
}

TEST_F(SystemdBusTest, BusyBusThatNeverRepliesCostsTheDeadlineToo) {
    control->behaviour = Behaviour::Busy;
    SystemdBus hurried("/socket", SYSTEMD_STAND_IN, {}, 50ms);
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

TEST_F(SystemdBusTest, HasNoAnswerWithoutTheLibrary) {
    SystemdBus missing("/socket", "libsystemd-is-not-here.so.0", {}, patience);
    EXPECT_LT(timed(missing), patience / 2);
}

TEST_F(SystemdBusTest, HasNoAnswerFromALibraryWithoutTheFunctions) {
    SystemdBus other("/socket", "libm.so.6", {}, patience);
    EXPECT_LT(timed(other), patience / 2);
}

TEST_F(SystemdBusTest, HasNoAnswerWhenAnyOneFunctionIsMissing) {
    std::vector<std::string> symbols;
    const auto record = [&](void* library, const char* symbol) {
        symbols.push_back(symbol);
        return ::dlsym(library, symbol);
    };
    EXPECT_EQ(SystemdBus("/socket", SYSTEMD_STAND_IN, record, patience).systemState(), "running");
    EXPECT_EQ(symbols.size(), 10u);
    for (const std::string& missing : symbols) {
        const auto hide = [&](void* library, const char* symbol) {
            return symbol == missing ? nullptr : ::dlsym(library, symbol);
        };
        SystemdBus incomplete("/socket", SYSTEMD_STAND_IN, hide);
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
        void* handle = ::dlopen(SYSTEMD_STAND_IN, RTLD_NOW | RTLD_NOLOAD);
        if (handle) ::dlclose(handle);
        return handle != nullptr;
    };
    {
        SystemdBus bus("/socket", SYSTEMD_STAND_IN, {}, patience);
        EXPECT_FALSE(loaded());
        EXPECT_EQ(bus.systemState(), "running");
        EXPECT_EQ(bus.systemState(), "running");
        EXPECT_TRUE(loaded());
    }
    EXPECT_FALSE(loaded());
}

}  // namespace
