#include "host/cli/ValueText.h"

#include <gtest/gtest.h>
#include <stdlib.h>
#include <time.h>

namespace {

using namespace cmpihost;

TEST(ReadableSize, ChoosesTheLargestUnitThatLeavesAtLeastOne) {
    EXPECT_EQ(humanReadableSize(0), "0 KiB");
    EXPECT_EQ(humanReadableSize(1023), "1023 KiB");
    EXPECT_EQ(humanReadableSize(1024), "1.0 MiB");
    EXPECT_EQ(humanReadableSize(1536), "1.5 MiB");
    EXPECT_EQ(humanReadableSize(8123456), "7.7 GiB");
    EXPECT_EQ(humanReadableSize(4294967295), "4.0 TiB");
    EXPECT_EQ(humanReadableSize(18446744073709551615U), "16.0 ZiB");
}

TEST(ReadableSize, RoundsIntoTheNextUnit) {
    EXPECT_EQ(humanReadableSize(1024 * 1024 - 1), "1.0 GiB");
    EXPECT_EQ(humanReadableSize(1023 * 1024), "1023.0 MiB");
    EXPECT_EQ(humanReadableSize(1024 + 972), "1.9 MiB");
    EXPECT_EQ(humanReadableSize(1024 + 973), "2.0 MiB");
}

class ReadableDateTime : public testing::Test {
  protected:
    void SetUp() override { setZone("UTC0"); }
    void TearDown() override { setZone("UTC0"); }
    static void setZone(const char* zone) {
        setenv("TZ", zone, 1);
        tzset();
    }
};

TEST_F(ReadableDateTime, ShowsAnInstantInTheZoneOfTheReader) {
    EXPECT_EQ(humanReadableDateTime("20240102030405.000000+000"), "2024-01-02 03:04:05 +00:00");
    setZone("CET-1");
    EXPECT_EQ(humanReadableDateTime("20240102030405.000000+000"), "2024-01-02 04:04:05 +01:00");
    setZone("NST3:30");
    EXPECT_EQ(humanReadableDateTime("20240102030405.000000+000"), "2024-01-01 23:34:05 -03:30");
}

TEST_F(ReadableDateTime, TakesTheOffsetOffTheDigits) {
    EXPECT_EQ(humanReadableDateTime("20240102080405.000000+300"), "2024-01-02 03:04:05 +00:00");
    EXPECT_EQ(humanReadableDateTime("20240101213405.000000-330"), "2024-01-02 03:04:05 +00:00");
}

TEST_F(ReadableDateTime, ShowsAYearBeyondThirtyTwoBits) {
    EXPECT_EQ(humanReadableDateTime("21060708091011.000000+000"), "2106-07-08 09:10:11 +00:00");
}

TEST_F(ReadableDateTime, ShowsIntervals) {
    EXPECT_EQ(humanReadableDateTime("00000003040506.000000:000"), "3 days 04:05:06");
    EXPECT_EQ(humanReadableDateTime("00000001000000.000000:000"), "1 day 00:00:00");
}

TEST_F(ReadableDateTime, SaysNothingAboutATextThatIsNone) {
    for (const char* text :
         {"", "yesterday", "   00000000000.000000+000", "20241302030405.000000+000",
          "2024010203****.000000+000", "20240102030405.000000", "19691231235959.000000+000"}) {
        EXPECT_EQ(humanReadableDateTime(text), "") << text;
    }
}

TEST(RealText, IsTheShortestThatGivesTheNumberBack) {
    EXPECT_EQ(realText(0.1, CMPI_real64), "0.1");
    EXPECT_EQ(realText(static_cast<double>(0.1F), CMPI_real32), "0.1");
    EXPECT_EQ(realText(-2.5, CMPI_real64), "-2.5");
}

TEST(CharacterText, IsUtf8) {
    EXPECT_EQ(characterText(0x20AC), "\xE2\x82\xAC");
}

}  // namespace
