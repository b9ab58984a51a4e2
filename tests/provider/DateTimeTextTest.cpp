#include <gtest/gtest.h>

#include <cstdio>
#include <random>
#include <string>

#include "Linux/DateTimeText.h"

namespace {

using VA::OSStatusProvider::DateFields;
using VA::OSStatusProvider::DateTimeText;

std::string converted(const std::string& text, char sign, unsigned int minutes) {
    DateTimeText result;
    EXPECT_TRUE(printDateTime(result, VA::OSStatusProvider::scanDate(text.c_str()), sign, minutes));
    return result;
}

// What the C library's conversions make of a text, which is what decides.
std::string convertedByLibc(const std::string& text, char sign, unsigned int minutes) {
    unsigned int year = 0, month = 0, day = 0, hour = 0, minute = 0, second = 0;
    char separator = 0;
    std::sscanf(text.c_str(), "%4u %1c %2u %1c %2u %1c %2u %1c %2u %1c %2u", &year, &separator,
                &month, &separator, &day, &separator, &hour, &separator, &minute, &separator,
                &second);
    char result[128];
    std::snprintf(result, sizeof result, "%4u%02u%02u%02u%02u%02u.%06u%1c%03u", year, month, day,
                  hour, minute, second, 0U, sign, minutes);
    return std::string(result).substr(0, 25);
}

TEST(DateTimeText, PlainFormIsConvertedAsByTheCLibrary) {
    EXPECT_EQ(converted("2009-03-17-08:15:42", '-', 60), "20090317081542.000000-060");
    EXPECT_EQ(converted("0000-00-00-00:00:00", '+', 0), "   00000000000.000000+000");
    EXPECT_EQ(converted("9999-99-99-99:99:99", '+', 999), "99999999999999.000000+999");
}

TEST(DateTimeText, TextsNearThePlainFormAreConvertedAsByTheCLibrary) {
    const std::string plain = "2009-03-17-08:15:42";
    const std::string others = "0123456789-+ :/T\tx";
    std::mt19937 random(20261121);
    for (int round = 0; round < 200000; ++round) {
        std::string text = plain;
        for (auto change = random() % 4; change != 0; --change)
            text[random() % text.size()] = others[random() % others.size()];
        if (random() % 8 == 0) text.resize(random() % text.size());
        if (random() % 8 == 0) text.insert(random() % (text.size() + 1), 1, others[random() % 10]);
        const auto minutes = static_cast<unsigned int>(random() % (round % 4 == 0 ? 2000 : 1000));
        ASSERT_EQ(converted(text, '+', minutes), convertedByLibc(text, '+', minutes)) << text;
    }
}

}  // namespace
