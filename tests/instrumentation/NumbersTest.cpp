#include "framework/instrumentation/Linux/Parsing.h"

#include <gtest/gtest.h>

#include "framework/instrumentation/Linux/Dates.h"

namespace {

using namespace VA::Linux;

TEST(Numbers, DecimalTextIsReadUpToTheLast64BitNumber) {
    EXPECT_EQ(parseDecimal("0"), 0u);
    EXPECT_EQ(parseDecimal("007"), 7u);
    EXPECT_EQ(parseDecimal("4294967296"), 4294967296u);
    EXPECT_EQ(parseDecimal("18446744073709551615"), 18446744073709551615u);
    EXPECT_EQ(parseDecimal("18446744073709551616"), std::nullopt);
    EXPECT_EQ(parseDecimal("99999999999999999999999999"), std::nullopt);
}

TEST(Numbers, TextThatIsNotAllDigitsIsNoNumber) {
    for (const char* text :
         {"", " ", "-1", "+1", " 1", "1 ", "1\n", "1.5", "0x10", "1e3", "self"}) {
        EXPECT_EQ(parseDecimal(text), std::nullopt) << '"' << text << '"';
    }
}

TEST(Numbers, NumberFileHoldsOnePositiveNumber) {
    EXPECT_EQ(parseNumberFile("32768\n"), 32768u);
    for (const char* text : {"", "\n", "0\n", "32768\n\n", "32768 \n", "1\t2\n", "max\n", "-1\n"}) {
        EXPECT_EQ(parseNumberFile(text), std::nullopt) << '"' << text << '"';
    }
}

TEST(Numbers, NumberFileThatWasCutShortGivesNoNumber) {
    for (const char* text : {"3", "32", "327", "3276", "32768"})
        EXPECT_EQ(parseNumberFile(text), std::nullopt) << text;
}

TEST(Numbers, LargeValuesSaturateAndNeverWrap) {
    EXPECT_EQ(clampToUint32(0), 0u);
    EXPECT_EQ(clampToUint32(4294967294u), 4294967294u);
    EXPECT_EQ(clampToUint32(4294967295u), 4294967295u);
    EXPECT_EQ(clampToUint32(4294967296u), 4294967295u);
    EXPECT_EQ(clampToUint32(18446744073709551615u), 4294967295u);
    EXPECT_EQ(clampedSum(4294967290u, 5u), 4294967295u);
    EXPECT_EQ(clampedSum(4294967290u, 6u), 4294967295u);
    EXPECT_EQ(clampedSum(4294967295u, 4294967295u), 4294967295u);
}

TEST(BootTime, IsTheNumberOfTheBtimeLine) {
    EXPECT_EQ(parseBootTime("cpu  1 2\nbtime 1700000000\nprocesses 1\n"), 1700000000);
    EXPECT_EQ(parseBootTime("btime 18\n"), 18);
    EXPECT_EQ(parseBootTime("btime 4102444800\n"), 4102444800);
}

TEST(BootTime, IsNotKnownFromALineThatIsNotWhole) {
    for (const char* text :
         {"", "btime", "btime ", "btime \n", "btime x\n", "btime -5\n", "btime 0\n", "btime 17000",
          "cpu\nbtime 1700000000", "xbtime 17\n", "btime 9223372036854775808\n",
          "btime 99999999999999999999999\n", "btime 17 18\n"}) {
        EXPECT_EQ(parseBootTime(text), std::nullopt) << '"' << text << '"';
    }
}

TEST(BootTime, IsFoundBehindAnInterruptLineOfHundredsOfKilobytes) {
    std::string text = "intr 1";
    for (int i = 0; i < 200000; ++i) text += " 0";
    EXPECT_EQ(parseBootTime(text + "\nbtime 1700000000\n"), 1700000000);
}

}  // namespace
