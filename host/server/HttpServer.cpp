#include "host/server/HttpServer.h"

#include <arpa/inet.h>
#include <fcntl.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <sys/eventfd.h>
#include <sys/socket.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstring>
#include <mutex>
#include <new>
#include <string_view>
#include <system_error>
#include <thread>
#include <utility>

#include "host/server/HttpConnections.h"
#include "host/server/HttpLibrary.h"

namespace cmpihost::server {

namespace {

using std::chrono::milliseconds;

std::string numericAddress(const sockaddr_storage& address) {
    std::array<char, INET6_ADDRSTRLEN> text{};
    if (address.ss_family == AF_INET) {
        sockaddr_in v4{};
        std::memcpy(&v4, &address, sizeof v4);
        inet_ntop(AF_INET, &v4.sin_addr, text.data(), text.size());
    } else if (address.ss_family == AF_INET6) {
        sockaddr_in6 v6{};
        std::memcpy(&v6, &address, sizeof v6);
        inet_ntop(AF_INET6, &v6.sin6_addr, text.data(), text.size());
        constexpr std::string_view mapped = "::ffff:";
        const std::string_view whole = text.data();
        if (IN6_IS_ADDR_V4MAPPED(&v6.sin6_addr)) return std::string(whole.substr(mapped.size()));
    } else {
        return "unix";
    }
    return text.data();
}

/// The descriptor of a listening socket, made one on which accept does not wait.
base::FileDescriptor withoutWaiting(base::FileDescriptor listener) {
    const int flags = fcntl(listener.number(), F_GETFL);
    if (flags < 0 || fcntl(listener.number(), F_SETFL, flags | O_NONBLOCK) < 0) {
        throw std::system_error(errno, std::generic_category(), "the listening socket");
    }
    return listener;
}

}  // namespace

/// Accepts connections, hands them to the library and cuts those that are late, all in one thread:
/// the library itself knows no time limit for a whole request, and would try again without a pause
/// where no descriptor is free.
class HttpServer::Daemon {
  public:
    Daemon(base::FileDescriptor listener, HttpHandler& handler, const HttpLimits& limits,
           const TlsIdentity* tls, HttpEvents events);
    ~Daemon();
    Daemon(const Daemon&) = delete;
    Daemon& operator=(const Daemon&) = delete;

    base::FileDescriptor stopListening();

  private:
    void tend();
    milliseconds pause();
    void acceptAll();
    bool somebodyWaits();
    void take(base::FileDescriptor socket, const sockaddr_storage& address, socklen_t length);
    void refuse(base::FileDescriptor socket, const std::string& peer);

    const HttpLimits limits_;
    const HttpEvents events_;
    const bool tls_;
    HttpConnections connections_;
    base::FileDescriptor wakeUp_;
    std::mutex listenerMutex_;
    base::FileDescriptor listener_;
    /// No descriptor was free the last time.
    bool acceptFailed_ = false;
    /// A connection ends for the one that could not be accepted.
    bool roomComes_ = false;
    HttpLibrary library_;
    std::thread thread_;
};

HttpServer::Daemon::Daemon(base::FileDescriptor listener, HttpHandler& handler,
                           const HttpLimits& limits, const TlsIdentity* tls, HttpEvents events)
    : limits_(limits),
      events_(std::move(events)),
      tls_(tls != nullptr),
      connections_(limits_, events_),
      wakeUp_(eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK)),
      listener_(withoutWaiting(std::move(listener))),
      library_(handler, limits_, events_, connections_, tls) {
    if (!wakeUp_.isOpen()) {
        throw std::system_error(errno, std::generic_category(), "a descriptor for waking");
    }
    thread_ = std::thread([this] { tend(); });
}

HttpServer::Daemon::~Daemon() {
    stopListening();
    connections_.end();
    // It fails only where it would have woken already.
    [[maybe_unused]] const int written = eventfd_write(wakeUp_.number(), 1);
    thread_.join();
}

base::FileDescriptor HttpServer::Daemon::stopListening() {
    const std::lock_guard lock(listenerMutex_);
    return std::move(listener_);
}

