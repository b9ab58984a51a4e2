#include "host/server/HttpServer.h"

#include <arpa/inet.h>
#include <fcntl.h>
#include <microhttpd.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <sys/eventfd.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <mutex>
#include <stdexcept>
#include <string_view>
#include <system_error>
#include <thread>
#include <utility>

#include "host/server/HttpConnections.h"
#include "host/server/HttpRules.h"

namespace cmpihost::server {

namespace {

using Phase = HttpConnection::Phase;

/// Enough for a provider's work; only what is touched takes memory.
constexpr std::size_t threadStackBytes = 1024 * 1024;

/// No more may hang in the library than those that are ending.
constexpr unsigned connectionsThatEnd = 64;

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

std::string textOf(const char* characters, std::size_t length) {
    return characters == nullptr ? std::string() : std::string(characters, length);
}

MHD_Result appendHeader(void* headers, MHD_ValueKind, const char* name, std::size_t nameLength,
                        const char* value, std::size_t valueLength) noexcept {
    try {
        static_cast<decltype(HttpRequest::headers)*>(headers)->emplace_back(
            textOf(name, nameLength), textOf(value, valueLength));
        return MHD_YES;
    } catch (const std::exception&) {
        return MHD_NO;
    }
}

struct ResponseDeleter {
    void operator()(MHD_Response* response) const { MHD_destroy_response(response); }
};

}  // namespace

/// The library's daemon reads requests and writes responses in a thread for each connection. It is
/// given its connections by a thread here, which accepts them and cuts those that are late: the
/// library itself knows no time limit for a whole request, and would try again without a pause
/// when no descriptor is free.
class HttpServer::Daemon {
  public:
    Daemon(base::FileDescriptor listener, HttpHandler& handler, const HttpLimits& limits,
           const TlsIdentity* tls, HttpEvents events);
    ~Daemon();
    Daemon(const Daemon&) = delete;
    Daemon& operator=(const Daemon&) = delete;

    base::FileDescriptor stopListening();

  private:
    void start(const TlsIdentity* tls);
    void tend();
    void acceptAll();
    void refuse(base::FileDescriptor socket, const std::string& peer);
    void wake() noexcept;
    void tellCut(const std::string& peer, const char* reason) const noexcept;

    MHD_Result take(MHD_Connection* library, HttpConnection& connection, const char* method,
                    const char* version, const char* data, std::size_t* size);
    bool begin(MHD_Connection* library, HttpConnection& connection, const char* method,
               const char* version);
    MHD_Result respond(MHD_Connection* library, HttpConnection& connection);
    HttpResponse answerOf(const HttpRequest& request) noexcept;
    void finish(HttpConnection& connection, bool taken) noexcept;

    static void* onRequestLine(void* self, const char* target, MHD_Connection* library) noexcept;
    static MHD_Result onRequest(void* self, MHD_Connection* library, const char* url,
                                const char* method, const char* version, const char* data,
                                std::size_t* size, void** context) noexcept;
    static void onCompleted(void* self, MHD_Connection* library, void** context,
                            MHD_RequestTerminationCode how) noexcept;
    static void onConnection(void* self, MHD_Connection* library, void** context,
                             MHD_ConnectionNotificationCode what) noexcept;
    static void onComplaint(void* self, const char* format, va_list arguments) noexcept;

    HttpHandler& handler_;
    const HttpLimits limits_;
    const HttpEvents events_;
    const bool tls_;
    HttpConnections connections_;
    base::FileDescriptor wakeUp_;
    std::mutex listenerMutex_;
    base::FileDescriptor listener_;
    bool acceptFailed_ = false;
    /// What the library complained of while it started.
    std::string complaint_{};
    bool started_ = false;
    MHD_Daemon* library_ = nullptr;
    std::thread tender_;
};

HttpServer::Daemon::Daemon(base::FileDescriptor listener, HttpHandler& handler,
                           const HttpLimits& limits, const TlsIdentity* tls, HttpEvents events)
    : handler_(handler),
      limits_(limits),
      events_(std::move(events)),
      tls_(tls != nullptr),
      connections_(limits_, events_),
      wakeUp_(eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK)),
      listener_(std::move(listener)) {
    const int flags = fcntl(listener_.number(), F_GETFL);
    if (!wakeUp_.isOpen() || flags < 0 ||
        fcntl(listener_.number(), F_SETFL, flags | O_NONBLOCK) < 0) {
        throw std::system_error(errno, std::generic_category(), "the listening socket");
    }
    start(tls);
    try {
        tender_ = std::thread([this] { tend(); });
    } catch (...) {
        MHD_stop_daemon(library_);
        throw;
    }
}

