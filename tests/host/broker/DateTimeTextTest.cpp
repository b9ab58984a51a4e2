#include "host/broker/DateTimeText.h"

#include <gtest/gtest.h>

namespace cmpihost {
namespace {

std::uint64_t microseconds(const char* text) {
    const auto binary = parseDateTime(text);
    return binary && binary->microseconds ? *binary->microseconds : ~std::uint64_t{0};
}

TEST(DateTimeText, AnInstantIsCountedFrom1970InUtc) {
    EXPECT_EQ(microseconds("19700101000000.000000+000"), 0u);
    EXPECT_EQ(microseconds("20000229123456.000007+000"), 951827696000007u);
    EXPECT_EQ(microseconds("99991231235959.999999+000"), 253402300799999999u);
}

TEST(DateTimeText, TheOffsetIsTakenOffTheLocalTime) {
    EXPECT_EQ(microseconds("19700101020000.000000+060"), 3600000000u);
    EXPECT_EQ(microseconds("19700101020000.000000-060"), 10800000000u);
}

TEST(DateTimeText, AnInstantBefore1970HasNoBinaryForm) {
    const auto binary = parseDateTime("19691231235959.999999+000");
    ASSERT_TRUE(binary);
    EXPECT_FALSE(binary->microseconds);
    EXPECT_FALSE(binary->interval);
    EXPECT_TRUE(parseDateTime("00010101000000.000000+000"));
}

TEST(DateTimeText, AnIntervalIsCountedInDays) {
    const auto binary = parseDateTime("00000001020304.000005:000");
    ASSERT_TRUE(binary);
    EXPECT_TRUE(binary->interval);
    EXPECT_EQ(binary->microseconds, 93784000005u);
    EXPECT_EQ(microseconds("99999999235959.999999:000"), 8639999999999999999u);
    EXPECT_EQ(microseconds("00000000000000.000000:000"), 0u);
}

TEST(DateTimeText, AsterisksStandForWholeFields) {
    EXPECT_EQ(microseconds("200001011200**.******+000"), 946728000000000u);
    EXPECT_FALSE(parseDateTime("2000010112003*.000000+000"));
}

TEST(DateTimeText, WhatIsNoDateTimeIsRefused) {
    for (const char* const text :
         {"", "20000101120000.000000+00", "20000101120000.000000+0000", "20000101120000,000000+000",
          "20000101120000.000000 000", "20001301120000.000000+000", "20000100120000.000000+000",
          "20000230120000.000000+000", "19000229120000.000000+000", "20000101240000.000000+000",
          "20000101126000.000000+000", "20000101120060.000000+000", "2000010112000x.000000+000",
          "00000101120000.000000+000", "00000001020304.000005:001", "00000001240304.000005:000",
          "2000010112000:.000000+000", "200001011/0000.000000+000"}) {
        EXPECT_FALSE(parseDateTime(text)) << text;
    }
}

TEST(DateTimeText, BinaryFormsAreWrittenInUtc) {
    EXPECT_EQ(formatDateTime(0, false), "19700101000000.000000+000");
    EXPECT_EQ(formatDateTime(951827696000007u, false), "20000229123456.000007+000");
    EXPECT_EQ(formatDateTime(4107542399999999u, false), "21000228235959.999999+000");
    EXPECT_EQ(formatDateTime(93784000005u, true), "00000001020304.000005:000");
}

TEST(DateTimeText, WhatHasNoTextIsRefused) {
    EXPECT_EQ(formatDateTime(253402300799999999u, false), "99991231235959.999999+000");
    EXPECT_FALSE(formatDateTime(253402300800000000u, false));
    EXPECT_EQ(formatDateTime(8639999999999999999u, true), "99999999235959.999999:000");
    EXPECT_FALSE(formatDateTime(8640000000000000000u, true));
    EXPECT_FALSE(formatDateTime(~std::uint64_t{0}, false));
}

TEST(DateTimeText, EveryDayOfFourCenturiesComesBackFromItsText) {
    constexpr std::uint64_t day = 86400000000u;
    for (std::uint64_t instant = 0; instant < 146097 * day; instant += day) {
        const auto text = formatDateTime(instant, false);
        ASSERT_TRUE(text);
        ASSERT_EQ(microseconds(text->c_str()), instant) << *text;
    }
}

}  // namespace
}  // namespace cmpihost