void HttpServer::Daemon::tend() {
    while (!(connections_.ending() && connections_.none())) {
        std::array<pollfd, 2> sources{{{wakeUp_.number(), POLLIN, 0}, {-1, POLLIN, 0}}};
        if (!acceptFailed_ && !connections_.crowded()) {
            const std::lock_guard lock(listenerMutex_);
            sources[1].fd = listener_.number();
        }
        ::poll(sources.data(), sources.size(), static_cast<int>(pause().count()));
        eventfd_t wakings = 0;
        [[maybe_unused]] const int drained = eventfd_read(wakeUp_.number(), &wakings);
        try {
            acceptAll();
            connections_.cutLate();
        } catch (const std::bad_alloc&) {
            // Whoever is late is cut in the next round.
        }
    }
}

/// How long to wait where nothing happens; negative: for ever.
milliseconds HttpServer::Daemon::pause() {
    constexpr milliseconds shortest(10);
    constexpr milliseconds longest(1000);
    constexpr milliseconds afterFailure(50);
    constexpr milliseconds untilSomeEnd(2);
    if (connections_.ending()) return shortest;
    if (connections_.crowded()) return untilSomeEnd;
    if (acceptFailed_) return roomComes_ ? untilSomeEnd : afterFailure;
    if (connections_.none()) return milliseconds(-1);
    return std::clamp(std::min(limits_.transfer, limits_.idle) / 10, shortest, longest);
}

void HttpServer::Daemon::acceptAll() {
    while (!connections_.crowded()) {
        sockaddr_storage address{};
        socklen_t length = sizeof address;
        base::FileDescriptor socket;
        {
            const std::lock_guard lock(listenerMutex_);
            if (!listener_.isOpen()) return;
            socket.reset(accept4(listener_.number(), reinterpret_cast<sockaddr*>(&address), &length,
                                 SOCK_NONBLOCK | SOCK_CLOEXEC));
        }
        if (!socket.isOpen()) {
            if (errno == ECONNABORTED || errno == EINTR) continue;
            const int error = errno;
            const bool failed = error != EAGAIN && somebodyWaits();
            if (failed && !acceptFailed_) connections_.tellCut("", std::strerror(error));
            acceptFailed_ = failed;
            roomComes_ = failed && connections_.makeRoom();
            return;
        }
        acceptFailed_ = false;
        take(std::move(socket), address, length);
    }
}

/// Without a free descriptor accept fails whether or not there is a connection.
bool HttpServer::Daemon::somebodyWaits() {
    const std::lock_guard lock(listenerMutex_);
    pollfd source{listener_.number(), POLLIN, 0};
    return ::poll(&source, 1, 0) == 1;
}

void HttpServer::Daemon::take(base::FileDescriptor socket, const sockaddr_storage& address,
                              socklen_t length) {
    const std::string peer = numericAddress(address);
    if (!connections_.admit(socket.number(), peer)) {
        refuse(std::move(socket), peer);
        return;
    }
    const int on = 1;
    setsockopt(socket.number(), IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
    const int number = socket.release();
    if (!library_.serve(number, address, length)) {
        connections_.tellCut(peer, "it could not be served");
        connections_.remove(number);
    }
}

void HttpServer::Daemon::refuse(base::FileDescriptor socket, const std::string& peer) {
    constexpr std::string_view busy =
        "HTTP/1.1 503 Service Unavailable\r\nRetry-After: 1\r\nContent-Length: 0\r\n"
        "Connection: close\r\n\r\n";
    if (!tls_) {
        // A new socket has room for it.
        [[maybe_unused]] const auto sent =
            send(socket.number(), busy.data(), busy.size(), MSG_NOSIGNAL);
    }
    connections_.tellCut(peer, "too many connections");
}

HttpServer::HttpServer(base::FileDescriptor listener, HttpHandler& handler,
                       const HttpLimits& limits, const TlsIdentity* tls, HttpEvents events)
    : daemon_(
          std::make_unique<Daemon>(std::move(listener), handler, limits, tls, std::move(events))) {}

HttpServer::~HttpServer() = default;

base::FileDescriptor HttpServer::stopListening() {
    return daemon_->stopListening();
}

}  // namespace cmpihost::server
