#include "host/mof/MofLexer.h"

#include <gtest/gtest.h>

#include "host/mof/MofLexer.h"

namespace {

using namespace cmpihost;

TEST(MofText, EscapesQuotesBackslashesAndControls) {
    EXPECT_EQ(mof::stringLiteral("a\"b\\c\n\t\r\b\f"), R"("a\"b\\c\n\t\r\b\f")");
    EXPECT_EQ(mof::stringLiteral("\x1b"
                        "0"),
              R"("\x001B0")");
    EXPECT_EQ(mof::stringLiteral(std::string("\0", 1)), R"("\x0000")");
    EXPECT_EQ(mof::stringLiteral("\xC2\x9B"), R"("\x009B")");
}

TEST(MofText, KeepsUtf8AndReplacesOtherBytes) {
    EXPECT_EQ(mof::stringLiteral("\xC3\xA9\xFF"), "\"\xC3\xA9\xEF\xBF\xBD\"");
}

TEST(MofText, WritesCharacters) {
    EXPECT_EQ(mof::characterLiteral('x'), "'x'");
    EXPECT_EQ(mof::characterLiteral('"'), "'\"'");
    EXPECT_EQ(mof::characterLiteral('\''), R"('\'')");
    EXPECT_EQ(mof::characterLiteral(0x20AC), R"('\x20AC')");
    EXPECT_EQ(mof::characterLiteral(0), R"('\x0000')");
    EXPECT_EQ(mof::characterLiteral(0x1F), R"('\x001F')");
    EXPECT_EQ(mof::characterLiteral(' '), "' '");
    EXPECT_EQ(mof::characterLiteral('~'), "'~'");
    EXPECT_EQ(mof::characterLiteral(0x7F), R"('\x007F')");
    EXPECT_EQ(mof::characterLiteral(0x80), R"('\x0080')");
    EXPECT_EQ(mof::stringLiteral("\xC2\x9F\xC2\xA0"), "\"\\x009F\xC2\xA0\"");
}

TEST(MofText, IsReadBackByTheLexer) {
    const std::string text = std::string("q\" b\\ \n\t\x01\x7f \xC3\xA9 9\x1b") + "f" + '\0' + "0";
    const std::string written = mof::stringLiteral(text);
    mof::Lexer lexer(written, "x");
    EXPECT_EQ(lexer.next().text, text);
}

}  // namespace
