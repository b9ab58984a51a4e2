#include "framework/instrumentation/Linux/Parsing.h"

#include <gtest/gtest.h>

namespace {

using VA::Linux::envFileValue;

struct Case {
    const char* description;
    const char* text;
    std::optional<std::string> value;  // of NAME
};

void PrintTo(const Case& c, std::ostream* out) {
    *out << c.description;
}

class AssignedValue : public testing::TestWithParam<Case> {};

TEST_P(AssignedValue, IsUnquotedAsAShellWould) {
    EXPECT_EQ(envFileValue(GetParam().text, "NAME"), GetParam().value);
}

const Case cases[] = {
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
};

INSTANTIATE_TEST_SUITE_P(Forms, AssignedValue, testing::ValuesIn(cases));

TEST(Assignments, ZeroBytesElsewhereDoNotHideAValue) {
    const std::string text("A=\0\0\0\nNAME=B\n\0\0", 15);
    EXPECT_EQ(envFileValue(text, "NAME"), "B");
}

TEST(Assignments, LineOfAMegabyteIsOneValue) {
    const std::string value(1024 * 1024, 'x');
    EXPECT_EQ(envFileValue("NAME=\"" + value + "\"\nVERSION_ID=1\n", "NAME"), value);
    EXPECT_EQ(envFileValue("NAME=\"" + value + "\"\nVERSION_ID=1\n", "VERSION_ID"), "1");
}

}  // namespace
