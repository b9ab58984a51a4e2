#include "framework/instrumentation/Linux/Parsing.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

namespace {

using namespace VA::Linux;
using namespace std::string_literals;

TEST(Lines, AreVisitedInOrderEachToldWhetherItEnded) {
    const auto linesOf = [](std::string_view text) {
        std::string found;
        forEachLine(text, [&](std::string_view line, bool ended) {
            found += '[' + std::string(line) + (ended ? "]" : "…");
        });
        return found;
    };
    EXPECT_EQ(linesOf(""), "");
    EXPECT_EQ(linesOf("\n"), "[]");
    EXPECT_EQ(linesOf("a\n\nb"), "[a][][b…");
    EXPECT_EQ(linesOf("a\nb\n"), "[a][b]");
}

TEST(Numbers, AreTextsOfDigitsUpToTheLast64BitNumber) {
    const std::pair<const char*, std::uint64_t> rows[] = {
        {"0", 0}, {"007", 7}, {"4294967296", 4294967296}, {"18446744073709551615", ~0ULL}};
    for (const auto& [text, value] : rows) EXPECT_EQ(parseDecimal(text), value);
    for (const char* text : {"18446744073709551616", "99999999999999999999999999", "", " ", "-1",
                             "+1", " 1", "1 ", "1\n", "1.5", "0x10", "1e3", "self", "1:"}) {
        EXPECT_EQ(parseDecimal(text), std::nullopt) << '"' << text << '"';
    }
}

TEST(Numbers, PastTheLargest32BitOneAreClampedAndNeverWrap) {
    const std::pair<std::uint64_t, std::uint32_t> rows[] = {
        {0, 0}, {4294967294, 4294967294}, {4294967295, ~0U}, {4294967296, ~0U}, {~0ULL, ~0U}};
    for (const auto& [value, clamped] : rows) EXPECT_EQ(clampToUint32(value), clamped);
    EXPECT_EQ(clampedSum(4294967290u, 4u), 4294967294u);
    EXPECT_EQ(clampedSum(4294967290u, 5u), 4294967295u);
    EXPECT_EQ(clampedSum(4294967290u, 6u), 4294967295u);
    EXPECT_EQ(clampedSum(4294967295u, 4294967295u), 4294967295u);
}

std::string times(int count, const std::string& text) {
    std::string all;
    for (int i = 0; i < count; ++i) all += text;
    return all;
}

TEST(PlainText, IsWordsInAnyScriptOfUpTo256CharactersWithoutControls) {
    for (const std::string& text : {"a"s, "12 (x)"s, " a"s, "Größe"s, "龍蜥"s, "\xf0\x9f\x90\xa7"s,
                                    "\xc2\xa0"s, times(256, "x"), times(256, "ö")})
        EXPECT_TRUE(isPlainText(text)) << text;
    for (const std::string& text :
         {""s, " "s, "    "s, times(257, "x"), times(257, "ö"), "a\0b"s, "a\tb"s, "a\nb"s,
          "\x1b[31m"s, "\x7f"s, "\xc2\x80"s, "\xc2\x9f"s, "\xff"s, "a\xe2\x82"s, "\xed\xa0\x80"s})
        EXPECT_FALSE(isPlainText(text)) << testing::PrintToString(text);
}

TEST(EnvFile, ValueIsUnquotedAsAShellWould) {
    const struct {
        const char* description;
        std::string text;
        std::optional<std::string> value;  // of NAME
    } rows[] = {
        {"bare", "NAME=Fedora\n", "Fedora"},
        {"no newline at the end", "NAME=Fedora", "Fedora"},
        {"carriage return", "NAME=Fedora\r\n", "Fedora"},
        {"bare with blanks inside", "NAME=Arch Linux\n", "Arch Linux"},
        {"bare with blanks at the end", "NAME=Arch  \t\n", "Arch"},
        {"bare with escapes", "NAME=A\\ B\\$\\\\\\\n", std::nullopt},
        {"bare with whole escapes", "NAME=A\\ B\\$\\\\\n", "A B$\\"},
        {"bare with an escaped blank at the end", "NAME=A\\ \n", "A "},
        {"bare with a comment", "NAME=A # the name\n", "A"},
        {"bare with a number sign inside", "NAME=A#1\n", "A#1"},
        {"bare that begins with a number sign", "NAME=#1\n", "#1"},
        {"bare with a quote inside", "NAME=A\"B\"\n", std::nullopt},
        {"double quotes", "NAME=\"Debian GNU/Linux\"\n", "Debian GNU/Linux"},
        {"double quotes, escapes", R"(NAME="a \"b\" \$c \`d\` \\e")", R"(a "b" $c `d` \e)"},
        {"double quotes, backslash before another character", R"(NAME="a\nb")", R"(a\nb)"},
        {"double quotes, single quotes inside", "NAME=\"it's\"\n", "it's"},
        {"double quotes, comment behind", "NAME=\"A\" # b\n", "A"},
        {"double quotes, text behind", "NAME=\"A\"B\n", std::nullopt},
        {"double quotes, number sign right behind", "NAME=\"A\"#\n", std::nullopt},
        {"double quotes, not closed", "NAME=\"A\n", std::nullopt},
        {"double quotes, the closing one escaped", "NAME=\"A\\\"\n", std::nullopt},
        {"double quotes, backslash at the very end", "NAME=\"A\\", std::nullopt},
        {"double quotes, empty", "NAME=\"\"\n", ""},
        {"single quotes", "NAME='a \"b\" \\c $d'\n", "a \"b\" \\c $d"},
        {"single quotes, not closed", "NAME='A\n", std::nullopt},
        {"single quotes, text behind", "NAME='A'x\n", std::nullopt},
        {"empty", "NAME=\n", ""},
        {"blank behind the equals sign", "NAME= A\n", std::nullopt},
        {"blank before the equals sign", "NAME =A\n", std::nullopt},
        {"indented", "  NAME=A\n", "A"},
        {"last one wins", "NAME=A\nNAME=B\n", "B"},
        {"last well-formed one wins", "NAME=A\nNAME=\"B\n", "A"},
        {"comment", "#NAME=A\n # NAME=B\n", std::nullopt},
        {"longer name", "PRETTY_NAME=A\nNAMES=B\n", std::nullopt},
        {"other case", "name=A\n", std::nullopt},
        {"no equals sign", "NAME\n", std::nullopt},
        {"only the equals sign", "=A\n", std::nullopt},
        {"empty file", "", std::nullopt},
        {"empty lines around", "\n\n\nNAME=A\n\n\n", "A"},
        {"UTF-8", "NAME=\"Größe\"\n", "Größe"},
        {"zero bytes elsewhere", "A=\0\0\0\nNAME=B\n\0\0"s, "B"},
        {"a line of a megabyte", "NAME=\"" + times(1 << 20, "x") + "\"\n", times(1 << 20, "x")},
        {"behind a line of a megabyte", "A=" + times(1 << 20, "x") + "\nNAME=B\n", "B"},
    };
    for (const auto& row : rows) {
        // No EXPECT_EQ: it would print the megabyte.
        EXPECT_TRUE(envFileValue(row.text, "NAME") == row.value)
            << row.description << ": "
            << testing::PrintToString(envFileValue(row.text, "NAME")).substr(0, 200);
    }
}

}  // namespace
