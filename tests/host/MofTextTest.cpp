#include "host/cli/MofText.h"

#include <gtest/gtest.h>

#include "host/mof/MofLexer.h"

namespace {

using namespace cmpihost;

TEST(MofText, EscapesQuotesBackslashesAndControls) {
    EXPECT_EQ(mofString("a\"b\\c\n\t\r\b\f"), R"("a\"b\\c\n\t\r\b\f")");
    EXPECT_EQ(mofString("\x1b"
                        "0"),
              R"("\x001B0")");
    EXPECT_EQ(mofString(std::string("\0", 1)), R"("\x0000")");
    EXPECT_EQ(mofString("\xC2\x9B"), R"("\x009B")");
}

TEST(MofText, KeepsUtf8AndReplacesOtherBytes) {
    EXPECT_EQ(mofString("\xC3\xA9\xFF"), "\"\xC3\xA9\xEF\xBF\xBD\"");
}

TEST(MofText, WritesCharacters) {
    EXPECT_EQ(mofCharacter('x'), "'x'");
    EXPECT_EQ(mofCharacter('"'), "'\"'");
    EXPECT_EQ(mofCharacter('\''), R"('\'')");
    EXPECT_EQ(mofCharacter(0x20AC), R"('\x20AC')");
    EXPECT_EQ(mofCharacter(0), R"('\x0000')");
    EXPECT_EQ(mofCharacter(0x1F), R"('\x001F')");
    EXPECT_EQ(mofCharacter(' '), "' '");
    EXPECT_EQ(mofCharacter('~'), "'~'");
    EXPECT_EQ(mofCharacter(0x7F), R"('\x007F')");
    EXPECT_EQ(mofCharacter(0x80), R"('\x0080')");
    EXPECT_EQ(mofString("\xC2\x9F\xC2\xA0"), "\"\\x009F\xC2\xA0\"");
}

TEST(MofText, IsReadBackByTheLexer) {
    const std::string text = std::string("q\" b\\ \n\t\x01\x7f \xC3\xA9 9\x1b") + "f" + '\0' + "0";
    const std::string written = mofString(text);
    mof::Lexer lexer(written, "x");
    EXPECT_EQ(lexer.next().text, text);
}

}  // namespace