void HttpServer::Daemon::start(const TlsIdentity* tls) {
    unsigned flags = MHD_USE_THREAD_PER_CONNECTION | MHD_USE_INTERNAL_POLLING_THREAD |
                     MHD_USE_POLL | MHD_USE_NO_LISTEN_SOCKET | MHD_USE_ITC | MHD_USE_ERROR_LOG;
    std::array<MHD_OptionItem, 4> secure{{{MHD_OPTION_END, 0, nullptr}}};
    // The library takes these texts as they are and changes nothing.
    if (tls != nullptr) {
        flags |= MHD_USE_TLS;
        static constexpr const char* versions = "NORMAL:-VERS-ALL:+VERS-TLS1.3:+VERS-TLS1.2";
        secure = {{{MHD_OPTION_HTTPS_MEM_CERT, 0, const_cast<char*>(tls->certificate.c_str())},
                   {MHD_OPTION_HTTPS_MEM_KEY, 0, const_cast<char*>(tls->key.c_str())},
                   {MHD_OPTION_HTTPS_PRIORITIES, 0, const_cast<char*>(versions)},
                   {MHD_OPTION_END, 0, nullptr}}};
    }
    // Its memory for a connection holds the header, a list of its fields and what is being read.
    library_ = MHD_start_daemon(
        flags, 0, nullptr, nullptr, &onRequest, this, MHD_OPTION_EXTERNAL_LOGGER, &onComplaint,
        this, MHD_OPTION_URI_LOG_CALLBACK, &onRequestLine, this, MHD_OPTION_NOTIFY_COMPLETED,
        &onCompleted, this, MHD_OPTION_NOTIFY_CONNECTION, &onConnection, this,
        MHD_OPTION_CONNECTION_LIMIT, limits_.connections + connectionsThatEnd,
        MHD_OPTION_CONNECTION_MEMORY_LIMIT, 4 * limits_.headerBytes, MHD_OPTION_THREAD_STACK_SIZE,
        threadStackBytes, MHD_OPTION_STRICT_FOR_CLIENT, 1, MHD_OPTION_ARRAY, secure.data(),
        MHD_OPTION_END);
    if (library_ == nullptr) {
        throw std::runtime_error("HTTP does not start: " +
                                 (complaint_.empty() ? std::strerror(errno) : complaint_));
    }
    started_ = true;
}

HttpServer::Daemon::~Daemon() {
    stopListening();
    connections_.end();
    wake();
    connections_.awaitNone();
    wake();
    tender_.join();
    MHD_stop_daemon(library_);
}

base::FileDescriptor HttpServer::Daemon::stopListening() {
    const std::lock_guard lock(listenerMutex_);
    return std::move(listener_);
}

void HttpServer::Daemon::wake() noexcept {
    // It fails only where it would have woken already.
    [[maybe_unused]] const int written = eventfd_write(wakeUp_.number(), 1);
}

void HttpServer::Daemon::tellCut(const std::string& peer, const char* reason) const noexcept {
    try {
        if (events_.cut) events_.cut(peer, reason);
    } catch (const std::exception&) {
    }
}

