// Systemd's state through functions that stand in for libsystemd's: each of them may fail, and
// none of what happens may cost more than the deadline.
#include "framework/instrumentation/Linux/Systemd.h"

#include <dlfcn.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <chrono>
#include <cstdarg>
#include <map>
#include <mutex>
#include <thread>
#include <vector>

namespace {

using namespace std::chrono_literals;
using VA::Linux::SystemdBus;
using Clock = std::chrono::steady_clock;

// Long enough for an answer on a machine under any load.
constexpr auto longTimeout = 30s;

TEST(NodeStatus, IsThatOfTheStateAndOfAnyOtherWordNone) {
    const std::pair<const char*, unsigned int> rows[] = {
        {"running", 1},   {"initializing", 2}, {"starting", 2},  {"degraded", 21},
        {"stopping", 16}, {"maintenance", 8},  {"offline", 12},  {"unknown", 0},
        {"", 0},          {"RUNNING", 0},      {"running\n", 0}, {"running ", 0},
        {"run", 0},       {"degraded2", 0}};
    for (const auto& [state, status] : rows)
        EXPECT_EQ(VA::Linux::nodeStatusOf(state), status) << state;
}

/// What the functions are to do, and what was done with them, by any number of threads.
struct FakeSystemd {
    enum class Behaviour {
        Answer,           ///< replies with `state` after a few rounds
        ErrorReply,       ///< replies with an error instead of a value
        Silent,           ///< accepts the question and never replies
        Busy,             ///< has something to do all the time, and never replies
        Interrupted,      ///< like Answer, but each wait is ended by a signal first
        LosesConnection,  ///< fails while the question is under way
        WaitFails,        ///< cannot wait
    };

    int resultOf(const char* function) const { return failing == function ? -ENOTCONN : 1; }
    bool answers() const {
        return behaviour == Behaviour::Answer || behaviour == Behaviour::ErrorReply ||
               behaviour == Behaviour::Interrupted;
    }

