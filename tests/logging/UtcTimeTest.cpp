#include "framework/logging/UtcTime.h"

#include <gtest/gtest.h>

#include <array>
#include <string>

namespace {

std::string utc(long long seconds, long nanoseconds = 0) {
    ZBLog::LineBuffer line;
    ZBLog::putUtc(line, {static_cast<time_t>(seconds), nanoseconds});
    return std::string(line.text());
}

TEST(UtcTime, PrintsDateTimeAndMilliseconds) {
    EXPECT_EQ(utc(0), "1970-01-01T00:00:00.000Z");
    EXPECT_EQ(utc(1000000000, 999999999), "2001-09-09T01:46:40.999Z");
    EXPECT_EQ(utc(1709251199, 7000000), "2024-02-29T23:59:59.007Z");
    EXPECT_EQ(utc(1709251200), "2024-03-01T00:00:00.000Z");
    EXPECT_EQ(utc(951782400), "2000-02-29T00:00:00.000Z");
    EXPECT_EQ(utc(4107542400), "2100-03-01T00:00:00.000Z");
    EXPECT_EQ(utc(2147483648), "2038-01-19T03:14:08.000Z");
    EXPECT_EQ(utc(-1, 500000000), "1969-12-31T23:59:59.500Z");
    EXPECT_EQ(utc(253402300799), "9999-12-31T23:59:59.000Z");
}

TEST(UtcTime, AgreesWithTheCLibraryOnEveryDayOfEightCenturies) {
    constexpr long long day = 86400;
    for (long long count = -146097; count < 146097; ++count) {
        const auto seconds = static_cast<time_t>(count * day + 3661);
        std::tm parts{};
        ASSERT_NE(::gmtime_r(&seconds, &parts), nullptr);
        std::array<char, 64> expected{};
        std::strftime(expected.data(), expected.size(), "%Y-%m-%dT%H:%M:%S.000Z", &parts);
        ASSERT_EQ(utc(seconds), expected.data());
    }
}

}  // namespace
