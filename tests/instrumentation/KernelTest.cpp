#include "framework/instrumentation/Linux/Kernel.h"

#include <gtest/gtest.h>
#include <signal.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <ctime>
#include <fstream>
#include <string>

#include "framework/instrumentation/Linux/Dates.h"
#include "tests/instrumentation/HostParts.h"

namespace {

using VA::Linux::Kernel;
using VA::NodeLexicon::MaxProcessMemorySize;

TEST(KernelClock, BootTimeAgreesWithTheKernelsOwnToASecond) {
    std::ifstream file("/proc/stat");
    const std::string text{std::istreambuf_iterator<char>(file), {}};
    const auto expected = VA::Linux::parseBootTime(text);
    ASSERT_TRUE(expected);
    const auto clocked = Kernel().bootTime();
    ASSERT_TRUE(clocked.seconds);
    EXPECT_NEAR(static_cast<double>(*clocked.seconds), static_cast<double>(*expected), 1.0);
}

TEST(KernelClock, BootTimeThatIsExactIsTheKernelsOwn) {
    int exact = 0;
    for (int i = 0; i < 1000; ++i) {
        std::ifstream file("/proc/stat");
        const std::string text{std::istreambuf_iterator<char>(file), {}};
        const auto clocked = Kernel().bootTime();
        if (!clocked.exact) continue;
        ++exact;
        ASSERT_EQ(clocked.seconds, VA::Linux::parseBootTime(text));
    }
    // A second ends within the two readings of a clock on one host of millions.
    EXPECT_GT(exact, 0);
}

TEST(KernelClock, NowIsTheTimeOfDay) {
    EXPECT_NEAR(static_cast<double>(Kernel().now()), static_cast<double>(std::time(nullptr)), 1.0);
}

TEST(KernelProcesses, AreAliveUntilTheyAreWaitedFor) {
    EXPECT_TRUE(Kernel().isAlive(::getpid()));
    const pid_t child = ::fork();
    if (child == 0) ::_exit(0);
    ASSERT_EQ(::waitpid(child, nullptr, 0), child);
    EXPECT_FALSE(Kernel().isAlive(child));
}

// In a process of no rights, for which the one that runs this test may be another user's.
TEST(KernelProcesses, OfOtherUsersAreAliveToo) {
    constexpr int cannotBeTried = 77;
    const pid_t child = ::fork();
    if (child == 0) {
        if (::getuid() == 0 && ::setresuid(65534, 65534, 65534) != 0) ::_exit(cannotBeTried);
        const bool forbidden = ::kill(1, 0) != 0 && errno == EPERM;
        if (!forbidden) ::_exit(cannotBeTried);
        ::_exit(Kernel().isAlive(1) ? 0 : 1);
    }
    int status = 0;
    ASSERT_EQ(::waitpid(child, &status, 0), child);
    ASSERT_TRUE(WIFEXITED(status));
    if (WEXITSTATUS(status) == cannotBeTried)
        GTEST_SKIP() << "process 1 is this user's own, or there is no other user";
    EXPECT_EQ(WEXITSTATUS(status), 0);
}

// The soft limit as the kernel reports it while it is `soft`; it is put back before this returns.
std::optional<std::uint64_t> limitWhileSoftLimitIs(rlim_t soft) {
    struct rlimit before;
    if (::getrlimit(RLIMIT_AS, &before) != 0) return std::nullopt;
    struct rlimit changed = before;
    changed.rlim_cur = soft;
    if (::setrlimit(RLIMIT_AS, &changed) != 0) return std::nullopt;
    const auto limit = Kernel().addressSpaceLimit();
    ::setrlimit(RLIMIT_AS, &before);
    return limit;
}

TEST(KernelLimits, AddressSpaceLimitIsTheSoftOneIn64Bits) {
    struct rlimit now;
    ASSERT_EQ(::getrlimit(RLIMIT_AS, &now), 0);
    if (now.rlim_max != RLIM_INFINITY) GTEST_SKIP() << "this process may not use all limits";
    constexpr rlim_t eightGiB = rlim_t{8} << 30;
    EXPECT_EQ(limitWhileSoftLimitIs(eightGiB), 8589934592u);
    EXPECT_EQ(limitWhileSoftLimitIs((rlim_t{4} << 30) - 1), 4294967295u);
    EXPECT_EQ(limitWhileSoftLimitIs(RLIM_INFINITY), Kernel::unlimited);
}

TEST(MostMemoryOfAProcess, IsTheLimitInKilobytesAndZeroWhenUnlimited) {
    FixtureHost host;
    struct Case {
        std::optional<std::uint64_t> bytes;
        std::optional<unsigned int> kiB;
    };
    const Case cases[] = {
        {Kernel::unlimited, 0u},
        {1073741824u, 1048576u},
        {8589934592u, 8388608u},
        {2047u, 1u},
        {1023u, 1u},  // 0 would say that there is no limit
        {0u, 1u},
        {18446744073709551614u, 4294967295u},
        {std::nullopt, std::nullopt},
    };
    for (const Case& c : cases) {
        host.kernel->fixedLimit = c.bytes;
        EXPECT_EQ(host.number(MaxProcessMemorySize), c.kiB) << testing::PrintToString(c.bytes);
    }
}

}  // namespace
