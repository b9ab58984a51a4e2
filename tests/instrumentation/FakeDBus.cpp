#include "FakeDBus.h"

#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <cstdint>
#include <cstring>
#include <optional>
#include <stdexcept>

namespace {

std::string uint32Bytes(std::uint32_t value) {
    std::string bytes(4, '\0');
    std::memcpy(bytes.data(), &value, 4);
    return bytes;
}

std::uint32_t uint32At(const std::string& bytes, std::size_t offset) {
    std::uint32_t value = 0;
    std::memcpy(&value, &bytes[offset], 4);
    return value;
}

std::string stringBody(const std::string& text) {
    return uint32Bytes(static_cast<std::uint32_t>(text.size())) + text + '\0';
}

// A message of type 2 (reply) or 3 (error) in the byte order of this machine, little-endian.
std::string reply(char type, std::uint32_t to, const std::string& signature,
                  const std::string& body) {
    std::string fields = std::string("\x05\x01u\0", 4) + uint32Bytes(to);
    if (type == 3) {
        fields += std::string("\x04\x01s\0", 4) + stringBody("org.example.Error");
        fields.append((8 - fields.size() % 8) % 8, '\0');
    }
    fields +=
        std::string("\x08\x01g\0", 4) + static_cast<char>(signature.size()) + signature + '\0';
    std::string message = std::string("l") + type + '\x01' + '\x01';
    message += uint32Bytes(static_cast<std::uint32_t>(body.size())) + uint32Bytes(to + 100);
    message += uint32Bytes(static_cast<std::uint32_t>(fields.size())) + fields;
    message.append((8 - message.size() % 8) % 8, '\0');
    return message + body;
}

// A client's bytes, read with the stop signal in sight.
class Client {
  public:
    Client(int socket, int stop) : socket_(socket), stop_(stop) {}
    ~Client() { ::close(socket_); }
    Client(const Client&) = delete;
    Client& operator=(const Client&) = delete;

    // The next `count` bytes, or those up to and including `end`; nothing once the client is gone.
    std::optional<std::string> take(std::size_t count) {
        while (buffer_.size() < count) {
            if (!receive()) return std::nullopt;
        }
        return cut(count);
    }
    std::optional<std::string> takeLine() {
        for (;;) {
            const auto end = buffer_.find("\r\n");
            if (end != std::string::npos) return cut(end + 2);
            if (!receive()) return std::nullopt;
        }
    }
    void send(const std::string& bytes) {
        (void)!::send(socket_, bytes.data(), bytes.size(), MSG_NOSIGNAL);
    }
    void ignoreUntilGone() {
        while (receive()) buffer_.clear();
    }

  private:
    std::string cut(std::size_t count) {
        std::string head = buffer_.substr(0, count);
        buffer_.erase(0, count);
        return head;
    }
    bool receive() {
        struct pollfd waits[2] = {{socket_, POLLIN, 0}, {stop_, POLLIN, 0}};
        if (::poll(waits, 2, -1) < 0 || waits[1].revents) return false;
        char bytes[4096];
        const auto count = ::recv(socket_, bytes, sizeof bytes, 0);
        if (count <= 0) return false;
        buffer_.append(bytes, static_cast<std::size_t>(count));
        return true;
    }

    int socket_;
    int stop_;
    std::string buffer_;
};

// Lets the client in whatever it says; false when it goes away.
bool authenticate(Client& client) {
    constexpr const char* welcome = "OK 0123456789abcdef0123456789abcdef\r\n";
    if (!client.take(1)) return false;  // a zero byte comes first
    for (;;) {
        const auto line = client.takeLine();
        if (!line) return false;
        if (*line == "BEGIN\r\n") return true;
        if (*line == "AUTH EXTERNAL\r\n") client.send("DATA\r\n");
        if (line->rfind("AUTH EXTERNAL ", 0) == 0 || line->rfind("DATA", 0) == 0) {
            client.send(welcome);
        }
        if (*line == "NEGOTIATE_UNIX_FD\r\n") client.send("AGREE_UNIX_FD\r\n");
    }
}

std::optional<std::string> takeMessage(Client& client) {
    auto message = client.take(16);
    if (!message) return std::nullopt;
    const std::size_t fields = uint32At(*message, 12);
    const auto rest = client.take((fields + 7) / 8 * 8 + uint32At(*message, 4));
    if (!rest) return std::nullopt;
    return *message + *rest;
}

}  // namespace

