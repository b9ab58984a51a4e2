#include "host/TerminalText.h"

#include <gtest/gtest.h>

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

TEST(TerminalText, WritesOutWhatTurnsTheDirectionOfWriting) {
    EXPECT_EQ(terminalText("a\xE2\x80\xAE"
                           "b"),
              "a\\u202eb");
}

TEST(TerminalText, WritesOutBytesThatAreNoCharacters) {
    EXPECT_EQ(terminalText("\xFFx"), "\\xffx");
}

}  // namespace
