#include "framework/logging/LineBuffer.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using ZBLog::LineBuffer;

std::string escaped(const std::string& text, std::size_t room = LineBuffer::capacity,
                    base::EscapeStyle style = base::EscapeStyle::logText) {
    LineBuffer line;
    line.putEscaped(text, room, style);
    return std::string(line.text());
}

struct Row {
    const char* description;
    std::string text;
    const char* expected;
};

const Row rows[] = {
    {"plain text", "MESSAGE [File: A, Line: 9]: B", "MESSAGE [File: A, Line: 9]: B"},
    {"umlauts and symbols", "Gr\xC3\xBC\xC3\x9F\xE2\x82\xAC\xF0\x9F\x98\x80",
     "Gr\xC3\xBC\xC3\x9F\xE2\x82\xAC\xF0\x9F\x98\x80"},
    {"newline and a forged line", "a\n2025-01-01T00:00:00.000Z 1 1 log",
     "a\\x0A2025-01-01T00:00:00.000Z 1 1 log"},
    {"return", "a\rb", "a\\x0Db"},
    {"tab", "a\tb", "a\\x09b"},
    {"NUL", std::string("a\0b", 3), "a\\x00b"},
    {"terminal title", "\x1b]0;x\x07", "\\x1B]0;x\\x07"},
    {"DEL", "\x7f", "\\x7F"},
    {"C1 in two bytes",
     "\xC2\x9B"
     "2J",
     "\\xC2\\x9B2J"},
    {"C1 in one byte",
     "\x9b"
     "2J",
     "\\x9B2J"},
    {"backslash", "C:\\x41", "C:\\\\x41"},
    {"line separator",
     "a\xE2\x80\xA8"
     "b",
     "a\\xE2\\x80\\xA8b"},
    {"overlong newline", "\xC0\x8A", "\\xC0\\x8A"},
    {"character cut at the end", "a\xE2\x82", "a\\xE2\\x82"},
    {"lead byte before a letter", "\xE2(", "\\xE2("},
};

TEST(LineBuffer, EscapesWhatCouldLeaveItsLine) {
    for (const Row& row : rows) EXPECT_EQ(escaped(row.text), row.expected) << row.description;
}

TEST(LineBuffer, EscapesBlanksWhereAsked) {
    EXPECT_EQ(escaped("a b", 6, base::EscapeStyle::logField), "a\\x20b");
}

TEST(LineBuffer, CutsBetweenCharactersAndMarksTheCut) {
    EXPECT_EQ(escaped("0123456789", 10), "0123456789");
    EXPECT_EQ(escaped("0123456789a", 10), "012345\\...");
    EXPECT_EQ(escaped("01234\xE2\x82\xAC"
                      "89a",
                      10),
              "01234\\...");
    EXPECT_EQ(escaped("012345678\n", 10), "012345\\...");
    EXPECT_EQ(escaped("01234\n56", 10), "01234\\...");
    EXPECT_EQ(escaped("0123\\\\\\\\", 10), "0123\\\\\\...");
    EXPECT_EQ(escaped("\n\n\n", 4), "\\...");
    EXPECT_EQ(escaped("\n", 4), "\\x0A");
    EXPECT_EQ(escaped("\\", 2), "\\\\");
    EXPECT_EQ(escaped("abc", 2), "\\.");
}

TEST(LineBuffer, CutsHugeTextsWhereTheLineIsFull) {
    LineBuffer line;
    line.put("x ");
    line.putEscaped(std::string(1000000, 'a'));
    const std::string whole(line.line());
    EXPECT_EQ(whole.size(), 4095u);
    EXPECT_EQ(whole.substr(0, 4), "x aa");
    EXPECT_EQ(whole.substr(whole.size() - 6), "a\\...\n");
    EXPECT_EQ(line.lineAfterTornLine().size(), 4096u);
}

TEST(LineBuffer, LeavesOutPlainTextThatDoesNotFit) {
    LineBuffer line;
    line.put(std::string(5000, 'a'));
    line.put('b');
    EXPECT_EQ(line.text(), std::string(4094, 'a'));
    EXPECT_EQ(std::string(line.nulTerminated()).size(), 4094u);
}

TEST(LineBuffer, PrintsNumbersWithLeadingZeros) {
    LineBuffer line;
    line.putNumber(7);
    line.put(' ');
    line.putNumber(7, 3);
    line.put(' ');
    line.putNumber(12345, 3);
    line.put(' ');
    line.putNumber(-2147483648LL);
    EXPECT_EQ(line.text(), "7 007 12345 -2147483648");
}

TEST(LineBuffer, EndsItsLineAndBeginsOneAfterATornOne) {
    LineBuffer line;
    line.put("text");
    EXPECT_EQ(line.line(), "text\n");
    EXPECT_EQ(line.lineAfterTornLine(), "\ntext\n");
    EXPECT_EQ(line.text(), "text");
    EXPECT_STREQ(line.nulTerminated(), "text");
}

}  // namespace
