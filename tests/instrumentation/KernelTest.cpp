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
#include "support/TestHost.h"

namespace {

using VA::Linux::Kernel;
using VA::Linux::parseMemoryInfo;
using VA::Linux::parseNumberFile;
using VA::NodeLexicon::MaxProcessMemorySize;

TEST(KernelClock, BootTimeIsTheKernelsOwnToASecondAndWhereItIsExactToTheSecond) {
    int exact = 0;
    for (int i = 0; i < 1000; ++i) {
        std::ifstream file("/proc/stat");
        const std::string text{std::istreambuf_iterator<char>(file), {}};
        const auto expected = VA::Linux::parseBootTime(text);
        const auto clocked = Kernel().bootTime();
        ASSERT_TRUE(expected && clocked.seconds);
        ASSERT_NEAR(static_cast<double>(*clocked.seconds), static_cast<double>(*expected), 1.0);
        if (!clocked.exact) continue;
        ++exact;
        ASSERT_EQ(clocked.seconds, expected);
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
    TestHost host;
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

// proc

TEST(NumberFile, HoldsOnePositiveNumberAndItsNewline) {
    EXPECT_EQ(parseNumberFile("32768\n"), 32768u);
    for (const char* text : {"", "\n", "0\n", "32768\n\n", "32768 \n", "1\t2\n", "max\n", "-1\n",
                             "3", "3276", "32768"}) {
        EXPECT_EQ(parseNumberFile(text), std::nullopt) << '"' << text << '"';
    }
}

using KiB = std::optional<std::uint32_t>;
constexpr KiB unknown;

TEST(MemoryInfo, HasEachValueThatIsWholeAndNoOther) {
    const struct {
        const char* text;
        KiB total, available, swapTotal, swapFree;
    } rows[] = {
        {"MemTotal:       16777216 kB\nMemFree:  1 kB\nMemAvailable:    8388608 kB\n"
         "Buffers: 2 kB\nCached: 3 kB\nSwapCached: 4 kB\nSwapTotal:       2097152 kB\n"
         "SwapFree:        1048576 kB\n",
         16777216u, 8388608u, 2097152u, 1048576u},
        // an old kernel: what is free, in buffers and cached is available
        {"MemTotal: 1000 kB\nMemFree: 100 kB\nBuffers: 20 kB\nCached: 3 kB\nSwapCached: 9000 kB\n",
         1000u, 123u, 0u, 0u},
        {"MemTotal: 1000 kB\nMemFree: 100 kB\nBuffers: 20 kB\n", 1000u, unknown, 0u, 0u},
        {"MemTotal: 1000 kB\nMemFree: 100 kB\nCached: 20 kB\n", 1000u, unknown, 0u, 0u},
        {"MemTotal: 1000 kB\nBuffers: 100 kB\nCached: 20 kB\n", 1000u, unknown, 0u, 0u},
        {"MemTotal: 1000 kB\nMemFree: 100 kB\nBuffers: x kB\nCached: 3 kB\n", 1000u, unknown, 0u,
         0u},
        // a host without swap has none of it; what is malformed is not known rather than 0
        {"MemTotal: 1000 kB\nSwapTotal: 0 kB\n", 1000u, unknown, 0u, 0u},
        {"MemTotal: 1000 kB\nSwapTotal: 0 kB\nSwapFree: 0 kB\n", 1000u, unknown, 0u, 0u},
        {"MemTotal: 1000 kB\nSwapTotal: many kB\nSwapFree: 1 kB\n", 1000u, unknown, unknown, 1u},
        {"MemTotal: 1000 kB\nSwapTotal: 50 kB\n", 1000u, unknown, 50u, unknown},
        // more than four tebibytes
        {"MemTotal: 6597069766656 kB\nMemFree: 4294967295 kB\nBuffers: 4294967295 kB\n"
         "Cached: 4294967295 kB\nSwapTotal: 4294967296 kB\nSwapFree: 18446744073709551615 kB\n",
         4294967295u, 4294967295u, 4294967295u, 4294967295u},
        // cut short
        {"MemTotal: 1000 kB\nMemAvailable: 99", 1000u, unknown, 0u, 0u},
        // of two lines the first counts, even where it is malformed
        {"MemTotal: 1000 kB\nMemTotal: 5 kB\n", 1000u, unknown, 0u, 0u},
        {"MemTotal: 1000 kB\nMemAvailable: x kB\nMemAvailable: 5 kB\n", 1000u, unknown, 0u, 0u},
    };
    for (const auto& row : rows) {
        const auto info = parseMemoryInfo(row.text);
        ASSERT_TRUE(info) << row.text;
        EXPECT_EQ(info->totalKiB, row.total) << row.text;
        EXPECT_EQ(info->availableKiB, row.available) << row.text;
        EXPECT_EQ(info->swapTotalKiB, row.swapTotal) << row.text;
        EXPECT_EQ(info->swapFreeKiB, row.swapFree) << row.text;
    }
}

TEST(MemoryInfo, TextWithoutTotalMemoryIsNone) {
    for (const char* text :
         {"", "\n", "MemFree: 1 kB\n", "MemTotal:\n", "MemTotal: kB\n", "MemTotal: 12\n",
          "MemTotal: 12 k", "MemTotal: 12 MB\n", "MemTotal: -12 kB\n", "MemTotal: 1 2 kB\n",
          "MemTotal 12 kB\n", "memtotal: 12 kB\n", "MemTotal: 99999999999999999999999 kB\n",
          "\x7f"
          "ELF:\x01 kB\n"}) {
        EXPECT_FALSE(parseMemoryInfo(text)) << text;
    }
}

}  // namespace
