#include "host/server/ServiceManager.h"

#include <fcntl.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <time.h>
#include <unistd.h>

#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <stdexcept>

namespace cmpihost::server {

namespace {

/// The number of the first socket that is passed on.
constexpr int firstPassed = 3;
constexpr int mostPassed = 64;

/// A variable that holds a number; 0 for none.
long numberIn(const char* variable) {
    const char* const text = std::getenv(variable);
    return text == nullptr ? 0 : std::strtol(text, nullptr, 10);
}

int socketOption(int socket, int option) {
    int value = 0;
    socklen_t length = sizeof value;
    return getsockopt(socket, SOL_SOCKET, option, &value, &length) == 0 ? value : -1;
}

}  // namespace

std::vector<base::FileDescriptor> takePassedSockets() {
    std::vector<base::FileDescriptor> result;
    const long count = numberIn("LISTEN_PID") == getpid() ? numberIn("LISTEN_FDS") : 0;
    for (const char* name : {"LISTEN_PID", "LISTEN_FDS", "LISTEN_FDNAMES"}) unsetenv(name);
    if (count < 0 || count > mostPassed) throw std::runtime_error("LISTEN_FDS is out of range");
    for (int number = firstPassed; number < firstPassed + count; ++number) {
        if (socketOption(number, SO_ACCEPTCONN) != 1 ||
            socketOption(number, SO_TYPE) != SOCK_STREAM)
            throw std::runtime_error("descriptor " + std::to_string(number) +
                                     ", which was passed on, is no listening stream socket");
        result.emplace_back(number);
        fcntl(number, F_SETFD, FD_CLOEXEC);
    }
    return result;
}

std::string reloadingState() {
    timespec now{};
    clock_gettime(CLOCK_MONOTONIC, &now);
    const long long microseconds = now.tv_sec * 1000000LL + now.tv_nsec / 1000;
    return "RELOADING=1\nMONOTONIC_USEC=" + std::to_string(microseconds);
}

void notifyServiceManager(const std::string& state) noexcept {
    const char* const path = std::getenv("NOTIFY_SOCKET");
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    if (path == nullptr || std::strlen(path) >= sizeof address.sun_path) return;
    const std::size_t length = std::strlen(path);
    std::memcpy(address.sun_path, path, length);
    // An abstract name is written with an @ and has a zero byte in its place.
    if (path[0] == '@') address.sun_path[0] = '\0';
    const base::FileDescriptor socket(::socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0));
    if (!socket.isOpen()) return;
    sendto(socket.number(), state.data(), state.size(), MSG_NOSIGNAL,
           reinterpret_cast<const sockaddr*>(&address),
           static_cast<socklen_t>(offsetof(sockaddr_un, sun_path) + length));
}

}  // namespace cmpihost::server
