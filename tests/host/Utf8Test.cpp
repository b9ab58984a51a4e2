#include "host/Utf8.h"

#include <gtest/gtest.h>

namespace {

using namespace cmpihost;

std::string encoded(std::uint32_t code) {
    std::string text;
    appendUtf8(text, code);
    return text;
}

TEST(Utf8, WritesOneToFourBytes) {
    EXPECT_EQ(encoded('A'), "A");
    EXPECT_EQ(encoded(0xE9), "\xC3\xA9");
    EXPECT_EQ(encoded(0x20AC), "\xE2\x82\xAC");
    EXPECT_EQ(encoded(0x1F600), "\xF0\x9F\x98\x80");
}

TEST(Utf8, WritesTheReplacementForWhatIsNoCharacter) {
    EXPECT_EQ(encoded(0xD800), "\xEF\xBF\xBD");
    EXPECT_EQ(encoded(0x110000), "\xEF\xBF\xBD");
}

TEST(Utf8, ReadsBackWhatItWrote) {
    for (const std::uint32_t code : {0x41U, 0x7FU, 0x80U, 0x7FFU, 0x800U, 0xFFFDU, 0x10FFFFU}) {
        EXPECT_EQ(firstCodePoint(encoded(code)), code);
        EXPECT_EQ(characterLength(encoded(code), 0), encoded(code).size());
    }
}

TEST(Utf8, TakesNeitherOverlongFormsNorSurrogatesNorCutCharacters) {
    for (const char* text : {"\xC0\x80", "\xE0\x80\x80", "\xED\xA0\x80", "\xF4\x90\x80\x80", "\xFF",
                             "\x80", "\xE2\x82", "\xC3"}) {
        EXPECT_EQ(characterLength(text, 0), 0U) << text;
    }
    EXPECT_EQ(characterLength("", 0), 0U);
}

TEST(Utf8, ReplacesEveryByteThatIsNoCharacter) {
    EXPECT_EQ(validUtf8("a\xFF\xC3\xA9\xC3"), "a\xEF\xBF\xBD\xC3\xA9\xEF\xBF\xBD");
    EXPECT_EQ(countCharacters("a\xFF\xC3\xA9"), 3U);
}

}  // namespace
