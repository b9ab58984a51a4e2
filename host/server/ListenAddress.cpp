#include "host/server/ListenAddress.h"

#include <netdb.h>
#include <netinet/in.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstddef>
#include <cstring>
#include <memory>
#include <stdexcept>
#include <system_error>

namespace cmpihost::server {

namespace {

constexpr int backlog = SOMAXCONN;

[[noreturn]] void fail(const std::string& what) {
    throw std::system_error(errno, std::generic_category(), what);
}

/// Takes a beginning off the text; false where the text has another one.
bool takePrefix(std::string& text, const std::string& prefix) {
    if (text.compare(0, prefix.size(), prefix) != 0) return false;
    text.erase(0, prefix.size());
    return true;
}

bool isPort(const std::string& text) {
    const bool digits = !text.empty() && text.size() <= 5 &&
                        text.find_first_not_of("0123456789") == std::string::npos;
    return digits && std::stoul(text) <= 65535;
}

const sockaddr* generic(const sockaddr_storage& storage) {
    return reinterpret_cast<const sockaddr*>(&storage);
}

}  // namespace

std::vector<ListenAddress> ListenAddress::read(const std::string& text) {
    std::string rest = text;
    if (takePrefix(rest, "unix:")) return {file(rest)};
    const bool plain = takePrefix(rest, "plain:");
    const std::size_t colon = rest.rfind(':');
    const std::string port = colon == std::string::npos ? "" : rest.substr(colon + 1);
    const std::string host = colon == std::string::npos ? "" : rest.substr(0, colon);
    if (host.empty() || !isPort(port))
        throw std::invalid_argument("'" + text +
                                    "' is not ADDRESS:PORT (a port up to 65535) or unix:PATH");
    std::vector<ListenAddress> result;
    if (host == "localhost") {
        result = {inet("127.0.0.1", port), inet("::1", port)};
        result.back().optional_ = true;
    } else if (host.size() > 2 && host.front() == '[' && host.back() == ']') {
        result = {inet(host.substr(1, host.size() - 2), port)};
    } else if (host.find(':') == std::string::npos) {
        result = {inet(host, port)};
    } else {
        throw std::invalid_argument("'" + text + "': an IPv6 address stands in brackets");
    }
    for (ListenAddress& address : result) address.plain_ = plain;
    return result;
}

ListenAddress ListenAddress::inet(const std::string& host, const std::string& port) {
    addrinfo hints{};
    hints.ai_socktype = SOCK_STREAM;
    // No name is looked up on the network.
    hints.ai_flags = AI_NUMERICHOST | AI_NUMERICSERV | AI_PASSIVE;
    addrinfo* found = nullptr;
    if (host.empty() || getaddrinfo(host.c_str(), port.c_str(), &hints, &found) != 0)
        throw std::invalid_argument("'" + host + "' is no numeric address, nor localhost");
    const std::unique_ptr<addrinfo, decltype(&freeaddrinfo)> owner(found, &freeaddrinfo);
    ListenAddress result;
    std::memcpy(&result.storage_, found->ai_addr, found->ai_addrlen);
    result.length_ = found->ai_addrlen;
    return result;
}

ListenAddress ListenAddress::file(const std::string& path) {
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    if (path.empty() || path.front() != '/')
        throw std::invalid_argument("'unix:" + path + "': the path must begin with /");
    if (path.size() >= sizeof address.sun_path)
        throw std::invalid_argument("'unix:" + path + "': the path is too long for a socket");
    std::copy(path.begin(), path.end(), address.sun_path);
    ListenAddress result;
    std::memcpy(&result.storage_, &address, sizeof address);
    result.length_ =
        static_cast<socklen_t>(offsetof(sockaddr_un, sun_path) + path.size() + sizeof '\0');
    return result;
}

ListenAddress ListenAddress::of(int socket) {
    ListenAddress result;
    result.length_ = sizeof result.storage_;
    if (getsockname(socket, reinterpret_cast<sockaddr*>(&result.storage_), &result.length_) != 0)
        fail("socket " + std::to_string(socket));
    return result;
}

ListenAddress ListenAddress::at(int socket) const {
    ListenAddress result = of(socket);
    result.plain_ = plain_;
    return result;
}

bool ListenAddress::isLocal() const noexcept {
    if (isUnix()) return true;
    if (storage_.ss_family == AF_INET) {
        sockaddr_in address{};
        std::memcpy(&address, &storage_, sizeof address);
        return ntohl(address.sin_addr.s_addr) >> 24U == IN_LOOPBACKNET;
    }
    if (storage_.ss_family != AF_INET6) return false;
    sockaddr_in6 address{};
    std::memcpy(&address, &storage_, sizeof address);
    const in6_addr& number = address.sin6_addr;
    return IN6_IS_ADDR_LOOPBACK(&number) ||
           (IN6_IS_ADDR_V4MAPPED(&number) && number.s6_addr[12] == IN_LOOPBACKNET);
}

std::string ListenAddress::path() const {
    sockaddr_un address{};
    std::memcpy(&address, &storage_, std::min<std::size_t>(length_, sizeof address));
    return {address.sun_path, strnlen(address.sun_path, sizeof address.sun_path)};
}

std::string ListenAddress::text() const {
    if (isUnix()) return "unix:" + path();
    char host[NI_MAXHOST] = "";
    char port[NI_MAXSERV] = "";
    getnameinfo(generic(storage_), length_, host, sizeof host, port, sizeof port,
                NI_NUMERICHOST | NI_NUMERICSERV);
    const bool brackets = storage_.ss_family == AF_INET6;
    return (brackets ? "[" : "") + std::string(host) + (brackets ? "]:" : ":") + port;
}

base::FileDescriptor ListenAddress::listen() const {
    base::FileDescriptor result(::socket(storage_.ss_family, SOCK_STREAM | SOCK_CLOEXEC, 0));
    if (!result.isOpen()) fail(text());
    const int on = 1;
    if (isUnix()) {
        removeStaleFile();
    } else if (setsockopt(result.number(), SOL_SOCKET, SO_REUSEADDR, &on, sizeof on) != 0) {
        fail(text());
    }
    // So that the IPv4 address of the same port can be listened on, too.
    if (storage_.ss_family == AF_INET6 &&
        setsockopt(result.number(), IPPROTO_IPV6, IPV6_V6ONLY, &on, sizeof on) != 0)
        fail(text());
    if (bind(result.number(), generic(storage_), length_) != 0 ||
        ::listen(result.number(), backlog) != 0)
        fail(text());
    return result;
}

void ListenAddress::removeStaleFile() const {
    struct stat status {};
    if (lstat(path().c_str(), &status) != 0 || !S_ISSOCK(status.st_mode)) return;
    const base::FileDescriptor probe(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0));
    if (connect(probe.number(), generic(storage_), length_) != 0 && errno == ECONNREFUSED)
        removeFile();
}

void ListenAddress::removeFile() const noexcept {
    if (isUnix()) unlink(path().c_str());
}

}  // namespace cmpihost::server
