#include "framework/instrumentation/Linux/Kernel.h"

#include <gtest/gtest.h>

namespace {

using VA::Linux::parseMemoryInfo;

TEST(MemoryInfo, TakesEachValueFromItsLine) {
    const auto info = parseMemoryInfo(
        "MemTotal:       16777216 kB\nMemFree:  1 kB\nMemAvailable:    8388608 kB\n"
        "Buffers: 2 kB\nCached: 3 kB\nSwapCached: 4 kB\nSwapTotal:       2097152 kB\n"
        "SwapFree:        1048576 kB\n");
    ASSERT_TRUE(info);
    EXPECT_EQ(info->totalKiB, 16777216u);
    EXPECT_EQ(info->availableKiB, 8388608u);
    EXPECT_EQ(info->swapTotalKiB, 2097152u);
    EXPECT_EQ(info->swapFreeKiB, 1048576u);
}

TEST(MemoryInfo, OldKernelHasFreeBuffersAndCachedAvailable) {
    const auto info = parseMemoryInfo(
        "MemTotal: 1000 kB\nMemFree: 100 kB\nBuffers: 20 kB\nCached: 3 kB\nSwapCached: 9000 kB\n");
    ASSERT_TRUE(info);
    EXPECT_EQ(info->availableKiB, 123u);
}

TEST(MemoryInfo, AvailableIsNotGuessedFromAnIncompleteSum) {
    for (const char* text : {"MemTotal: 1000 kB\nMemFree: 100 kB\nBuffers: 20 kB\n",
                             "MemTotal: 1000 kB\nMemFree: 100 kB\nCached: 20 kB\n",
                             "MemTotal: 1000 kB\nBuffers: 100 kB\nCached: 20 kB\n",
                             "MemTotal: 1000 kB\nMemFree: 100 kB\nBuffers: x kB\nCached: 3 kB\n"}) {
        const auto info = parseMemoryInfo(text);
        ASSERT_TRUE(info) << text;
        EXPECT_EQ(info->availableKiB, std::nullopt) << text;
    }
}

TEST(MemoryInfo, HostWithoutSwapHasZeroOfIt) {
    for (const char* text : {"MemTotal: 1000 kB\n", "MemTotal: 1000 kB\nSwapTotal: 0 kB\n",
                             "MemTotal: 1000 kB\nSwapTotal: 0 kB\nSwapFree: 0 kB\n"}) {
        const auto info = parseMemoryInfo(text);
        ASSERT_TRUE(info) << text;
        EXPECT_EQ(info->swapTotalKiB, 0u) << text;
        EXPECT_EQ(info->swapFreeKiB, 0u) << text;
    }
}

TEST(MemoryInfo, MalformedSwapIsNotKnownRatherThanZero) {
    const auto noTotal = parseMemoryInfo("MemTotal: 1000 kB\nSwapTotal: many kB\nSwapFree: 1 kB\n");
    ASSERT_TRUE(noTotal);
    EXPECT_EQ(noTotal->swapTotalKiB, std::nullopt);
    EXPECT_EQ(noTotal->swapFreeKiB, 1u);
    const auto noFree = parseMemoryInfo("MemTotal: 1000 kB\nSwapTotal: 50 kB\n");
    ASSERT_TRUE(noFree);
    EXPECT_EQ(noFree->swapTotalKiB, 50u);
    EXPECT_EQ(noFree->swapFreeKiB, std::nullopt);
}

TEST(MemoryInfo, MoreThanFourTebibytesSaturate) {
    const auto info = parseMemoryInfo(
        "MemTotal: 6597069766656 kB\nMemFree: 4294967295 kB\nBuffers: 4294967295 kB\n"
        "Cached: 4294967295 kB\nSwapTotal: 4294967296 kB\nSwapFree: 18446744073709551615 kB\n");
    ASSERT_TRUE(info);
    EXPECT_EQ(info->totalKiB, 4294967295u);
    EXPECT_EQ(info->availableKiB, 4294967295u);
    EXPECT_EQ(info->swapTotalKiB, 4294967295u);
    EXPECT_EQ(info->swapFreeKiB, 4294967295u);
}

TEST(MemoryInfo, TextWithoutTotalMemoryIsNoMemoryInfo) {
    for (const char* text :
         {"", "\n", "MemFree: 1 kB\n", "MemTotal:\n", "MemTotal: kB\n", "MemTotal: 12\n",
          "MemTotal: 12 k", "MemTotal: 12 MB\n", "MemTotal: -12 kB\n", "MemTotal: 1 2 kB\n",
          "MemTotal 12 kB\n", "memtotal: 12 kB\n", "MemTotal: 99999999999999999999999 kB\n",
          "\x7f"
          "ELF:\x01 kB\n"}) {
        EXPECT_FALSE(parseMemoryInfo(text)) << text;
    }
}

TEST(MemoryInfo, NumberThatWasCutShortIsNotTaken) {
    const auto info = parseMemoryInfo("MemTotal: 1000 kB\nMemAvailable: 99");
    ASSERT_TRUE(info);
    EXPECT_EQ(info->availableKiB, std::nullopt);
}

TEST(MemoryInfo, FirstOfTwoLinesCounts) {
    const auto info = parseMemoryInfo("MemTotal: 1000 kB\nMemTotal: 5 kB\n");
    ASSERT_TRUE(info);
    EXPECT_EQ(info->totalKiB, 1000u);
}

}  // namespace
