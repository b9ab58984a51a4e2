#include "host/mof/Utf8.h"

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
    for (const std::uint32_t code : {0xD800U, 0xDFFFU, 0x110000U, 0xFFFFFFFFU}) {
        EXPECT_EQ(encoded(code), "\xEF\xBF\xBD") << code;
    }
}

TEST(Utf8, ReadsBackWhatItWrote) {
    for (std::uint32_t code = 0; code <= 0x10FFFF; ++code) {
        if (code < 0xD800 || code > 0xDFFF) {
            const std::string text = encoded(code);
            ASSERT_EQ(firstCodePoint(text), code);
            ASSERT_EQ(characterLength(text, 0), text.size()) << code;
        }
    }
}

TEST(Utf8, TakesNeitherOverlongFormsNorSurrogatesNorCutCharacters) {
    for (const char* text : {"\xC0\x80",
                             "\xC1\xBF",
                             "\xE0\x9F\xBF",
                             "\xF0\x8F\xBF\xBF",
                             "\xED\xA0\x80",
                             "\xED\xBF\xBF",
                             "\xF4\x90\x80\x80",
                             "\xF5\x80\x80\x80",
                             "\xFF",
                             "\x80",
                             "\xBF",
                             "\xC3",
                             "\xC3\x7F",
                             "\xC3\xC0",
                             "\xE2\x82",
                             "\xE2\x7F\x80",
                             "\xE2\xC0\x80",
                             "\xE2\x82\x7F",
                             "\xE2\x82\xC0",
                             "\xF1\x80\x80",
                             "\xF1\x80\x80\x7F",
                             "\xF1\x80\x80\xC0"}) {
        EXPECT_EQ(characterLength(text, 0), 0U) << validUtf8(text);
        EXPECT_EQ(firstCodePoint(text), 0xFFFDU);
    }
    EXPECT_EQ(characterLength("", 0), 0U);
}

TEST(Utf8, ReplacesEveryByteThatIsNoCharacter) {
    EXPECT_EQ(validUtf8("a\xFF\xC3\xA9\xC3"), "a\xEF\xBF\xBD\xC3\xA9\xEF\xBF\xBD");
    EXPECT_EQ(countCharacters("a\xFF\xC3\xA9"), 3U);
}

}  // namespace