    Behaviour behaviour = Behaviour::Answer;
    std::string state = "running";
    std::string failing;  ///< the function that fails when it is called
    std::mutex mutex;
    std::string address, question;
    std::atomic<int> connections{0}, closed{0}, released{0}, questions{0}, busClients{0};
    std::atomic<std::uint64_t> longestWait{0};
};

using Behaviour = FakeSystemd::Behaviour;

FakeSystemd* fake = nullptr;  // that of the test that runs

struct FakeMessage {
    bool isError;
};

using Handler = int (*)(FakeMessage*, void*, void*);

struct FakeBus {
    Handler handler = nullptr;
    void* userData = nullptr;
    int rounds = 0;
    int waits = 0;
    /// When to fail what would otherwise wait for ever.
    const Clock::time_point end = Clock::now() + longTimeout / 2;
};

int createBus(FakeBus** bus) {
    if (fake->resultOf("sd_bus_new") < 0) return -ENOTCONN;
    ++fake->connections;
    *bus = new FakeBus;
    return 0;
}

int setAddress(FakeBus*, const char* address) {
    const std::lock_guard<std::mutex> lock(fake->mutex);
    fake->address = address;
    return fake->resultOf("sd_bus_set_address");
}

int setBusClient(FakeBus*, int on) {
    fake->busClients += on;
    return fake->resultOf("sd_bus_set_bus_client");
}

int startBus(FakeBus*) {
    return fake->resultOf("sd_bus_start");
}

int callMethodAsync(FakeBus* bus, void** slot, const char* destination, const char* path,
                    const char* interface, const char* member, Handler handler, void* userData,
                    const char* types, ...) {
    if (slot || types != std::string("ss")) return -EINVAL;
    std::va_list arguments;
    va_start(arguments, types);
    const std::string first = va_arg(arguments, const char*);
    const std::string second = va_arg(arguments, const char*);
    va_end(arguments);
    const std::lock_guard<std::mutex> lock(fake->mutex);
    fake->question = std::string(destination) + ' ' + path + ' ' + interface + ' ' + member + '(' +
                     first + ", " + second + ')';
    ++fake->questions;
    bus->handler = handler;
    bus->userData = userData;
    return fake->resultOf("sd_bus_call_method_async");
}

int process(FakeBus* bus, FakeMessage**) {
    if (fake->resultOf("sd_bus_process") < 0 || Clock::now() > bus->end) return -ENOTCONN;
    if (fake->behaviour == Behaviour::Busy) return 1;
    // As the real one: some rounds to connect, each of which ends with nothing to do.
    if (++bus->rounds % 2 == 1) return 1;
    if (bus->rounds < 6) return 0;
    if (fake->behaviour == Behaviour::LosesConnection) return -ECONNRESET;
    if (!fake->answers()) return 0;
    FakeMessage reply{fake->behaviour == Behaviour::ErrorReply};
    bus->handler(&reply, bus->userData, nullptr);
    return 1;
}

int waitForBus(FakeBus* bus, std::uint64_t microseconds) {
    auto longest = fake->longestWait.load();
    while (microseconds > longest &&
           !fake->longestWait.compare_exchange_weak(longest, microseconds)) {
    }
    if (fake->resultOf("sd_bus_wait") < 0) return -ENOTCONN;
    if (fake->behaviour == Behaviour::WaitFails) return -EINVAL;
    if (fake->behaviour == Behaviour::Interrupted && ++bus->waits < 4) return -EINTR;
    const bool comesBack = fake->answers() || bus->rounds < 6;
    const std::uint64_t most = comesBack ? 1000 : 4000000;
    ::usleep(static_cast<useconds_t>(std::min(microseconds, most)));
    return comesBack ? 1 : 0;
}

int readMessage(FakeMessage* message, const char* types, ...) {
    if (fake->resultOf("sd_bus_message_read") < 0) return -ENOTCONN;
    if (message->isError || types != std::string("v")) return -ENXIO;
    std::va_list arguments;
    va_start(arguments, types);
    const std::string contents = va_arg(arguments, const char*);
    const char** const text = va_arg(arguments, const char**);
    va_end(arguments);
    if (contents != "s") return -ENXIO;
    *text = fake->state.c_str();
    return 1;
}

void closeBus(FakeBus*) {
    ++fake->closed;
}

FakeBus* unrefBus(FakeBus* bus) {
    ++fake->released;
    delete bus;
    return nullptr;
}

template <class Function>
void* address(Function function) {
    return reinterpret_cast<void*>(function);
}

void* fakeFunction(void*, const char* symbol) {
    static const std::map<std::string, void*> functions{
        {"sd_bus_new", address(createBus)},
        {"sd_bus_set_address", address(setAddress)},
        {"sd_bus_set_bus_client", address(setBusClient)},
        {"sd_bus_start", address(startBus)},
        {"sd_bus_call_method_async", address(callMethodAsync)},
        {"sd_bus_process", address(process)},
        {"sd_bus_wait", address(waitForBus)},
        {"sd_bus_message_read", address(readMessage)},
        {"sd_bus_close", address(closeBus)},
        {"sd_bus_unref", address(unrefBus)},
    };
    const auto found = functions.find(symbol);
    return found == functions.end() ? nullptr : found->second;
}

constexpr const char* anyLibrary = "libm.so.6";

class SystemdBusTest : public testing::Test {
  protected:
    SystemdBusTest() { fake = &control; }
    ~SystemdBusTest() override {
        EXPECT_EQ(control.closed, control.connections);
        EXPECT_EQ(control.released, control.connections);
    }

    static std::chrono::milliseconds timed(SystemdBus& bus) {
        const auto start = Clock::now();
        EXPECT_EQ(bus.systemState(), std::nullopt);
        return std::chrono::duration_cast<std::chrono::milliseconds>(Clock::now() - start);
    }

