#include "host/server/HttpTestServer.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <sys/time.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <filesystem>
#include <iterator>
#include <new>
#include <system_error>

namespace cmpihost::server::fixture {

namespace {

[[noreturn]] void failSocket(const char* what) {
    throw std::system_error(errno, std::generic_category(), what);
}

sockaddr_in loopback(const char* address, std::uint16_t port) {
    sockaddr_in result{};
    result.sin_family = AF_INET;
    result.sin_port = htons(port);
    inet_pton(AF_INET, address, &result.sin_addr);
    return result;
}

const sockaddr* plain(const sockaddr_in& address) {
    return reinterpret_cast<const sockaddr*>(&address);
}

std::size_t entriesOf(const char* folder) {
    const std::filesystem::directory_iterator entries(folder);
    return static_cast<std::size_t>(std::distance(begin(entries), end(entries)));
}

}  // namespace

base::FileDescriptor listeningSocket() {
    base::FileDescriptor socket(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0));
    const sockaddr_in address = loopback("127.0.0.1", 0);
    if (::bind(socket.number(), plain(address), sizeof address) < 0) failSocket("bind");
    if (::listen(socket.number(), 1024) < 0) failSocket("listen");
    return socket;
}

std::uint16_t portOf(int socket) {
    sockaddr_in address{};
    socklen_t length = sizeof address;
    if (getsockname(socket, reinterpret_cast<sockaddr*>(&address), &length) < 0) failSocket("port");
    return ntohs(address.sin_port);
}

HttpTestClient::HttpTestClient(std::uint16_t port, const char* source, int receiveBuffer)
    : socket_(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0)) {
    const sockaddr_in from = loopback(source, 0);
    const sockaddr_in to = loopback("127.0.0.1", port);
    if (receiveBuffer > 0) {
        setsockopt(socket(), SOL_SOCKET, SO_RCVBUF, &receiveBuffer, sizeof receiveBuffer);
    }
    if (::bind(socket(), plain(from), sizeof from) < 0) failSocket("bind");
    if (::connect(socket(), plain(to), sizeof to) < 0) failSocket("connect");
    const timeval patience{5, 0};
    setsockopt(socket(), SOL_SOCKET, SO_RCVTIMEO, &patience, sizeof patience);
    setsockopt(socket(), SOL_SOCKET, SO_SNDTIMEO, &patience, sizeof patience);
}

bool HttpTestClient::send(std::string_view bytes) {
    while (!bytes.empty()) {
        const ssize_t sent = ::send(socket(), bytes.data(), bytes.size(), MSG_NOSIGNAL);
        if (sent < 0) return false;
        bytes.remove_prefix(static_cast<std::size_t>(sent));
    }
    return true;
}

bool HttpTestClient::read() {
    std::array<char, 65536> buffer{};
    const ssize_t got = ::recv(socket(), buffer.data(), buffer.size(), 0);
    if (got <= 0) return false;
    unread_.append(buffer.data(), static_cast<std::size_t>(got));
    return true;
}

std::string HttpTestClient::receive() {
    std::size_t length = std::string::npos;
    do {
        const auto header = unread_.find("\r\n\r\n");
        const auto told = unread_.find("Content-Length: ");
        if (header == std::string::npos) continue;
        length = header + 4;
        if (told < header) length += std::stoul(unread_.substr(told + 16));
    } while (unread_.size() < length && read());
    std::string response = unread_.substr(0, length);
    unread_.erase(0, length);
    return response;
}

std::string HttpTestClient::receiveAll() {
    do errno = 0;
    while (read());
    if (errno == EAGAIN) unread_ += "(open)";
    return std::exchange(unread_, {});
}

bool HttpTestClient::hasEnded() {
    char byte = 0;
    const ssize_t got = ::recv(socket(), &byte, 1, MSG_PEEK | MSG_DONTWAIT);
    return got == 0 || (got < 0 && errno != EAGAIN);
}

void HttpTestClient::reset() {
    const linger atOnce{1, 0};
    setsockopt(socket(), SOL_SOCKET, SO_LINGER, &atOnce, sizeof atOnce);
    socket_.reset();
}

std::string httpPost(const std::string& target, const std::string& body) {
    return "POST " + target +
           " HTTP/1.1\r\nHost: localhost\r\nContent-Length: " + std::to_string(body.size()) +
           "\r\n\r\n" + body;
}

HttpResponse PlainHandler::answer(const HttpRequest& request) {
    HttpResponse response;
    response.headers = {{"Content-Type", "text/plain"}};
    response.body = request.target + " " + std::to_string(request.body.size());
    std::unique_lock lock(mutex_);
    last_ = request;
    ++requests_;
    changed_.notify_all();
    if (request.target == "/throw") throw std::bad_alloc();
    if (request.target == "/wait") changed_.wait(lock, [this] { return isOpen_; });
    if (request.target == "/delay") response.delay = delay;
    if (request.target == "/big") response.body.assign(std::size_t{8} << 20U, 'x');
    return response;
}

void PlainHandler::open() {
    const std::lock_guard lock(mutex_);
    isOpen_ = true;
    changed_.notify_all();
}

void PlainHandler::await(unsigned requests) {
    std::unique_lock lock(mutex_);
    changed_.wait_for(lock, std::chrono::seconds(5), [&] { return requests_ >= requests; });
}

HttpRequest PlainHandler::lastRequest() {
    const std::lock_guard lock(mutex_);
    return last_;
}

HttpTestServer::HttpTestServer(const HttpLimits& limits, const TlsIdentity* tls) {
    base::FileDescriptor listener = listeningSocket();
    port_ = portOf(listener.number());
    server = std::make_unique<HttpServer>(std::move(listener), handler, limits, tls, events());
}

HttpTestServer::HttpTestServer(base::FileDescriptor listener)
    : server(std::make_unique<HttpServer>(std::move(listener), handler, HttpLimits{}, nullptr,
                                          events())) {}

HttpTestServer::~HttpTestServer() {
    handler.open();
    server.reset();
}

HttpEvents HttpTestServer::events() {
    HttpEvents result;
    result.cut = [this](const std::string& peer, const char* reason) {
        const std::lock_guard lock(mutex_);
        cuts_.push_back(peer + ": " + reason);
    };
    result.answered = [this](const HttpRequest& request, const HttpResponse& response,
                             std::chrono::nanoseconds took) {
        if (took.count() <= 0) return;
        const std::lock_guard lock(mutex_);
        answers_.push_back(request.peer + " " + request.target + " " +
                           std::to_string(response.status));
    };
    return result;
}

std::vector<std::string> HttpTestServer::cuts() {
    const std::lock_guard lock(mutex_);
    std::sort(cuts_.begin(), cuts_.end());
    return cuts_;
}

std::vector<std::string> HttpTestServer::answers() {
    const std::lock_guard lock(mutex_);
    std::sort(answers_.begin(), answers_.end());
    return answers_;
}

std::size_t openDescriptors() {
    return entriesOf("/proc/self/fd");
}

std::size_t runningThreads() {
    return entriesOf("/proc/self/task");
}

}  // namespace cmpihost::server::fixture
