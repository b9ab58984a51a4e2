// The host's own libsystemd, where there is one, on a message bus of the test: that it is called as
// it wants to be called, and that whatever the bus does costs no more than the deadline.
#include <dlfcn.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <chrono>
#include <cstring>
#include <stdexcept>
#include <thread>

#include "framework/instrumentation/Linux/Systemd.h"
#include "support/TestHost.h"

namespace {

using namespace std::chrono_literals;
using testing::HasSubstr;
using VA::Linux::SystemdBus;

constexpr auto timeout = 30s;  // for an answer on a machine under any load

enum class Reply {
    State,
    Error,
    OtherType,
    HangUp,
    Silence,
    SilenceFromTheStart,
};

// The parts of a D-Bus message, in the byte order of this machine, little-endian.

std::string uint32Bytes(std::uint32_t value) {
    return {reinterpret_cast<const char*>(&value), 4};
}

std::uint32_t uint32At(const std::string& bytes, std::size_t offset) {
    std::uint32_t value = 0;
    std::memcpy(&value, &bytes[offset], 4);
    return value;
}

std::string stringBody(const std::string& text) {
    return uint32Bytes(static_cast<std::uint32_t>(text.size())) + text + '\0';
}

// A message of type 2 (reply) or 3 (error).
std::string message(char type, std::uint32_t to, const std::string& signature,
                    const std::string& body) {
    std::string fields = std::string("\x05\x01u\0", 4) + uint32Bytes(to);
    if (type == 3) {
        fields += std::string("\x04\x01s\0", 4) + stringBody("org.example.Error");
        fields.append((8 - fields.size() % 8) % 8, '\0');
    }
    fields +=
        std::string("\x08\x01g\0", 4) + static_cast<char>(signature.size()) + signature + '\0';
    std::string bytes = std::string("l") + type + '\x01' + '\x01';
    bytes += uint32Bytes(static_cast<std::uint32_t>(body.size())) + uint32Bytes(to + 100);
    bytes += uint32Bytes(static_cast<std::uint32_t>(fields.size())) + fields;
    bytes.append((8 - bytes.size() % 8) % 8, '\0');
    return bytes + body;
}

/// A message bus of one client at a time: it lets anybody in, and answers the greeting and one
/// property read after it. A client that stays is left after ten seconds.
class FakeDBus {
  public:
    /// Listens on a socket at `path`, whose folder exists.
    FakeDBus(const std::string& path, Reply reply, std::string state)
        : path_(path), reply_(reply), state_(std::move(state)) {
        struct sockaddr_un address {};
        address.sun_family = AF_UNIX;
        if (path.size() >= sizeof address.sun_path) throw std::runtime_error("long path " + path);
        std::memcpy(address.sun_path, path.c_str(), path.size());
        listener_ = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
        if (::bind(listener_, reinterpret_cast<struct sockaddr*>(&address), sizeof address) != 0 ||
            ::listen(listener_, 4) != 0)
            throw std::runtime_error("cannot listen on " + path);
        thread_ = std::thread([this] {
            while ((client_ = ::accept(listener_, nullptr, nullptr)) >= 0) {
                const struct timeval most { 10, 0 };
                ::setsockopt(client_, SOL_SOCKET, SO_RCVTIMEO, &most, sizeof most);
                serve();
                while (!take(1).empty()) {
                }
                ::close(client_);
            }
        });
    }
    ~FakeDBus() {
        stop();
        ::close(listener_);
        ::unlink(path_.c_str());
    }
    FakeDBus(const FakeDBus&) = delete;
    FakeDBus& operator=(const FakeDBus&) = delete;

    /// The messages received, as raw bytes. Called when the client has finished.
    const std::vector<std::string>& stop() {
        ::shutdown(listener_, SHUT_RDWR);
        if (thread_.joinable()) thread_.join();
        return messages_;
    }

  private:
    // The next `count` bytes; nothing once the client is gone.
    std::string take(std::size_t count) const {
        std::string bytes(count, '\0');
        const auto size = ::recv(client_, bytes.data(), count, MSG_WAITALL);
        return size == static_cast<ssize_t>(count) ? bytes : "";
    }
    std::string takeLine() const {
        std::string line;
        while (line.size() < 2 || line.compare(line.size() - 2, 2, "\r\n") != 0) {
            const std::string next = take(1);
            if (next.empty()) return "";
            line += next;
        }
        return line;
    }
    bool takeMessage() {
        const std::string head = take(16);
        if (head.empty()) return false;
        messages_.push_back(head + take((uint32At(head, 12) + 7) / 8 * 8 + uint32At(head, 4)));
        return true;
    }
    void send(const std::string& bytes) const {
        (void)!::send(client_, bytes.data(), bytes.size(), MSG_NOSIGNAL);
    }

