// The host's state is one property on the system bus. Asked through libsystemd, opened when first
// needed: a host without it, or a container, works without it, and nothing is linked against it.
#include "Systemd.h"

#include <dlfcn.h>

#include <cerrno>
#include <cstdint>
#include <cstring>
#include <string_view>
#include <type_traits>
#include <utility>

namespace VA::Linux {

struct SdBus;
struct SdMessage;
struct SdSlot;
struct SdError;

// The functions of libsystemd that are called, in its own order of arguments. Negative results are
// errors, as negated errno values.
struct SdBusFunctions {
    using Handler = int (*)(SdMessage*, void*, SdError*);

    int (*create)(SdBus**);
    int (*setAddress)(SdBus*, const char*);
    int (*setBusClient)(SdBus*, int);
    int (*start)(SdBus*);
    int (*callMethodAsync)(SdBus*, SdSlot**, const char* destination, const char* path,
                           const char* interface, const char* member, Handler handler,
                           void* userData, const char* types, ...);
    int (*process)(SdBus*, SdMessage**);
    int (*wait)(SdBus*, std::uint64_t microseconds);
    int (*readMessage)(SdMessage*, const char* types, ...);
    void (*close)(SdBus*);
    SdBus* (*unref)(SdBus*);
};

namespace {

using Clock = std::chrono::steady_clock;

// The path of a socket as a bus address, where bytes other than these are written in hexadecimal.
std::string addressOf(std::string_view socket) {
    constexpr std::string_view plain =
        "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789-_/.";
    constexpr std::string_view digits = "0123456789abcdef";
    std::string address = "unix:path=";
    for (const char c : socket) {
        if (plain.find(c) != std::string_view::npos) {
            address += c;
        } else {
            const auto byte = static_cast<unsigned char>(c);
            address += {'%', digits[byte / 16u], digits[byte % 16u]};
        }
    }
    return address;
}

// What the reply is written to: no exception may pass through the library's frames.
struct Answer {
    const SdBusFunctions* functions;
    bool arrived = false;
    char state[32] = "";
};

int takeReply(SdMessage* reply, void* userData, SdError*) noexcept {
    auto& answer = *static_cast<Answer*>(userData);
    answer.arrived = true;
    const char* state = nullptr;
    // An error reply holds no variant, so that reading one fails.
    if (answer.functions->readMessage(reply, "v", "s", &state) < 0 || !state) return 0;
    std::strncpy(answer.state, state, sizeof answer.state - 1);
    return 0;
}

class Connection {
  public:
    explicit Connection(const SdBusFunctions& functions) : functions_(functions) {
        if (functions_.create(&bus_) < 0) bus_ = nullptr;
    }
    ~Connection() {
        if (!bus_) return;
        functions_.close(bus_);
        functions_.unref(bus_);
    }
    Connection(const Connection&) = delete;
    Connection& operator=(const Connection&) = delete;

    // Begins to connect, without waiting for anything.
    bool start(const std::string& address) {
        return bus_ && functions_.setAddress(bus_, address.c_str()) >= 0 &&
               functions_.setBusClient(bus_, 1) >= 0 && functions_.start(bus_) >= 0;
    }

    // Queues the question behind the greeting of the bus.
    bool ask(Answer& answer) {
        return functions_.callMethodAsync(
                   bus_, nullptr, "org.freedesktop.systemd1", "/org/freedesktop/systemd1",
                   "org.freedesktop.DBus.Properties", "Get", takeReply, &answer, "ss",
                   "org.freedesktop.systemd1.Manager", "SystemState") >= 0;
    }

    // Runs the connection until the answer is there, it fails, or the time is over.
    void runUntilAnswered(const Answer& answer, Clock::time_point end) {
        while (!answer.arrived) {
            const auto left =
                std::chrono::duration_cast<std::chrono::microseconds>(end - Clock::now()).count();
            if (left <= 0) return;
            const int progress = functions_.process(bus_, nullptr);
            if (progress < 0) return;
            if (progress > 0) continue;
            const int waited = functions_.wait(bus_, static_cast<std::uint64_t>(left));
            if (waited < 0 && waited != -EINTR) return;
        }
    }

  private:
    const SdBusFunctions& functions_;
    SdBus* bus_ = nullptr;
};

}  // namespace

SystemdBus::SystemdBus(const std::string& socket, std::string library, Lookup lookup,
                       std::chrono::milliseconds deadline)
    : address_(addressOf(socket)),
      library_(std::move(library)),
      lookup_(lookup ? std::move(lookup) : Lookup(::dlsym)),
      deadline_(deadline) {}

SystemdBus::~SystemdBus() {
    if (handle_) ::dlclose(handle_);
}

// A library that is missing is looked for again next time: it may be installed later.
void* SystemdBus::openedLibrary() {
    const std::lock_guard<std::mutex> lock(mutex_);
    if (!handle_) handle_ = ::dlopen(library_.c_str(), RTLD_NOW | RTLD_LOCAL);
    return handle_;
}

bool SystemdBus::bindFunctions(SdBusFunctions& functions) {
    void* const library = openedLibrary();
    if (!library) return false;
    const auto bind = [&](auto& function, const char* name) {
        function = reinterpret_cast<std::decay_t<decltype(function)>>(lookup_(library, name));
        return function != nullptr;
    };
    return bind(functions.create, "sd_bus_new") &&
           bind(functions.setAddress, "sd_bus_set_address") &&
           bind(functions.setBusClient, "sd_bus_set_bus_client") &&
           bind(functions.start, "sd_bus_start") &&
           bind(functions.callMethodAsync, "sd_bus_call_method_async") &&
           bind(functions.process, "sd_bus_process") && bind(functions.wait, "sd_bus_wait") &&
           bind(functions.readMessage, "sd_bus_message_read") &&
           bind(functions.close, "sd_bus_close") && bind(functions.unref, "sd_bus_unref");
}

// The calls of libsystemd that wait for an answer also wait, for up to 90 seconds, until the bus
// has let the client in. So nothing here waits inside such a call: the question is queued while the
// connection is being made, and a loop with one deadline drives both.
std::optional<std::string> SystemdBus::systemState() {
    const auto end = Clock::now() + deadline_;
    SdBusFunctions functions{};
    if (!bindFunctions(functions)) return std::nullopt;
    Answer answer{&functions};
    {
        Connection connection(functions);
        if (!connection.start(address_) || !connection.ask(answer)) return std::nullopt;
        connection.runUntilAnswered(answer, end);
    }
    if (answer.state[0] == '\0') return std::nullopt;
    return answer.state;
}

unsigned int nodeStatusOf(std::string_view systemState) {
    struct Row {
        std::string_view state;
        unsigned int status;
    };
    constexpr Row rows[] = {
        {"running", 1},     {"initializing", 2}, {"starting", 2}, {"degraded", 21},
        {"maintenance", 8}, {"stopping", 16},    {"offline", 12},
    };
    for (const Row& row : rows) {
        if (row.state == systemState) return row.status;
    }
    return 0;
}

unsigned int readNodeStatus(const HostFiles& files, SystemManager& manager) {
    // Where no systemd runs nobody knows better than this code, which is running.
    const auto directory = files.state("run/systemd/system");
    if (!directory || directory->kind != FileState::Kind::Directory) return nodeStatusOf("running");
    const auto state = manager.systemState();
    return state ? nodeStatusOf(*state) : 0;
}

}  // namespace VA::Linux