/// Accepts connections and cuts late ones, until the server ends and there is none any more.
void HttpServer::Daemon::tend() {
    using std::chrono::milliseconds;
    constexpr milliseconds pauseAfterFailure(50);
    constexpr milliseconds soon(10);
    const auto tick =
        std::clamp(std::min(limits_.transfer, limits_.idle) / 10, soon, milliseconds(1000));
    while (!(connections_.ending() && connections_.none())) {
        std::array<pollfd, 2> sources{};
        sources[0] = {wakeUp_.number(), POLLIN, 0};
        {
            const std::lock_guard lock(listenerMutex_);
            sources[1] = {acceptFailed_ ? -1 : listener_.number(), POLLIN, 0};
        }
        milliseconds timeout = connections_.none() ? milliseconds(-1) : tick;
        if (acceptFailed_) timeout = std::min(pauseAfterFailure, tick);
        if (connections_.ending()) timeout = soon;
        ::poll(sources.data(), sources.size(), static_cast<int>(timeout.count()));
        eventfd_t ignored = 0;
        eventfd_read(wakeUp_.number(), &ignored);
        acceptAll();
        connections_.cutLate();
    }
}

void HttpServer::Daemon::acceptAll() {
    for (;;) {
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
            const bool failed = errno != EAGAIN;
            if (failed && !acceptFailed_) tellCut("", std::strerror(errno));
            acceptFailed_ = failed;
            return;
        }
        acceptFailed_ = false;
        const int on = 1;
        setsockopt(socket.number(), IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
        const std::string peer = numericAddress(address);
        const int number = socket.number();
        if (connections_.admit(number, peer) == nullptr) {
            refuse(std::move(socket), peer);
            continue;
        }
        // The library closes the socket whether or not it can serve it.
        socket.release();
        if (MHD_add_connection(library_, number, reinterpret_cast<sockaddr*>(&address), length) !=
            MHD_YES) {
            tellCut(peer, "the connection could not be served");
            connections_.remove(number);
        }
    }
}

void HttpServer::Daemon::refuse(base::FileDescriptor socket, const std::string& peer) {
    constexpr std::string_view busy =
        "HTTP/1.1 503 Service Unavailable\r\nRetry-After: 1\r\nContent-Length: 0\r\n"
        "Connection: close\r\n\r\n";
    // A new socket has room for it; a client that is gone is not told.
    if (!tls_) {
        [[maybe_unused]] const auto sent =
            send(socket.number(), busy.data(), busy.size(), MSG_NOSIGNAL);
    }
    tellCut(peer, "too many connections");
}

bool HttpServer::Daemon::begin(MHD_Connection* library, HttpConnection& connection,
                               const char* method, const char* version) {
    HttpRequest& request = connection.request;
    connection.begun = true;
    request.method = method;
    request.version = version;
    request.peer = connection.peer;
    request.tls = tls_;
    MHD_get_connection_values_n(library, MHD_HEADER_KIND, &appendHeader, &request.headers);
    const auto* size = MHD_get_connection_info(library, MHD_CONNECTION_INFO_REQUEST_HEADER_SIZE);
    auto refusal = refusalOfHeader(request, size == nullptr ? 0 : size->header_size, limits_);
    if (!refusal) return true;
    connection.asked = HttpConnection::Clock::now();
    connection.response = std::move(*refusal);
    return false;
}

MHD_Result HttpServer::Daemon::take(MHD_Connection* library, HttpConnection& connection,
                                    const char* method, const char* version, const char* data,
                                    std::size_t* size) {
    if (!connection.begun) {
        if (!begin(library, connection, method, version)) return respond(library, connection);
        connection.enter(Phase::Body);
        return MHD_YES;
    }
    if (*size > 0) {
        // Only a body in chunks gets here; by now the library cannot respond any more.
        if (*size > limits_.bodyBytes - connection.request.body.size()) {
            tellCut(connection.peer, "the body was too long");
            return MHD_NO;
        }
        connection.request.body.append(data, *size);
        *size = 0;
        return MHD_YES;
    }
    connection.asked = HttpConnection::Clock::now();
    connection.enter(Phase::Answer);
    connection.response = answerOf(connection.request);
    return respond(library, connection);
}

HttpResponse HttpServer::Daemon::answerOf(const HttpRequest& request) noexcept {
    try {
        return handler_.answer(request);
    } catch (...) {
        HttpResponse response;
        response.status = 500;
        response.close = true;
        return response;
    }
}

