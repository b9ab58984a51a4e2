#include "host/mof/MofLexer.h"

#include <gmock/gmock.h>

namespace {

using namespace cmpihost::mof;

Token firstOf(std::string_view text) {
    return Lexer(text, "x.mof").next();
}

Token only(const std::string& text) {
    Lexer lexer(text, "x.mof");
    Token token = lexer.next();
    EXPECT_EQ(lexer.next().kind, TokenKind::End) << text;
    return token;
}

Scalar natural(std::uint64_t number) {
    return number;
}

TEST(MofLexer, ReadsNumbersOfEveryBaseAndSize) {
    const struct {
        const char* text;
        Scalar value;
    } rows[] = {{"42", natural(42)},
                {"+42", natural(42)},
                {"-42", std::int64_t{-42}},
                {"-0", std::int64_t{0}},
                {"0", natural(0)},
                {"0x1F", natural(31)},
                {"0X1F", natural(31)},
                {"0x1e", natural(30)},
                {"017", natural(15)},
                {"101b", natural(5)},
                {"11B", natural(3)},
                {"18446744073709551615", natural(UINT64_MAX)},
                {"-9223372036854775808", std::int64_t{INT64_MIN}},
                {"1.5", 1.5},
                {"-2.5e+3", -2500.0},
                {".25", 0.25},
                {"2.5E-1", 0.25}};
    for (const auto& row : rows) EXPECT_EQ(only(row.text).value, row.value) << row.text;
}

TEST(MofLexer, EndsANumberBeforeASignThatIsNotOfItsExponent) {
    for (const char* text : {"0x1e+2", "0X1E+2", "30+2", "30.5+2"}) {
        Lexer lexer(text, "x.mof");
        lexer.next();
        EXPECT_EQ(lexer.next().value, natural(2)) << text;
    }
}

TEST(MofLexer, TakesLettersDigitsUnderscoresAndAllBeyondAsciiForNames) {
    for (const char* name : {"azAZ09_", "zA", "_", "ZeA", "\xC2\x80"}) {
        EXPECT_EQ(only(name).kind, TokenKind::Identifier) << name;
        EXPECT_EQ(only(name).text, name);
    }
    for (const char* text : {"a[", "a`", "a@", "a{", "a/", "a:"})
        EXPECT_EQ(firstOf(text).text, "a") << text;
}

TEST(MofLexer, ReadsNoFurtherThanItsText) {
    const std::string_view text = "a/*b";
    Lexer name(text.substr(0, 1), "x.mof");
    EXPECT_EQ(name.next().text, "a");
    for (int again = 0; again < 2; ++again) EXPECT_EQ(name.next().kind, TokenKind::End);
    Lexer slash(text.substr(0, 2), "x.mof");
    slash.next();
    EXPECT_THROW(slash.next(), MofError);
    const std::string_view nul("a\0b", 3);
    Lexer pastNul(nul, "x.mof");
    EXPECT_EQ(pastNul.next().text, "a");
    EXPECT_THROW(pastNul.next(), MofError);
}

TEST(MofLexer, ResolvesEscapesInStringsAndKeepsOtherBytes) {
    EXPECT_EQ(only(R"("a\"b\\c\n\t\r\b\f\'")").text, "a\"b\\c\n\t\r\b\f'");
    EXPECT_EQ(only(R"("\x41\x00e9\xE9\X4a!")").text, "A\xC3\xA9\xC3\xA9J!");
    EXPECT_EQ(only("\"\xC3\xA9\xFF\"").text, "\xC3\xA9\xFF");
}

TEST(MofLexer, ReadsCharacters) {
    EXPECT_EQ(only("'x'").value, Scalar(Character{'x'}));
    EXPECT_EQ(only("'\\''").value, Scalar(Character{'\''}));
    EXPECT_EQ(only("'\\x20AC'").value, Scalar(Character{0x20AC}));
    EXPECT_EQ(only("'\xE2\x82\xAC'").value, Scalar(Character{0x20AC}));
}

TEST(MofLexer, PassesOverCommentsBlanksAndTheByteOrderMarkAndCountsCharacters) {
    EXPECT_EQ(only(" \t\r\n\f\v/*/ one */ name").text, "name");
    const Token token = only("\xEF\xBB\xBF // one\n /* two\n ** */ name /**/ // end");
    EXPECT_EQ(token.text, "name");
    EXPECT_EQ(token.position.line, 3U);
    EXPECT_EQ(token.position.column, 8U);
    Lexer lexer("\"\xC3\xA9\xC3\xA9\" x", "x.mof");
    lexer.next();
    EXPECT_EQ(lexer.next().position.column, 6U);
}

TEST(MofLexer, SaysWhereATextIsNoMof) {
    const struct {
        const char* text;
        const char* message;
    } rows[] = {
        {"\"abc", "1:1: the string that begins here is not closed by '\"' on its line"},
        {"  \"abc\n\"", "1:3: the string that begins here is not closed by '\"' on its line"},
        {"\"a\\q\"", "1:3: expected one of \\b \\t \\n \\f \\r \\\" \\' \\\\ \\x in the string"},
        {"\"a\\", "1:3: expected one of \\b \\t \\n \\f \\r \\\" \\' \\\\ \\x in the string"},
        {"'\\q'", "1:2: expected one of \\b \\t \\n \\f \\r \\\" \\' \\\\ \\x in the character"},
        {"\"\\xg\"", "1:4: expected one to four hexadecimal digits after '\\x'"},
        {"'ab'", "1:1: expected exactly one character between two '"},
        {"''", "1:1: expected exactly one character between two '"},
        {"'a", "1:1: the character that begins here is not closed by ' on its line"},
        {"\n /* ", "2:2: the comment that begins here is never closed by '*/'"},
        {"@", "1:1: the character '@' has no meaning here"},
        {"/x", "1:1: the character '/' has no meaning here"},
        {"12ab", "1:1: expected a number, found '12ab'"},
        {"089", "1:1: expected a number, found '089'"},
        {"0x", "1:1: expected a number, found '0x'"},
        {"-", "1:1: expected a number, found '-'"},
        {"--1", "1:1: expected a number, found '-'"},
        {"1.2.3", "1:1: expected a number, found '1.2.3'"},
        {"18446744073709551616", "1:1: the number 18446744073709551616 does not fit 64 bits"},
        {"-9223372036854775809", "1:1: the number -9223372036854775809 does not fit 64 bits"},
        {"1.0e999", "1:1: the number 1.0e999 does not fit 64 bits"},
    };
    for (const auto& row : rows) {
        try {
            firstOf(row.text);
            ADD_FAILURE() << "no error in " << row.text;
        } catch (const MofError& error) {
            EXPECT_EQ(error.what(), std::string("x.mof:") + row.message);
        }
    }
}

TEST(MofLiterals, EscapeQuotesBackslashesControlsAndWhatIsNoCharacter) {
    const struct {
        std::string text;
        const char* literal;
    } rows[] = {{"a\"b'\\c\n\t\r\b\f", R"("a\"b'\\c\n\t\r\b\f")"},
                {"\x1b"
                 "0",
                 R"("\x001B0")"},
                {{'\0'}, R"("\x0000")"},
                {"\xC2\x9B", R"("\x009B")"},
                {"\xC2\x9F\xC2\xA0", "\"\\x009F\xC2\xA0\""},
                {"\xC3\xA9\xFF", "\"\xC3\xA9\xEF\xBF\xBD\""}};
    for (const auto& row : rows) EXPECT_EQ(stringLiteral(row.text), row.literal);
}

TEST(MofLiterals, WriteCharactersInPrintableAscii) {
    const struct {
        char32_t code;
        const char* literal;
    } rows[] = {{'x', "'x'"},       {'"', "'\"'"},         {'\'', R"('\'')"},
                {'\\', R"('\\')"},  {'\n', R"('\n')"},     {0x20AC, R"('\x20AC')"},
                {0, R"('\x0000')"}, {0x1F, R"('\x001F')"}, {' ', "' '"},
                {'~', "'~'"},       {0x7F, R"('\x007F')"}, {0x80, R"('\x0080')"}};
    for (const auto& row : rows) EXPECT_EQ(characterLiteral(row.code), row.literal);
}

TEST(MofLiterals, AreReadBackByTheLexer) {
    const std::string text = std::string("q\" b\\ \n\t\x01\x7f \xC3\xA9 9\x1b") + "f" + '\0' + "0";
    EXPECT_EQ(only(stringLiteral(text)).text, text);
}

}  // namespace
