#include "host/cli/TerminalText.h"

#include <gtest/gtest.h>

#include "host/mof/Utf8.h"

namespace {

using cmpihost::terminalText;

TEST(TerminalText, LeavesOrdinaryTextAlone) {
    EXPECT_EQ(terminalText("Debian GNU/Linux \\ \"12\" \xC3\xA9"),
              "Debian GNU/Linux \\ \"12\" \xC3\xA9");
}

TEST(TerminalText, WritesControlCharactersOut) {
    EXPECT_EQ(terminalText("a\nb\tc\rd"), "a\\nb\\tc\\rd");
    EXPECT_EQ(terminalText("\x1b[31mred\x07\x7f"), "\\x1b[31mred\\x07\\x7f");
    EXPECT_EQ(terminalText(std::string("a\0b", 3)), "a\\x00b");
    EXPECT_EQ(terminalText("\xC2\x9B"
                           "31m"),
              "\\x9b31m");
}

TEST(TerminalText, WritesOutWhatSteersTheTerminalOrTheLayoutAndNoNeighbourOfIt) {
    const struct {
        std::uint32_t code;
        const char* written;  // null: the character itself
    } rows[] = {{0x1F, "\\x1f"},     {0x20, nullptr},     {0x7E, nullptr},     {0x7F, "\\x7f"},
                {0x80, "\\x80"},     {0x9F, "\\x9f"},     {0xA0, nullptr},     {0x200D, nullptr},
                {0x200E, "\\u200e"}, {0x200F, "\\u200f"}, {0x2010, nullptr},   {0x2027, nullptr},
                {0x2028, "\\u2028"}, {0x202A, "\\u202a"}, {0x202E, "\\u202e"}, {0x202F, nullptr},
                {0x2065, nullptr},   {0x2066, "\\u2066"}, {0x2069, "\\u2069"}, {0x206A, nullptr}};
    for (const auto& row : rows) {
        std::string character;
        cmpihost::appendUtf8(character, row.code);
        EXPECT_EQ(terminalText("a" + character + "b"),
                  "a" + (row.written == nullptr ? character : row.written) + "b")
            << row.code;
    }
}

TEST(TerminalText, WritesOutBytesThatAreNoCharacters) {
    EXPECT_EQ(terminalText("\xFFx"), "\\xffx");
}

}  // namespace