MHD_Result HttpServer::Daemon::respond(MHD_Connection* library, HttpConnection& connection) {
    HttpResponse& response = connection.response;
    connection.answered = true;
    connection.enter(Phase::Response);
    // The body stays where it is until the response is complete.
    const std::unique_ptr<MHD_Response, ResponseDeleter> queued(MHD_create_response_from_buffer(
        response.body.size(), response.body.data(), MHD_RESPMEM_PERSISTENT));
    if (queued == nullptr) return MHD_NO;
    for (const auto& [name, value] : response.headers) {
        if (MHD_add_response_header(queued.get(), name.c_str(), value.c_str()) != MHD_YES) {
            return MHD_NO;
        }
    }
    if (response.close || connections_.ending()) {
        MHD_add_response_header(queued.get(), MHD_HTTP_HEADER_CONNECTION, "close");
    }
    return MHD_queue_response(library, response.status, queued.get());
}

void HttpServer::Daemon::finish(HttpConnection& connection, bool taken) noexcept {
    try {
        if (!taken && !connections_.ending()) {
            tellCut(connection.peer, connection.answered ? "the client left before its response"
                                                         : "the request was not complete");
        }
        if (connection.answered && events_.answered) {
            events_.answered(connection.request, connection.response,
                             HttpConnection::Clock::now() - connection.asked);
        }
    } catch (const std::exception&) {
    }
    connection.request = {};
    connection.response = {};
    connection.begun = false;
    connection.answered = false;
    connection.enter(Phase::Idle);
}

namespace {

HttpConnection* connectionOf(MHD_Connection* library) {
    const auto* info = MHD_get_connection_info(library, MHD_CONNECTION_INFO_SOCKET_CONTEXT);
    return info == nullptr ? nullptr : static_cast<HttpConnection*>(info->socket_context);
}

}  // namespace

void* HttpServer::Daemon::onRequestLine(void*, const char* target,
                                        MHD_Connection* library) noexcept {
    HttpConnection* connection = connectionOf(library);
    if (connection == nullptr) return nullptr;
    connection->enter(Phase::Header);
    try {
        connection->request.target = target;
    } catch (const std::exception&) {
        // Nothing depends on it.
    }
    return connection;
}

MHD_Result HttpServer::Daemon::onRequest(void* self, MHD_Connection* library, const char*,
                                         const char* method, const char* version, const char* data,
                                         std::size_t* size, void**) noexcept {
    HttpConnection* connection = connectionOf(library);
    if (connection == nullptr) return MHD_NO;
    try {
        return static_cast<Daemon*>(self)->take(library, *connection, method, version, data, size);
    } catch (const std::exception&) {
        return MHD_NO;
    }
}

void HttpServer::Daemon::onCompleted(void* self, MHD_Connection* library, void**,
                                     MHD_RequestTerminationCode how) noexcept {
    HttpConnection* connection = connectionOf(library);
    if (connection == nullptr) return;
    static_cast<Daemon*>(self)->finish(*connection, how == MHD_REQUEST_TERMINATED_COMPLETED_OK);
}

void HttpServer::Daemon::onConnection(void* self, MHD_Connection* library, void** context,
                                      MHD_ConnectionNotificationCode what) noexcept {
    auto& connections = static_cast<Daemon*>(self)->connections_;
    const auto* info = MHD_get_connection_info(library, MHD_CONNECTION_INFO_CONNECTION_FD);
    if (what == MHD_CONNECTION_NOTIFY_STARTED) {
        *context = connections.find(info->connect_fd);
    } else if (*context != nullptr) {
        connections.remove(static_cast<HttpConnection*>(*context)->socket);
        *context = nullptr;
    }
}

void HttpServer::Daemon::onComplaint(void* self, const char* format, va_list arguments) noexcept {
    auto& daemon = *static_cast<Daemon*>(self);
    if (daemon.started_) return;
    std::array<char, 256> text{};
    std::vsnprintf(text.data(), text.size(), format, arguments);
    try {
        daemon.complaint_ = text.data();
        while (!daemon.complaint_.empty() && daemon.complaint_.back() == '\n') {
            daemon.complaint_.pop_back();
        }
    } catch (const std::exception&) {
    }
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
