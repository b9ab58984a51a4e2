#include <gtest/gtest.h>

#include <chrono>

#include "framework/logging/Environment.h"

namespace {

template <class Clock>
long long millisecondsOf(Clock) {
    return std::chrono::duration_cast<std::chrono::milliseconds>(Clock::now().time_since_epoch())
        .count();
}

TEST(HostEnvironment, CountMillisecondsSteadily) {
    ZBLog::HostEnvironment host;
    constexpr std::uint32_t lag = 50;
    for (int round = 0; round < 20; ++round) {
        const auto before = static_cast<std::uint32_t>(millisecondsOf(std::chrono::steady_clock{}));
        const std::uint32_t counted = host.milliseconds();
        const auto after = static_cast<std::uint32_t>(millisecondsOf(std::chrono::steady_clock{}));
        EXPECT_LE(counted - (before - lag), after - (before - lag));
    }
}

TEST(HostEnvironment, TellTheTimeOfDay) {
    ZBLog::HostEnvironment host;
    const long long before = millisecondsOf(std::chrono::system_clock{});
    const timespec told = host.utc();
    const long long after = millisecondsOf(std::chrono::system_clock{});
    const long long milliseconds = told.tv_sec * 1000LL + told.tv_nsec / 1000000;
    EXPECT_GE(milliseconds, before);
    EXPECT_LE(milliseconds, after);
}

}  // namespace
