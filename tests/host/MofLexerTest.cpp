#include "host/mof/MofLexer.h"

#include <gmock/gmock.h>

namespace {

using cmpihost::mof::Character;
using cmpihost::mof::Lexer;
using cmpihost::mof::MofError;
using cmpihost::mof::Scalar;
using cmpihost::mof::Token;
using cmpihost::mof::TokenKind;

Token only(const std::string& text) {
    Lexer lexer(text, "x.mof");
    Token token = lexer.next();
    EXPECT_EQ(lexer.next().kind, TokenKind::End) << text;
    return token;
}

TEST(MofLexer, ReadsNumbersOfEveryBase) {
    EXPECT_EQ(only("42").value, Scalar(std::uint64_t{42}));
    EXPECT_EQ(only("+42").value, Scalar(std::uint64_t{42}));
    EXPECT_EQ(only("-42").value, Scalar(std::int64_t{-42}));
    EXPECT_EQ(only("0x1F").value, Scalar(std::uint64_t{31}));
    EXPECT_EQ(only("017").value, Scalar(std::uint64_t{15}));
    EXPECT_EQ(only("101b").value, Scalar(std::uint64_t{5}));
    EXPECT_EQ(only("0").value, Scalar(std::uint64_t{0}));
    EXPECT_EQ(only("0x1e").value, Scalar(std::uint64_t{30}));
    EXPECT_EQ(only("0X1F").value, Scalar(std::uint64_t{31}));
    EXPECT_EQ(only("11B").value, Scalar(std::uint64_t{3}));
    EXPECT_EQ(only("-0").value, Scalar(std::int64_t{0}));
}

TEST(MofLexer, ReadsTheLargestAndTheLeastInteger) {
    EXPECT_EQ(only("18446744073709551615").value, Scalar(std::uint64_t{18446744073709551615U}));
    EXPECT_EQ(only("-9223372036854775808").value, Scalar(std::int64_t{INT64_MIN}));
}

TEST(MofLexer, ReadsReals) {
    EXPECT_EQ(only("1.5").value, Scalar(1.5));
    EXPECT_EQ(only("-2.5e+3").value, Scalar(-2500.0));
    EXPECT_EQ(only(".25").value, Scalar(0.25));
    EXPECT_EQ(only("2.5E-1").value, Scalar(0.25));
}

TEST(MofLexer, EndsANumberBeforeASignThatIsNotOfItsExponent) {
    for (const char* text : {"0x1e+2", "0X1E+2", "30+2", "30.5+2"}) {
        Lexer lexer(text, "x.mof");
        lexer.next();
        EXPECT_EQ(lexer.next().value, Scalar(std::uint64_t{2})) << text;
    }
}

TEST(MofLexer, TakesLettersDigitsUnderscoresAndAllBeyondAsciiForNames) {
    for (const char* name : {"azAZ09_", "zA", "_", "ZeA", "\xC2\x80"}) {
        EXPECT_EQ(only(name).kind, TokenKind::Identifier) << name;
        EXPECT_EQ(only(name).text, name);
    }
    for (const std::string text : {"a[", "a`", "a@", "a{", "a/", "a:"}) {
        Lexer lexer(text, "x.mof");
        EXPECT_EQ(lexer.next().text, "a") << text;
    }
}

TEST(MofLexer, ReadsNoFurtherThanItsText) {
    const std::string_view text = "a/*b";
    Lexer name(text.substr(0, 1), "x.mof");
    EXPECT_EQ(name.next().text, "a");
    EXPECT_EQ(name.next().kind, TokenKind::End);
    Lexer slash(text.substr(0, 2), "x.mof");
    slash.next();
    EXPECT_THROW(slash.next(), MofError);
}

TEST(MofLexer, ResolvesEscapesInStrings) {
    EXPECT_EQ(only(R"("a\"b\\c\n\t\r\b\f\'")").text, "a\"b\\c\n\t\r\b\f'");
    EXPECT_EQ(only(R"("\x41\x00e9\xE9!")").text, "A\xC3\xA9\xC3\xA9!");
}

TEST(MofLexer, KeepsTheBytesOfStringsAsTheyAre) {
    EXPECT_EQ(only("\"\xC3\xA9\xFF\"").text, "\xC3\xA9\xFF");
}

TEST(MofLexer, ReadsCharacters) {
    EXPECT_EQ(only("'x'").value, Scalar(Character{'x'}));
    EXPECT_EQ(only("'\\''").value, Scalar(Character{'\''}));
    EXPECT_EQ(only("'\\x20AC'").value, Scalar(Character{0x20AC}));
    EXPECT_EQ(only("'\xE2\x82\xAC'").value, Scalar(Character{0x20AC}));
}

TEST(MofLexer, PassesOverCommentsBlanksAndTheByteOrderMark) {
    EXPECT_EQ(only(" \t\r\n\f\v/*/ one */ name").text, "name");
    const Token token = only("\xEF\xBB\xBF // one\n /* two\n ** */ name /**/ // end");
    EXPECT_EQ(token.text, "name");
    EXPECT_EQ(token.position.line, 3U);
    EXPECT_EQ(token.position.column, 8U);
}

TEST(MofLexer, CountsColumnsInCharacters) {
    Lexer lexer("\"\xC3\xA9\xC3\xA9\" x", "x.mof");
    lexer.next();
    EXPECT_EQ(lexer.next().position.column, 6U);
}

TEST(MofLexer, AnswersTheEndAgainAndAgain) {
    Lexer lexer("", "x.mof");
    EXPECT_EQ(lexer.next().kind, TokenKind::End);
    EXPECT_EQ(lexer.next().kind, TokenKind::End);
}

struct LexerError {
    const char* text;
    const char* message;
};

TEST(MofLexer, SaysWhereATextIsNoMof) {
    const LexerError rows[] = {
        {"\"abc", "x.mof:1:1: the string that begins here is not closed by '\"' on its line"},
        {"  \"abc\n\"", "x.mof:1:3: the string that begins here is not closed by '\"' on its line"},
        {"\"a\\q\"",
         "x.mof:1:3: expected one of \\b \\t \\n \\f \\r \\\" \\' \\\\ \\x in the string"},
        {"\"a\\", "x.mof:1:3: expected one of \\b \\t \\n \\f \\r \\\" \\' \\\\ \\x in the string"},
        {"\"\\xg\"", "x.mof:1:4: expected one to four hexadecimal digits after '\\x'"},
        {"'ab'", "x.mof:1:1: expected exactly one character between two '"},
        {"''", "x.mof:1:1: expected exactly one character between two '"},
        {"'a", "x.mof:1:1: the character that begins here is not closed by ' on its line"},
        {"\n /* ", "x.mof:2:2: the comment that begins here is never closed by '*/'"},
        {"@", "x.mof:1:1: the character '@' has no meaning here"},
        {"/x", "x.mof:1:1: the character '/' has no meaning here"},
        {"12ab", "x.mof:1:1: expected a number, found '12ab'"},
        {"089", "x.mof:1:1: expected a number, found '089'"},
        {"0x", "x.mof:1:1: expected a number, found '0x'"},
        {"-", "x.mof:1:1: expected a number, found '-'"},
        {"--1", "x.mof:1:1: expected a number, found '-'"},
        {"1.2.3", "x.mof:1:1: expected a number, found '1.2.3'"},
        {"18446744073709551616", "x.mof:1:1: the number 18446744073709551616 does not fit 64 bits"},
        {"-9223372036854775809", "x.mof:1:1: the number -9223372036854775809 does not fit 64 bits"},
        {"1.0e999", "x.mof:1:1: the number 1.0e999 does not fit 64 bits"},
    };
    for (const LexerError& row : rows) {
        try {
            Lexer lexer(row.text, "x.mof");
            lexer.next();
            ADD_FAILURE() << "no error in " << row.text;
        } catch (const MofError& error) {
            EXPECT_STREQ(error.what(), row.message);
        }
    }
}

TEST(MofLexer, SurvivesANulByte) {
    const std::string text("a\0b", 3);
    Lexer lexer(text, "x.mof");
    EXPECT_EQ(lexer.next().text, "a");
    EXPECT_THROW(lexer.next(), MofError);
}

}  // namespace
