// What the host does to the log: its clocks, its own log (datagrams to /dev/log, in a folder /dev
// of the test's own), a thread that is cancelled.
#include <gmock/gmock.h>
#include <pthread.h>
#include <sched.h>
#include <sys/mount.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <syslog.h>
#include <unistd.h>

#include <array>
#include <atomic>
#include <cerrno>
#include <chrono>
#include <cstring>
#include <thread>

#include "framework/logging/Logger.h"
#include "tests/logging/LoggingSupport.h"

namespace {

using namespace ZBLog;
using namespace logging_test;

template <class Clock>
long long millisecondsOf(Clock) {
    return std::chrono::duration_cast<std::chrono::milliseconds>(Clock::now().time_since_epoch())
        .count();
}

TEST(HostEnvironment, CountMillisecondsSteadily) {
    HostEnvironment host;
    constexpr std::uint32_t lag = 50;
    for (int round = 0; round < 20; ++round) {
        const auto before = static_cast<std::uint32_t>(millisecondsOf(std::chrono::steady_clock{}));
        const std::uint32_t counted = host.milliseconds();
        const auto after = static_cast<std::uint32_t>(millisecondsOf(std::chrono::steady_clock{}));
        EXPECT_LE(counted - (before - lag), after - (before - lag));
    }
}

TEST(HostEnvironment, TellTheTimeOfDay) {
    HostEnvironment host;
    const long long before = millisecondsOf(std::chrono::system_clock{});
    const timespec told = host.utc();
    const long long after = millisecondsOf(std::chrono::system_clock{});
    const long long milliseconds = told.tv_sec * 1000LL + told.tv_nsec / 1000000;
    EXPECT_GE(milliseconds, before);
    EXPECT_LE(milliseconds, after);
}

TEST(ConfigurationSource, IsTheSystemsFileUnlessTheEnvironmentNamesAnother) {
    const struct {
        const char* variable;
        const char* path;
        bool required;
    } rows[] = {{nullptr, "/etc/zblog.conf", false}, {"/x/y", "/x/y", true}, {"", "", true}};
    for (const auto& row : rows) {
        const ConfigurationSource source = configurationSourceFrom(row.variable);
        EXPECT_EQ(source.path, row.path);
        EXPECT_EQ(source.required, row.required) << row.path;
    }
}

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
    const TemporaryDirectory folder;
    const int status = inChildProcess([&] {
        if (!makeOwnDeviceFolder()) return notAllowed;
        const int listener = listenAtTheSystemsLog();
        if (listener < 0) return 1;
        ::openlog("cimserver", LOG_PID, LOG_LOCAL0);
        HostEnvironment environment;
        SystemLogSink sink(environment);
        sink.write(record("MESSAGE [File: A, Line: 9]: 100 %s full"));
        sink.write(record("VARIABLE: x", 4000));
        writeFile(folder.path("message"), receivedBy(listener));
        writeFile(folder.path("variable"), receivedBy(listener));
        return receivedBy(listener).empty() ? 0 : 2;
    });
    if (status == notAllowed) GTEST_SKIP() << "this system lets nobody have a /dev of its own";
    ASSERT_EQ(status, 0);
    // Priorities 27 and 31: the facility "daemon" with "error" and with "debug".
    const std::string from =
        "[A-Z][a-z]{2} [ 0-9][0-9] [0-9:]{8} cimserver\\[[0-9]+\\]: "
        "korva-osstatus: log ";
    EXPECT_THAT(readFile(folder.path("message")),
                testing::MatchesRegex("<27>" + from +
                                      "3000 Zumbrel.Test work Work.cpp:12 "
                                      "MESSAGE \\[File: A, Line: 9\\]: 100 %s full"));
    EXPECT_THAT(
        readFile(folder.path("variable")),
        testing::MatchesRegex("<31>" + from + "4000 Zumbrel.Test work Work.cpp:12 VARIABLE: x"));
}

TEST(Cancellation, MayHitAThreadWhileItWrites) {
    const TemporaryDirectory folder;
    FakeEnvironment environment;
    Logger logger(environment);
    Configuration configuration;
    configuration.of(Channel::log) = everythingTo(Destination::file, folder.path("log"));
    logger.use(configuration);
    struct Work {
        Logger& logger;
        std::atomic<bool> started{false};
    };
    for (int round = 0; round < 20; ++round) {
        Work work{logger};
        pthread_t thread{};
        const auto writeForever = [](void* argument) -> void* {
            auto& own = *static_cast<Work*>(argument);
            for (;;) {
                own.logger.write(record("one"));
                own.started = true;
                ::pthread_testcancel();
            }
        };
        ASSERT_EQ(::pthread_create(&thread, nullptr, writeForever, &work), 0);
        while (!work.started) std::this_thread::yield();
        ::pthread_cancel(thread);
        void* result = nullptr;
        ::pthread_join(thread, &result);
        EXPECT_EQ(result, PTHREAD_CANCELED);
    }
    logger.write(record("last"));
    EXPECT_EQ(textsOf(readFile(folder.path("log"))).back(), "last");
}

}  // namespace
