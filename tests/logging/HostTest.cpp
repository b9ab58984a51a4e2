// What the host does to the log: its clocks, its own log, a thread that is cancelled.
#include <gmock/gmock.h>
#include <pthread.h>

#include <array>
#include <atomic>
#include <chrono>
#include <cstdarg>
#include <cstdio>
#include <string>
#include <thread>
#include <vector>

#include "framework/logging/Logger.h"
#include "tests/logging/LoggingSupport.h"

namespace {

using namespace ZBLog;
using namespace logging_test;

/// What the C library was given for the system's log.
std::vector<std::string> takenSystemLog;

void takeLine(int priority, const char* format, std::va_list arguments) {
    std::array<char, 8192> text{};
    std::vsnprintf(text.data(), text.size(), format, arguments);
    takenSystemLog.push_back(std::to_string(priority) + ' ' + text.data());
}

}  // namespace

// In place of the C library's; the second is what fortified code calls.
extern "C" void syslog(int priority, const char* format, ...) {
    std::va_list arguments;
    va_start(arguments, format);
    takeLine(priority, format, arguments);
    va_end(arguments);
}
extern "C" void __syslog_chk(int priority, int, const char* format, ...) {
    std::va_list arguments;
    va_start(arguments, format);
    takeLine(priority, format, arguments);
    va_end(arguments);
}

namespace {

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

TEST(SystemLog, ReceivesEachRecordUnderItsPriority) {
    HostEnvironment environment;
    SystemLogSink sink(environment);
    takenSystemLog.clear();
    sink.write(record("MESSAGE [File: A, Line: 9]: 100 %s full"));
    sink.write(record("VARIABLE: x", 4000));
    // Priorities 27 and 31: the facility "daemon" with "error" and with "debug".
    EXPECT_THAT(takenSystemLog,
                testing::ElementsAre("27 korva-osstatus: log 3000 Zumbrel.Test work Work.cpp:12 "
                                     "MESSAGE [File: A, Line: 9]: 100 %s full",
                                     "31 korva-osstatus: log 4000 Zumbrel.Test work Work.cpp:12 "
                                     "VARIABLE: x"));
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
