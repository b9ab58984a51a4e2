// Terminals of every width and locale, and texts on them.
#include "host/cli/Terminal.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <stdlib.h>

#include "support/PseudoTerminal.h"

namespace {

using namespace cmpihost;

TEST(Terminal, IsAsWideAsItSaysElseAsTheEnvironmentSaysElseAsTerminalsUsuallyAre) {
    const PseudoTerminal terminal;
    setenv("COLUMNS", "50", 1);
    terminal.setColumns(132);
    EXPECT_EQ(terminalOf(terminal.number()).width, 132U);
    terminal.setColumns(0);
    EXPECT_EQ(terminalOf(terminal.number()).width, 50U);
    setenv("COLUMNS", "many", 1);
    EXPECT_EQ(terminalOf(terminal.number()).width, 80U);
    unsetenv("COLUMNS");
    EXPECT_EQ(terminalOf(terminal.number()).width, 80U);
}

TEST(Terminal, HasNoWidthWhereThereIsNone) {
    setenv("COLUMNS", "50", 1);
    const auto file = base::FileDescriptor::open("/dev/null", O_WRONLY);
    EXPECT_EQ(terminalOf(file.number()).width, 0U);
    EXPECT_EQ(terminalOf(-1).width, 0U);
    unsetenv("COLUMNS");
}

TEST(Terminal, HasTheLocaleOfTheFirstVariableThatSaysOne) {
    const struct {
        const char* all;
        const char* type;
        const char* lang;
        bool utf8;
    } rows[] = {{"", "", "", false},          {"", "", "C.UTF-8", true},
                {"", "", "de_DE.utf8", true}, {"", "", "de_DE@euro", false},
                {"", "C", "C.UTF-8", false},  {"POSIX", "C.UTF-8", "C.UTF-8", false},
                {"C.UTF-8", "C", "", true},   {"", "sr_RS.UTF-8@latin", "C", true}};
    for (const auto& row : rows) {
        setenv("LC_ALL", row.all, 1);
        setenv("LC_CTYPE", row.type, 1);
        setenv("LANG", row.lang, 1);
        EXPECT_EQ(terminalOf(-1).utf8, row.utf8) << row.all << '|' << row.type << '|' << row.lang;
    }
    for (const char* name : {"LC_ALL", "LC_CTYPE", "LANG"}) unsetenv(name);
    EXPECT_FALSE(terminalOf(-1).utf8);
}

TEST(Terminal, ShowsNothingThatItCannot) {
    const std::string written = "caf\u00e9\x1b[31m \U0001f600\xff";
    EXPECT_EQ((Terminal{80, true}.shown(written)), "caf\u00e9\\x1b[31m \U0001f600\\xff");
    EXPECT_EQ((Terminal{80, false}.shown(written)), "caf\\u00e9\\x1b[31m \\U0001f600\\xff");
    EXPECT_EQ((Terminal{0, false}.shown(written)), "caf\u00e9\\x1b[31m \U0001f600\\xff");
}

TEST(ColumnsOf, CountsWideCharactersTwiceAndCombiningMarksNot) {
    EXPECT_EQ(columnsOf(""), 0U);
    EXPECT_EQ(columnsOf("caf\u00e9"), 4U);
    EXPECT_EQ(columnsOf("cafe\u0301"), 4U);
    EXPECT_EQ(columnsOf("\u65e5\u672c"), 4U);
    EXPECT_EQ(columnsOf("\U0001f600"), 2U);
    EXPECT_EQ(columnsOf("a\u200bb"), 2U);
}

TEST(Wrap, BreaksAtBlanksAndAlignsWhatFollows) {
    const std::string words = "one two three four five six seven";
    EXPECT_EQ(wrap(words, 0), words);
    EXPECT_EQ(wrap(words, 33), words);
    EXPECT_EQ(wrap(words, 32), "one two three four five six\nseven");
    EXPECT_EQ(wrap(words, 24, 4), "one two three four\n    five six seven");
    EXPECT_EQ(wrap(words, 23, 4), words) << "hardly any room";
    EXPECT_EQ(wrap("one two three\nfour", 24, 4), "one two three\n    four");
    EXPECT_EQ(wrap(" a  b ", 24), " a  b ");
    EXPECT_EQ(wrap("", 24), "");
}

TEST(Wrap, LeavesAWordThatIsTooLongInOnePiece) {
    EXPECT_EQ(wrap("see root/cimv2:Machine.Name=\"m\" there", 20),
              "see\nroot/cimv2:Machine.Name=\"m\"\nthere");
}

TEST(Wrap, CountsColumnsAndNotBytes) {
    EXPECT_EQ(wrap("\u00e9\u00e9\u00e9\u00e9\u00e9\u00e9\u00e9\u00e9\u00e9\u00e9 123456789", 20),
              "\u00e9\u00e9\u00e9\u00e9\u00e9\u00e9\u00e9\u00e9\u00e9\u00e9 123456789");
    EXPECT_EQ(wrap("\u65e5\u672c\u65e5\u672c\u65e5 1234567890", 20),
              "\u65e5\u672c\u65e5\u672c\u65e5\n1234567890");
}

}  // namespace
