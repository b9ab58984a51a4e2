// What the system's log receives: datagrams to /dev/log, in a folder /dev of the test's own.
#include <gmock/gmock.h>
#include <sched.h>
#include <sys/mount.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <syslog.h>
#include <unistd.h>

#include <array>
#include <cstring>

#include "framework/logging/Sinks.h"
#include "tests/logging/LoggingSupport.h"

namespace {

using logging_test::record;
using logging_test::writeFile;

constexpr int notAllowed = 77;

/// Makes /dev an empty folder that this process alone sees; false where the system forbids it.
bool makeOwnDeviceFolder() {
    const uid_t user = ::geteuid();
    const gid_t group = ::getegid();
    if (::unshare(user == 0 ? CLONE_NEWNS : CLONE_NEWNS | CLONE_NEWUSER) != 0) return false;
    if (user != 0) {
        writeFile("/proc/self/setgroups", "deny");
        writeFile("/proc/self/gid_map", "0 " + std::to_string(group) + " 1");
        writeFile("/proc/self/uid_map", "0 " + std::to_string(user) + " 1");
    }
    return ::mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0 &&
           ::mount("none", "/dev", "tmpfs", 0, nullptr) == 0;
}

/// The socket that the system's log listens at, -1 if there can be none.
int listenAtTheSystemsLog() {
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    std::strcpy(address.sun_path, "/dev/log");
    const int listener = ::socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0);
    return ::bind(listener, reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0
               ? listener
               : -1;
}

/// The next datagram, empty if none came. A local one is there as soon as it was sent.
std::string receivedBy(int listener) {
    std::array<char, 8192> text{};
    const ssize_t size = ::recv(listener, text.data(), text.size(), MSG_DONTWAIT);
    return size < 0 ? std::string() : std::string(text.data(), static_cast<std::size_t>(size));
}

TEST(SystemLog, ReceivesEachRecordAsADatagramUnderTheNameOfTheProcess) {
    const logging_test::TemporaryFolder folder;
    const int status = logging_test::inChildProcess([&] {
        if (!makeOwnDeviceFolder()) return notAllowed;
        const int listener = listenAtTheSystemsLog();
        if (listener < 0) return 1;
        ::openlog("cimserver", LOG_PID, LOG_LOCAL0);
        ZBLog::HostEnvironment environment;
        ZBLog::SystemLogSink sink(environment);
        sink.write(record("MESSAGE [File: A, Line: 9]: 100 %s full"));
        sink.write(record("VARIABLE: x", 4000));
        writeFile(folder / "message", receivedBy(listener));
        writeFile(folder / "variable", receivedBy(listener));
        return receivedBy(listener).empty() ? 0 : 2;
    });
    if (status == notAllowed) GTEST_SKIP() << "this system lets nobody have a /dev of its own";
    ASSERT_EQ(status, 0);
    // Priorities 27 and 31: the facility "daemon" with "error" and with "debug".
    const std::string from =
        "[A-Z][a-z]{2} [ 0-9][0-9] [0-9:]{8} cimserver\\[[0-9]+\\]: "
        "korva-osstatus: log ";
    EXPECT_THAT(logging_test::readFile(folder / "message"),
                testing::MatchesRegex("<27>" + from +
                                      "3000 Zumbrel.Test work Work.cpp:12 "
                                      "MESSAGE \\[File: A, Line: 9\\]: 100 %s full"));
    EXPECT_THAT(
        logging_test::readFile(folder / "variable"),
        testing::MatchesRegex("<31>" + from + "4000 Zumbrel.Test work Work.cpp:12 VARIABLE: x"));
}

}  // namespace
