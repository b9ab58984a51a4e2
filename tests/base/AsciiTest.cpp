#include "base/Ascii.h"

#include <gtest/gtest.h>

namespace {

using namespace base;

TEST(Ascii, KnowsDigitsAndLettersByTheirBorders) {
    for (const char c : {'0', '9'}) EXPECT_TRUE(isDigit(c)) << c;
    for (const char c : {'/', ':', 'a', '\xB2', '\0'}) EXPECT_FALSE(isDigit(c)) << c;
    for (const char c : {'a', 'z', 'A', 'Z'}) EXPECT_TRUE(isAlpha(c)) << c;
    for (const char c : {'@', '[', '`', '{', '0', '_', '\xE9', '\0'}) EXPECT_FALSE(isAlpha(c)) << c;
}

TEST(Ascii, PutsItsLettersAloneInLowerCase) {
    EXPECT_EQ(toLower("@AZ[`az{_09\xC3\x89"), "@az[`az{_09\xC3\x89");
    EXPECT_EQ(toLower(""), "");
}

TEST(Ascii, ComparesNamesWithoutTheCaseOfItsLetters) {
    EXPECT_TRUE(equalsIgnoreCase("", ""));
    EXPECT_TRUE(equalsIgnoreCase("CSName_9\xC3\x89", "csnAME_9\xC3\x89"));
    EXPECT_FALSE(equalsIgnoreCase("\xC3\x89", "\xC3\xA9"));
    EXPECT_FALSE(equalsIgnoreCase("[", "{"));
    EXPECT_FALSE(equalsIgnoreCase("Name", "Names"));
    EXPECT_FALSE(equalsIgnoreCase("Names", "Name"));
}

}  // namespace
