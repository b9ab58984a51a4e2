#include "framework/instrumentation/Linux/Dates.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <ctime>
#include <limits>
#include <random>

namespace {

using VA::Linux::civilDateText;
using VA::Linux::zonedDateText;

TEST(CivilDate, NamesKnownInstants) {
    EXPECT_EQ(civilDateText(0), "1970-01-01-00:00:00");
    EXPECT_EQ(civilDateText(-1), "1969-12-31-23:59:59");
    EXPECT_EQ(civilDateText(951782399), "2000-02-28-23:59:59");
    EXPECT_EQ(civilDateText(951782400), "2000-02-29-00:00:00");
    EXPECT_EQ(civilDateText(1700000000), "2023-11-14-22:13:20");
    EXPECT_EQ(civilDateText(1709164799), "2024-02-28-23:59:59");
    EXPECT_EQ(civilDateText(1709251199), "2024-02-29-23:59:59");
    EXPECT_EQ(civilDateText(2147483648), "2038-01-19-03:14:08");
    EXPECT_EQ(civilDateText(4107542400), "2100-03-01-00:00:00");
    EXPECT_EQ(civilDateText(4294967296), "2106-02-07-06:28:16");
}

TEST(CivilDate, EndsWithTheFourDigitYears) {
    EXPECT_EQ(civilDateText(-62167219200), "0000-01-01-00:00:00");
    EXPECT_EQ(civilDateText(-62167219201), std::nullopt);
    EXPECT_EQ(civilDateText(253402300799), "9999-12-31-23:59:59");
    EXPECT_EQ(civilDateText(253402300800), std::nullopt);
    EXPECT_EQ(civilDateText(std::numeric_limits<std::int64_t>::max()), std::nullopt);
    EXPECT_EQ(civilDateText(std::numeric_limits<std::int64_t>::min()), std::nullopt);
}

TEST(CivilDate, AgreesWithTheCLibraryOnInstantsOfAllYears) {
    std::mt19937_64 random(20240229);
    std::uniform_int_distribution<std::int64_t> instants(-62167219200, 253402300799);
    static_assert(sizeof(std::time_t) == 8);
    for (int i = 0; i < 20000; ++i) {
        const std::time_t instant = instants(random);
        struct tm parts {};
        ASSERT_TRUE(::gmtime_r(&instant, &parts));
        char expected[80];
        std::snprintf(expected, sizeof expected, "%04d-%02d-%02d-%02d:%02d:%02d",
                      parts.tm_year + 1900, parts.tm_mon + 1, parts.tm_mday, parts.tm_hour,
                      parts.tm_min, parts.tm_sec);
        ASSERT_EQ(civilDateText(instant), expected) << instant;
    }
}

TEST(CivilDate, ZoneMovesTheTextByWholeMinutes) {
    EXPECT_EQ(zonedDateText(1700000000, 0), "2023-11-14-22:13:20");
    EXPECT_EQ(zonedDateText(1700000000, -3600), "2023-11-14-21:13:20");
    EXPECT_EQ(zonedDateText(1700000000, 18000), "2023-11-15-03:13:20");
    EXPECT_EQ(zonedDateText(1700000000, 50400), "2023-11-15-12:13:20");
    EXPECT_EQ(zonedDateText(1700000000, -45900), "2023-11-14-09:28:20");
    EXPECT_EQ(zonedDateText(1700000000, -19800), "2023-11-14-16:43:20");
}

TEST(CivilDate, PartsOfAMinuteAreCutTowardsZero) {
    EXPECT_EQ(zonedDateText(1700000000, 59), "2023-11-14-22:13:20");
    EXPECT_EQ(zonedDateText(1700000000, -59), "2023-11-14-22:13:20");
    EXPECT_EQ(zonedDateText(1700000000, -1172), "2023-11-14-21:54:20");
    EXPECT_EQ(zonedDateText(1700000000, 1172), "2023-11-14-22:32:20");
}

TEST(CivilDate, ZoneMayLeadAcrossTheEndOfTheCalendar) {
    EXPECT_EQ(zonedDateText(253402300799, 60), std::nullopt);
    EXPECT_EQ(zonedDateText(253402300799, -60), "9999-12-31-23:58:59");
    EXPECT_EQ(zonedDateText(std::numeric_limits<std::int64_t>::max(), 3600), std::nullopt);
    EXPECT_EQ(zonedDateText(std::numeric_limits<std::int64_t>::min(), -3600), std::nullopt);
    // An instant out of range stays out, even where the zone would bring it back.
    EXPECT_EQ(zonedDateText(253402300800, -60), std::nullopt);
    EXPECT_EQ(zonedDateText(-62167219201, 60), std::nullopt);
}

}  // namespace