    FakeSystemd control;
    SystemdBus bus{"/run/dbus/system_bus_socket", anyLibrary, fakeFunction, longTimeout};
};

TEST_F(SystemdBusTest, TellsTheStateThatTheManagerTellsUpTo31Bytes) {
    for (const std::string& state : {std::string("running"), std::string("a state of the future"),
                                     std::string("r"), std::string(5000, 's')}) {
        control.state = state;
        EXPECT_EQ(bus.systemState(), state.substr(0, 31));
    }
}

TEST_F(SystemdBusTest, AsksOneQuestionAsAClientOfTheSystemBus) {
    bus.systemState();
    EXPECT_EQ(control.address, "unix:path=/run/dbus/system_bus_socket");
    EXPECT_EQ(control.question,
              "org.freedesktop.systemd1 /org/freedesktop/systemd1 "
              "org.freedesktop.DBus.Properties Get(org.freedesktop.systemd1.Manager, "
              "SystemState)");
    EXPECT_EQ(control.questions, 1);
    EXPECT_EQ(control.busClients, 1);
    EXPECT_EQ(control.connections, 1);
}

TEST_F(SystemdBusTest, WritesUnusualBytesOfThePathInHexadecimal) {
    SystemdBus("/tmp/a b,c;d=%\xc3\xb6*", anyLibrary, fakeFunction).systemState();
    EXPECT_EQ(control.address, "unix:path=/tmp/a%20b%2cc%3bd%3d%25%c3%b6%2a");
}

TEST_F(SystemdBusTest, HasNoAnswerWhenAnyFunctionFails) {
    for (const char* function :
         {"sd_bus_new", "sd_bus_set_address", "sd_bus_set_bus_client", "sd_bus_start",
          "sd_bus_call_method_async", "sd_bus_process", "sd_bus_wait", "sd_bus_message_read"}) {
        control.failing = function;
        EXPECT_LT(timed(bus), longTimeout / 2) << function;
    }
    control.failing = "";
    EXPECT_EQ(bus.systemState(), "running");
}

TEST_F(SystemdBusTest, HasNoAnswerWhenTheReplyIsAnErrorOrTheConnectionFails) {
    for (const Behaviour behaviour :
         {Behaviour::ErrorReply, Behaviour::LosesConnection, Behaviour::WaitFails}) {
        control.behaviour = behaviour;
        EXPECT_LT(timed(bus), longTimeout / 2);
    }
}

TEST_F(SystemdBusTest, BusThatNeverRepliesCostsTheDeadlineAndNoMore) {
    for (const Behaviour behaviour : {Behaviour::Silent, Behaviour::Busy}) {
        control.behaviour = behaviour;
        SystemdBus asInProduction("/socket", anyLibrary, fakeFunction);
        const auto time = timed(asInProduction);
        EXPECT_GE(time, 295ms);
        EXPECT_LT(time, 3000ms);
        EXPECT_LE(control.longestWait, 300000u);
    }
}

TEST_F(SystemdBusTest, WaitsOnAfterASignal) {
    control.behaviour = Behaviour::Interrupted;
    EXPECT_EQ(bus.systemState(), "running");
}

TEST_F(SystemdBusTest, HasNoAnswerWithoutTheLibraryOrFromOneWithoutTheFunctions) {
    for (const char* library : {"libsystemd-is-not-here.so.0", anyLibrary}) {
        SystemdBus other("/socket", library, {}, longTimeout);
        EXPECT_LT(timed(other), longTimeout / 2) << library;
    }
}

TEST_F(SystemdBusTest, HasNoAnswerWhenAnyOneFunctionIsMissing) {
    std::vector<std::string> symbols;
    const auto record = [&](void* library, const char* symbol) {
        symbols.push_back(symbol);
        return fakeFunction(library, symbol);
    };
    EXPECT_EQ(SystemdBus("/socket", anyLibrary, record, longTimeout).systemState(), "running");
    EXPECT_EQ(symbols.size(), 10u);
    for (const std::string& missing : symbols) {
        const auto hide = [&](void* library, const char* symbol) {
            return symbol == missing ? nullptr : fakeFunction(library, symbol);
        };
        SystemdBus incomplete("/socket", anyLibrary, hide);
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
    EXPECT_EQ(control.questions, 160);
}

TEST_F(SystemdBusTest, LibraryIsLoadedWhenFirstNeededAndClosedWithTheObject) {
    constexpr const char* unused = "libBrokenLocale.so.1";  // of the C library; nobody needs it
    const auto loaded = [] {
        void* handle = ::dlopen(unused, RTLD_NOW | RTLD_NOLOAD);
        if (handle) ::dlclose(handle);
        return handle != nullptr;
    };
    {
        SystemdBus other("/socket", unused, fakeFunction, longTimeout);
        EXPECT_FALSE(loaded());
        EXPECT_EQ(other.systemState(), "running");
        EXPECT_EQ(other.systemState(), "running");
        EXPECT_TRUE(loaded());
    }
    EXPECT_FALSE(loaded());
}

}  // namespace
