#include "tests/instrumentation/FakeSystemd.h"

#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <mutex>

struct FakeMessage {
    bool isError;
};

using Handler = int (*)(FakeMessage*, void*, void*);

struct FakeBus {
    Handler handler = nullptr;
    void* userData = nullptr;
    int rounds = 0;
    int waits = 0;
};

namespace {

FakeSystemd control;
std::mutex textMutex;

using Behaviour = FakeSystemd::Behaviour;

bool fails(const char* function) {
    return std::strcmp(control.failingFunction, function) == 0;
}

bool answers() {
    return control.behaviour == Behaviour::Answer || control.behaviour == Behaviour::ErrorReply ||
           control.behaviour == Behaviour::Interrupted;
}

}  // namespace

extern "C" {

FakeSystemd* fake_systemd() {
    return &control;
}

int sd_bus_new(FakeBus** bus) {
    if (fails("sd_bus_new")) return -ENOTCONN;
    ++control.connections;
    *bus = new FakeBus;
    return 0;
}

int sd_bus_set_address(FakeBus*, const char* address) {
    const std::lock_guard<std::mutex> lock(textMutex);
    std::snprintf(control.address, sizeof control.address, "%s", address);
    return fails("sd_bus_set_address") ? -ENOTCONN : 0;
}

int sd_bus_set_bus_client(FakeBus*, int on) {
    control.busClients += on;
    return fails("sd_bus_set_bus_client") ? -ENOTCONN : 0;
}

int sd_bus_start(FakeBus*) {
    return fails("sd_bus_start") ? -ENOTCONN : 1;
}

int sd_bus_call_method_async(FakeBus* bus, void** slot, const char* destination, const char* path,
                             const char* interface, const char* member, Handler handler,
                             void* userData, const char* types, ...) {
    if (slot || std::strcmp(types, "ss") != 0) return -EINVAL;
    std::va_list arguments;
    va_start(arguments, types);
    const char* first = va_arg(arguments, const char*);
    const char* second = va_arg(arguments, const char*);
    va_end(arguments);
    const std::lock_guard<std::mutex> lock(textMutex);
    std::snprintf(control.question, sizeof control.question, "%s %s %s %s(%s, %s)", destination,
                  path, interface, member, first, second);
    ++control.questions;
    bus->handler = handler;
    bus->userData = userData;
    return fails("sd_bus_call_method_async") ? -ENOTCONN : 1;
}

int sd_bus_process(FakeBus* bus, FakeMessage**) {
    if (fails("sd_bus_process")) return -ENOTCONN;
    if (control.behaviour == Behaviour::Busy) return 1;
    // As the real one: some rounds to connect, each of which ends with nothing to do.
    if (++bus->rounds % 2 == 1) return 1;
    if (bus->rounds < 6) return 0;
    if (control.behaviour == Behaviour::LosesConnection) return -ECONNRESET;
    if (!answers()) return 0;
    FakeMessage reply{control.behaviour == Behaviour::ErrorReply};
    bus->handler(&reply, bus->userData, nullptr);
    return 1;
}

int sd_bus_wait(FakeBus* bus, std::uint64_t microseconds) {
    auto longest = control.longestWaitMicroseconds.load();
    while (microseconds > longest &&
           !control.longestWaitMicroseconds.compare_exchange_weak(longest, microseconds)) {
    }
    if (fails("sd_bus_wait")) return -ENOTCONN;
    if (control.behaviour == Behaviour::WaitFails) return -EINVAL;
    if (control.behaviour == Behaviour::Interrupted && ++bus->waits < 4) return -EINTR;
    const bool comesBack = answers() || bus->rounds < 6;
    ::usleep(static_cast<useconds_t>(comesBack ? std::min<std::uint64_t>(microseconds, 1000)
                                               : microseconds));
    return comesBack ? 1 : 0;
}

int sd_bus_message_read(FakeMessage* message, const char* types, ...) {
    if (fails("sd_bus_message_read")) return -ENOTCONN;
    if (message->isError || std::strcmp(types, "v") != 0) return -ENXIO;
    std::va_list arguments;
    va_start(arguments, types);
    const char* contents = va_arg(arguments, const char*);
    const char** text = va_arg(arguments, const char**);
    va_end(arguments);
    if (std::strcmp(contents, "s") != 0) return -ENXIO;
    *text = control.state;
    return 1;
}

void sd_bus_close(FakeBus*) {
    ++control.closed;
}

FakeBus* sd_bus_unref(FakeBus* bus) {
    ++control.released;
    delete bus;
    return nullptr;
}

}  // extern "C"