    // Lets the client in whatever it says; false when it goes away.
    bool authenticate() const {
        take(1);  // a zero byte comes first
        for (;;) {
            const std::string line = takeLine();
            if (line.empty() || line == "BEGIN\r\n") return !line.empty();
            if (line == "AUTH EXTERNAL\r\n") send("DATA\r\n");
            if (line.rfind("AUTH EXTERNAL ", 0) == 0 || line.rfind("DATA", 0) == 0)
                send("OK 0123456789abcdef0123456789abcdef\r\n");
            if (line == "NEGOTIATE_UNIX_FD\r\n") send("AGREE_UNIX_FD\r\n");
        }
    }

    void serve() {
        if (reply_ == Reply::SilenceFromTheStart || !authenticate() || !takeMessage()) return;
        send(message(2, uint32At(messages_.back(), 8), "s", stringBody(":1.7")));
        if (!takeMessage()) return;
        const std::uint32_t serial = uint32At(messages_.back(), 8);
        const std::string state = std::string("\x01s\0\0", 4) + stringBody(state_);
        if (reply_ == Reply::State) send(message(2, serial, "v", state));
        if (reply_ == Reply::Error) send(message(3, serial, "s", stringBody("no such property")));
        if (reply_ == Reply::OtherType)
            send(message(2, serial, "v", std::string("\x01u\0\0", 4) + uint32Bytes(7)));
        if (reply_ == Reply::HangUp) ::shutdown(client_, SHUT_RDWR);
        // What the client still says, such as a goodbye, is a message too.
        while (takeMessage()) {
        }
    }

    const std::string path_;
    const Reply reply_;
    const std::string state_;
    int listener_ = -1;
    int client_ = -1;
    std::vector<std::string> messages_;
    std::thread thread_;
};

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

    // The state that is told while `bus` answers, or nobody does.
    std::optional<std::string> state(std::chrono::milliseconds deadline = timeout) {
        const auto start = std::chrono::steady_clock::now();
        auto found = SystemdBus(socket, SystemdBus::defaultLibrary, {}, deadline).systemState();
        time = std::chrono::steady_clock::now() - start;
        return found;
    }

    FixtureTree tree;
    const std::string socket = tree.path("run/dbus/system_bus_socket");
    std::chrono::steady_clock::duration time{};  // that the last question took

  private:
    void* library_ = nullptr;
};

TEST_F(SystemBusTest, ClientGreetsAsksOnePropertyAndLeaves) {
    FakeDBus bus(socket, Reply::State, "running");
    EXPECT_EQ(state(), "running");
    const auto& messages = bus.stop();
    ASSERT_EQ(messages.size(), 2u);
    EXPECT_THAT(messages[0], HasSubstr("Hello"));
    for (const char* part : {"org.freedesktop.systemd1", "/org/freedesktop/systemd1", "Get",
                             "org.freedesktop.systemd1.Manager", "SystemState"}) {
        EXPECT_THAT(messages[1], HasSubstr(part));
    }
}

TEST_F(SystemBusTest, BusOfALinuxHostIsTheOneUnderItsRoot) {
    const FakeDBus bus(socket, Reply::State, "stopping");
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

TEST_F(SystemBusTest, BusThatGivesNoStateHasNoAnswerAtOnce) {
    for (const auto reply : {Reply::Error, Reply::OtherType, Reply::HangUp}) {
        const FakeDBus bus(socket, reply, "running");
        EXPECT_EQ(state(), std::nullopt) << static_cast<int>(reply);
        EXPECT_LT(time, timeout / 2);
    }
}

TEST_F(SystemBusTest, BusThatDoesNotAnswerCostsTheDeadlineAndNoMore) {
    for (const auto reply : {Reply::SilenceFromTheStart, Reply::Silence}) {
        const FakeDBus bus(socket, reply, "running");
        EXPECT_EQ(state(SystemdBus::defaultDeadline), std::nullopt);
        EXPECT_GE(time, 295ms);
        EXPECT_LT(time, 3000ms);
    }
}

TEST_F(SystemBusTest, HostWithoutABusHasNoAnswerAtOnce) {
    for (const bool isFile : {false, true}) {
        if (isFile) tree.write("run/dbus/system_bus_socket", "a file is no socket");
        EXPECT_EQ(state(), std::nullopt);
        EXPECT_LT(time, timeout / 2);
    }
}

}  // namespace