FakeDBus::FakeDBus(const std::string& path, Behaviour behaviour, std::string state,
                   std::chrono::milliseconds delay)
    : behaviour_(behaviour), state_(std::move(state)), delay_(delay) {
    struct sockaddr_un address {};
    address.sun_family = AF_UNIX;
    if (path.size() >= sizeof address.sun_path) throw std::runtime_error("long path " + path);
    std::memcpy(address.sun_path, path.c_str(), path.size());
    listener_ = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
    if (::bind(listener_, reinterpret_cast<struct sockaddr*>(&address), sizeof address) != 0 ||
        ::listen(listener_, 4) != 0 || ::pipe(stopPipe_) != 0) {
        throw std::runtime_error("cannot listen on " + path);
    }
    thread_ = std::thread([this] { serve(); });
}

FakeDBus::~FakeDBus() {
    stop();
    for (const int descriptor : {listener_, stopPipe_[0]}) ::close(descriptor);
}

const std::vector<std::string>& FakeDBus::stop() {
    if (thread_.joinable()) {
        ::close(stopPipe_[1]);  // the other end becomes readable for good
        thread_.join();
    }
    return messages_;
}

void FakeDBus::serve() {
    for (;;) {
        struct pollfd waits[2] = {{listener_, POLLIN, 0}, {stopPipe_[0], POLLIN, 0}};
        if (::poll(waits, 2, -1) < 0 || waits[1].revents) return;
        const int client = ::accept(listener_, nullptr, nullptr);
        if (client >= 0) serveClient(client);
    }
}

// Lets the delay pass; true when the bus is to stop.
bool FakeDBus::waitForStop() const {
    struct pollfd stop = {stopPipe_[0], POLLIN, 0};
    return ::poll(&stop, 1, static_cast<int>(delay_.count())) != 0;
}

void FakeDBus::serveClient(int socket) {
    constexpr const char* garbage = "HTTP/1.1 400 Bad Request\r\nContent-Length: 0\r\n\r\n";
    Client client(socket, stopPipe_[0]);
    if (behaviour_ == Behaviour::GarbageAtTheDoor) client.send(garbage);
    if (behaviour_ == Behaviour::SilentFromTheStart || behaviour_ == Behaviour::GarbageAtTheDoor) {
        return client.ignoreUntilGone();
    }
    if (!authenticate(client)) return;
    const auto hello = takeMessage(client);
    if (!hello) return;
    messages_.push_back(*hello);
    client.send(reply(2, uint32At(*hello, 8), "s", stringBody(":1.7")));
    const auto question = takeMessage(client);
    if (!question) return;
    messages_.push_back(*question);
    const std::uint32_t serial = uint32At(*question, 8);
    const std::string state = std::string("\x01s\0\0", 4) + stringBody(state_);
    if (waitForStop()) return;
    switch (behaviour_) {
        case Behaviour::Answer:
            client.send(reply(2, serial, "v", state));
            break;
        case Behaviour::OtherReply:
            client.send(reply(2, serial + 1000, "v", state));
            break;
        case Behaviour::Garbage:
            client.send(garbage);
            break;
        case Behaviour::ErrorReply:
            client.send(reply(3, serial, "s", stringBody("no such property")));
            break;
        case Behaviour::OtherType:
            client.send(reply(2, serial, "v", std::string("\x01u\0\0", 4) + uint32Bytes(7)));
            break;
        case Behaviour::HangsUp:
            return;
        case Behaviour::SilentFromTheStart:
        case Behaviour::GarbageAtTheDoor:
        case Behaviour::SilentAfterGreeting:
            break;
    }
    // What the client still says, such as a goodbye, is a message too.
    while (const auto more = takeMessage(client)) messages_.push_back(*more);
}
