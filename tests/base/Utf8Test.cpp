#include "base/Utf8.h"

#include <gtest/gtest.h>

namespace base {

static void PrintTo(const Utf8Char& character, std::ostream* stream) {
    *stream << character.length << " bytes, U+" << std::hex << std::uint32_t{character.codePoint};
}

static bool operator==(const Utf8Char& one, const Utf8Char& other) {
    return one.length == other.length && one.codePoint == other.codePoint &&
           one.valid == other.valid;
}

}  // namespace base

namespace {

using namespace base;

std::string encoded(char32_t code) {
    std::string text;
    appendUtf8(text, code);
    return text;
}

TEST(Utf8, WritesTheReplacementForWhatIsNoCharacter) {
    for (const char32_t code : {0xD800U, 0xDFFFU, 0x110000U, 0xFFFFFFFFU}) {
        EXPECT_EQ(encoded(code), "\xEF\xBF\xBD") << std::uint32_t{code};
    }
}

TEST(Utf8, ReadsBackEveryCharacterThatItWrote) {
    for (char32_t code = 0; code <= 0x10FFFF; ++code) {
        if (code >= 0xD800 && code <= 0xDFFF) continue;
        const std::string text = encoded(code);
        ASSERT_EQ(decodeUtf8(text), (Utf8Char{text.size(), code, true}));
    }
}

TEST(Utf8, ReadsTheFirstCharacterAndNotItsNeighbour) {
    const struct {
        std::string text;
        Utf8Char first;
    } rows[] = {
        {" x", {1, ' ', true}},
        {std::string(1, '\0'), {1, 0, true}},
        {"\xC2\xA0z", {2, 0xA0, true}},
        {"\xDF\xBF\xBF", {2, 0x7FF, true}},
        {"\xE0\xA0\x80\x80", {3, 0x800, true}},
        {"\xED\x9F\xBF", {3, 0xD7FF, true}},
        {"\xEF\xBF\xBD", {3, 0xFFFD, true}},
        {"\xF0\x90\x80\x80", {4, 0x10000, true}},
        {"\xF4\x8F\xBF\xBF\xBF", {4, 0x10FFFF, true}},
    };
    for (const auto& row : rows) EXPECT_EQ(decodeUtf8(row.text), row.first);
}

TEST(Utf8, TakesNeitherOverlongFormsNorSurrogatesNorCutCharacters) {
    const std::string none[] = {// longer than need be
                                "\xC0\x80", "\xC0\x8A", "\xC1\x81", "\xC1\xBF", "\xE0\x80\x8A",
                                "\xE0\x9F\xBF", "\xF0\x80\x80\x8A", "\xF0\x8F\xBF\xBF",
                                // surrogates, and what lies past the last character
                                "\xED\xA0\x80", "\xED\xBF\xBF", "\xF4\x90\x80\x80",
                                "\xF5\x80\x80\x80", "\xF8\x88\x80\x80\x80", "\xFF",
                                // a start or a continuation is missing
                                "\x80", "\xBF", "\xC3", "\xC3\x7F", "\xC3\xC0", "\xE2\x82",
                                "\xE2\x7F\x80", "\xE2\xC0\x80", "\xE2\x82\x41", "\xE2\x82\x7F",
                                "\xE2\x82\xC0", "\xF0\x9F\x98", "\xF1\x80\x80", "\xF1\x80\x80\x7F",
                                "\xF1\x80\x80\xC0", "\xF0\x9F\x98\xFF"};
    for (const std::string& text : none) {
        EXPECT_EQ(decodeUtf8(text), (Utf8Char{1, replacementCharacter, false}))
            << toValidUtf8(text);
    }
}

TEST(Utf8, LooksAtNoByteBehindTheText) {
    for (const std::string_view character : {"\xC3\xA9", "\xE2\x82\xAC", "\xF0\x9F\x98\x80"}) {
        for (std::size_t length = 1; length < character.size(); ++length) {
            EXPECT_FALSE(decodeUtf8(character.substr(0, length)).valid);
        }
    }
}

TEST(Utf8, TakesOneCharacterOrOneBadByteAtATime) {
    std::string_view rest = "\xFF\xC3\xA9\xC3";
    EXPECT_EQ(takeUtf8(rest), (Utf8Char{1, replacementCharacter, false}));
    EXPECT_EQ(takeUtf8(rest), (Utf8Char{2, 0xE9, true}));
    EXPECT_EQ(rest, "\xC3");
    EXPECT_EQ(takeUtf8(rest), (Utf8Char{1, replacementCharacter, false}));
    EXPECT_EQ(rest, "");
}

TEST(Utf8, ReplacesAndCountsEveryByteThatIsNoCharacter) {
    EXPECT_EQ(toValidUtf8("a\xFF\xC3\xA9\xC3"), "a\xEF\xBF\xBD\xC3\xA9\xEF\xBF\xBD");
    EXPECT_EQ(countUtf8("a\xFF\xC3\xA9"), 3U);
    EXPECT_EQ(countUtf8(""), 0U);
}

TEST(Utf8, KnowsWhichBytesBeginCharacters) {
    for (const char byte : {'\0', 'a', '\x7F', '\xC0', '\xFF'}) EXPECT_TRUE(startsUtf8(byte));
    for (const char byte : {'\x80', '\xA9', '\xBF'}) EXPECT_FALSE(startsUtf8(byte));
}

/// Each class at its borders, with the neighbours.
TEST(CharClass, IsTheOneOfItsRange) {
    using C = CharClass;
    const struct {
        char32_t first, last;
        CharClass itsClass;
    } ranges[] = {
        {0, 0x1F, C::control},
        {0x20, 0x7E, C::printable},
        {0x7F, 0x9F, C::control},
        {0xA0, 0x200A, C::printable},
        {0x200B, 0x200D, C::invisible},
        {0x200E, 0x200F, C::layout},
        {0x2010, 0x2027, C::printable},
        {0x2028, 0x202E, C::layout},
        {0x202F, 0x205F, C::printable},
        {0x2060, 0x2064, C::invisible},
        {0x2065, 0x2065, C::printable},
        {0x2066, 0x2069, C::layout},
        {0x206A, 0xFEFE, C::printable},
        {0xFEFF, 0xFEFF, C::invisible},
        {0xFF00, 0x10FFFF, C::printable},
    };
    for (const auto& range : ranges) {
        for (const char32_t code : {range.first, range.last}) {
            EXPECT_EQ(classOf(code), range.itsClass) << std::uint32_t{code};
            EXPECT_EQ(isPrintable({1, code, true}), range.itsClass == C::printable);
        }
    }
    EXPECT_FALSE(isPrintable({1, 'a', false}));
}

TEST(Escape, WritesOutWhatTheStyleDoesNotLetStand) {
    const struct {
        std::string text;
        std::string logText, logField, terminal, ascii;
    } rows[] = {
        {"", "", "", "", ""},
        {"a~\"'", "a~\"'", "a~\"'", "a~\"'", "a~\"'"},
        {"a b", "a b",
         "a\\x20"
         "b",
         "a b", "a b"},
        {"\\", "\\\\", "\\\\", "\\", "\\"},
        {"\n\t\r", "\\x0A\\x09\\x0D", "\\x0A\\x09\\x0D", "\\n\\t\\r", "\\x0A\\x09\\x0D"},
        {{"\0", 1}, "\\x00", "\\x00", "\\x00", "\\x00"},
        {"\x1b[31m", "\\x1B[31m", "\\x1B[31m", "\\x1b[31m", "\\x1B[31m"},
        {"\x7f", "\\x7F", "\\x7F", "\\x7f", "\\x7F"},
        // C1 controls: terminals take the character for one byte.
        {"\xC2\x9B", "\\xC2\\x9B", "\\xC2\\x9B", "\\x9b", "\\xC2\\x9B"},
        {"\xC3\xA9", "\xC3\xA9", "\xC3\xA9", "\xC3\xA9", "\\xC3\\xA9"},
        {"\xF0\x9F\x98\x80", "\xF0\x9F\x98\x80", "\xF0\x9F\x98\x80", "\xF0\x9F\x98\x80",
         "\\xF0\\x9F\\x98\\x80"},
        // The blank of no width, the override of direction.
        {"\xE2\x80\x8B", "\\xE2\\x80\\x8B", "\\xE2\\x80\\x8B", "\xE2\x80\x8B", "\\xE2\\x80\\x8B"},
        {"\xE2\x80\xAE", "\\xE2\\x80\\xAE", "\\xE2\\x80\\xAE", "\\u202e", "\\xE2\\x80\\xAE"},
        {"\xFFx\xC3", "\\xFFx\\xC3", "\\xFFx\\xC3", "\\xffx\\xc3", "\\xFFx\\xC3"},
        {"\xEF\xBF\xBD", "\xEF\xBF\xBD", "\xEF\xBF\xBD", "\xEF\xBF\xBD", "\\xEF\\xBF\\xBD"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(escape(row.text, EscapeStyle::logText), row.logText);
        EXPECT_EQ(escape(row.text, EscapeStyle::logField), row.logField);
        EXPECT_EQ(escapeForTerminal(row.text), row.terminal);
        EXPECT_EQ(escape(row.text, EscapeStyle::ascii), row.ascii);
    }
}

TEST(EscapedChar, TellsWhatItStandsFor) {
    const EscapedChar character("\xE2\x80\xAEx", EscapeStyle::terminal);
    EXPECT_EQ(character.length(), 3U);
    EXPECT_EQ(character.written(), "\\u202e");
}

}  // namespace
