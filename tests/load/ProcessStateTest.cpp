// A soak that measured nothing would pass: what it measures with is tested itself.
#include "load/ProcessState.h"

#include <gtest/gtest.h>

#include <atomic>
#include <cstring>
#include <fstream>
#include <memory>
#include <stdexcept>
#include <thread>
#include <vector>

#include "load/SoakOptions.h"

namespace {

using namespace load;

TEST(ProcessState, ShowsAnOpenFileUntilItIsClosed) {
    const long before = readProcessState().descriptors;
    {
        const std::ifstream file("/proc/self/status");
        EXPECT_EQ(readProcessState().descriptors, before + 1);
    }
    EXPECT_EQ(readProcessState().descriptors, before);
}

TEST(ProcessState, ShowsAThreadThatRuns) {
    const long before = readProcessState().threads;
    std::atomic<bool> stop{false};
    std::thread thread([&] {
        while (!stop) std::this_thread::yield();
    });
    EXPECT_EQ(readProcessState().threads, before + 1);
    stop = true;
    thread.join();
}

TEST(ProcessState, ShowsMemoryThatIsInUse) {
    constexpr std::size_t kibibytes = 3000;
    const ProcessState before = readProcessState();
    const auto block = std::make_unique<char[]>(kibibytes * 1024);
    std::memset(block.get(), 1, kibibytes * 1024);
    const ProcessState with = readProcessState();
    EXPECT_GE(with.anonymousKilobytes, before.anonymousKilobytes + static_cast<long>(kibibytes));
    EXPECT_GE(with.residentKilobytes, with.anonymousKilobytes);
    EXPECT_GE(with.peakKilobytes, with.anonymousKilobytes);
}

SoakOptions parsed(std::vector<const char*> arguments) {
    arguments.insert(arguments.begin(), "soak");
    arguments.push_back(nullptr);
    return soakOptions(static_cast<int>(arguments.size()) - 1, arguments.data());
}

TEST(SoakOptions, EachSetsWhatItNames) {
    const SoakOptions options = parsed({"--requests", "7", "--settle", "2", "--per-load", "3",
                                        "--threads", "4", "--no-memory", "--report"});
    EXPECT_EQ(options.requests, 7U);
    EXPECT_EQ(options.settle, 2U);
    EXPECT_EQ(options.perLoad, 3U);
    EXPECT_EQ(options.threads, 4U);
    EXPECT_FALSE(options.memory);
    EXPECT_TRUE(options.report);
}

TEST(SoakOptions, WithoutAnyTwoHundredThousandRequestsAndMemoryCompared) {
    const SoakOptions options = parsed({});
    EXPECT_EQ(options.requests, 200000U);
    EXPECT_EQ(options.settle, 2000U);
    EXPECT_TRUE(options.memory);
}

TEST(SoakOptions, OneLoadMoreThanThoseBeforeTheFirstReadingIsEnough) {
    EXPECT_EQ(parsed({"--requests", "2001"}).requests, 2001U);
    EXPECT_EQ(parsed({"--settle", "0", "--requests", "1"}).settle, 0U);
}

TEST(SoakOptions, MistakesAreRefusedWithTheUsage) {
    for (const std::vector<const char*>& wrong : {std::vector<const char*>{"--unknown"},
                                                  {"--requests"},
                                                  {"--requests", "-1"},
                                                  {"--requests", ""},
                                                  {"--threads", "0"},
                                                  {"--per-load", "0"},
                                                  {"--requests", "500"},
                                                  {"--requests", "2000"},
                                                  {"--per-load", "600", "--requests", "1200"},
                                                  {"--settle", "200000"},
                                                  {"--per-load", "200000"}})
        EXPECT_THROW(parsed(wrong), std::invalid_argument) << testing::PrintToString(wrong);
}

}  // namespace
