#include "base/CivilTime.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <limits>
#include <ostream>
#include <random>
#include <tuple>

namespace base {

static bool operator==(const CivilTime& one, const CivilTime& other) {
    const auto fields = [](const CivilTime& time) {
        return std::tie(time.year, time.month, time.day, time.hour, time.minute, time.second);
    };
    return fields(one) == fields(other);
}

static std::ostream& operator<<(std::ostream& out, const CivilTime& time) {
    return out << time.year << '-' << time.month << '-' << time.day << ' ' << time.hour << ':'
               << time.minute << ':' << time.second;
}

namespace {

constexpr std::int64_t secondsPerDay = 86400;

TEST(CivilTime, KnownInstantsHaveTheirFieldsAndComeBackFromThem) {
    const struct {
        std::int64_t seconds;
        CivilTime time;
    } rows[] = {
        {0, {1970, 1, 1, 0, 0, 0}},
        {-1, {1969, 12, 31, 23, 59, 59}},
        {951782399, {2000, 2, 28, 23, 59, 59}},
        {951782400, {2000, 2, 29, 0, 0, 0}},
        {951868800, {2000, 3, 1, 0, 0, 0}},
        {978307199, {2000, 12, 31, 23, 59, 59}},
        {1709251199, {2024, 2, 29, 23, 59, 59}},
        {2147483648, {2038, 1, 19, 3, 14, 8}},
        {4107542399, {2100, 2, 28, 23, 59, 59}},
        {4107542400, {2100, 3, 1, 0, 0, 0}},
        {-62135596800, {1, 1, 1, 0, 0, 0}},
        {-62162035200, {0, 3, 1, 0, 0, 0}},
        {-62162035201, {0, 2, 29, 23, 59, 59}},
        {-62167219200, {0, 1, 1, 0, 0, 0}},
        {-62167219201, {-1, 12, 31, 23, 59, 59}},
        {253402300799, {9999, 12, 31, 23, 59, 59}},
        {253402300800, {10000, 1, 1, 0, 0, 0}},
        {std::numeric_limits<std::int64_t>::max(), {292277026596, 12, 4, 15, 30, 7}},
        {std::numeric_limits<std::int64_t>::min(), {-292277022657, 1, 27, 8, 29, 52}},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(civilFromSeconds(row.seconds), row.time) << row.seconds;
        if (std::abs(row.time.year) <= 1000000000) {
            EXPECT_EQ(secondsFromCivil(row.time), row.seconds) << row.time;
        }
    }
}

CivilTime byTheCLibrary(std::int64_t seconds) {
    static_assert(sizeof(std::time_t) == 8);
    const std::time_t instant = seconds;
    std::tm parts{};
    EXPECT_NE(::gmtime_r(&instant, &parts), nullptr);
    return {std::int64_t{parts.tm_year} + 1900,
            parts.tm_mon + 1,
            parts.tm_mday,
            parts.tm_hour,
            parts.tm_min,
            parts.tm_sec};
}

TEST(CivilTime, AgreesWithTheCLibraryOnEveryDayOfEightCenturies) {
    for (std::int64_t day = -146097; day < 146097; ++day) {
        const std::int64_t seconds = day * secondsPerDay + 3661;
        const CivilTime time = civilFromSeconds(seconds);
        ASSERT_EQ(time, byTheCLibrary(seconds)) << seconds;
        ASSERT_EQ(secondsFromCivil(time), seconds) << time;
    }
}

TEST(CivilTime, AgreesWithTheCLibraryOnInstantsOfAllYears) {
    std::mt19937_64 random(20240229);
    std::uniform_int_distribution<std::int64_t> instants(-secondsPerDay * 365 * 20000,
                                                         secondsPerDay * 365 * 20000);
    for (int i = 0; i < 20000; ++i) {
        const std::int64_t seconds = instants(random);
        const CivilTime time = civilFromSeconds(seconds);
        ASSERT_EQ(time, byTheCLibrary(seconds)) << seconds;
        ASSERT_EQ(secondsFromCivil(time), seconds) << time;
    }
}

TEST(CivilTime, FieldsPastTheirEndCountOn) {
    EXPECT_EQ(secondsFromCivil({2000, 2, 31, 0, 0, 0}), secondsFromCivil({2000, 3, 2, 0, 0, 0}));
    EXPECT_EQ(secondsFromCivil({1999, 12, 31, 23, 59, 60}),
              secondsFromCivil({2000, 1, 1, 0, 0, 0}));
}

TEST(CivilTime, MonthsHaveTheirLengths) {
    constexpr int lengths[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
    for (int month = 1; month <= 12; ++month)
        EXPECT_EQ(daysInMonth(2023, month), lengths[month - 1]) << month;
    for (const int leap : {-400, -4, 0, 4, 1996, 2000, 2024, 2400})
        EXPECT_EQ(daysInMonth(leap, 2), 29) << leap;
    for (const int common : {-100, -1, 1, 1900, 2001, 2002, 2003, 2100, 2200, 2300})
        EXPECT_EQ(daysInMonth(common, 2), 28) << common;
}

}  // namespace
}  // namespace base
