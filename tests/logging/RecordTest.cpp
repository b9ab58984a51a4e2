// A record's way into a line: the buffer that the line is put together in, and its fields.
#include "framework/logging/Record.h"

#include <gtest/gtest.h>
#include <syslog.h>

#include <string>

namespace {

using namespace ZBLog;
using base::EscapeStyle;

std::string escaped(const std::string& text, std::size_t room = LineBuffer::capacity,
                    EscapeStyle style = EscapeStyle::logText) {
    LineBuffer line;
    line.putEscaped(text, room, style);
    return std::string(line.text());
}

TEST(LineBuffer, EscapesWhatCouldLeaveItsLine) {
    EXPECT_EQ(escaped("a b\\\n\xC3\x9F"), "a b\\\\\\x0A\xC3\x9F");
    EXPECT_EQ(escaped("a b", 6, EscapeStyle::logField), "a\\x20b");
}

TEST(LineBuffer, CutsBetweenCharactersAndMarksTheCut) {
    const struct {
        const char* text;
        std::size_t room;
        const char* expected;
    } rows[] = {
        {"0123456789", 10, "0123456789"},
        {"0123456789a", 10, "012345\\..."},
        {"01234\xE2\x82\xAC"
         "89a",
         10, "01234\\..."},
        {"012345678\n", 10, "012345\\..."},
        {"01234\n56", 10, "01234\\..."},
        {"0123\\\\\\\\", 10, "0123\\\\\\..."},
        {"\n\n\n", 4, "\\..."},
        {"\n", 4, "\\x0A"},
        {"\\", 2, "\\\\"},
        {"abc", 2, "\\."},
        {"abc", 0, ""},
    };
    for (const auto& row : rows) EXPECT_EQ(escaped(row.text, row.room), row.expected);
}

TEST(LineBuffer, CutsHugeTextsWhereTheLineIsFull) {
    LineBuffer line;
    line.put("x ");
    line.putEscaped(std::string(1000000, 'a'));
    EXPECT_EQ(line.line(), "x " + std::string(4088, 'a') + "\\...\n");
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

std::string lineOf(const Record& record, timespec instant = {1709251199, 123456789}) {
    LineBuffer line;
    formatLine(line, record, {instant, 4711, 4713});
    return std::string(line.line());
}

TEST(RecordLine, HoldsEveryFieldInOrder) {
    const std::string cut = std::string(252, 'n') + "\\...";
    const std::string name(10000, 'n');
    const struct {
        Record record;
        std::string afterTheThread;
    } rows[] = {
        {{Channel::log, "OperatingSystem_GetInstance", "OperatingSystemProvider.cpp", 77,
          "Zumbrel.OperatingSystemProvider", 4000, "METHOD: B() was invoked"},
         "log 4000 Zumbrel.OperatingSystemProvider OperatingSystem_GetInstance "
         "OperatingSystemProvider.cpp:77 METHOD: B() was invoked\n"},
        {{Channel::trace, "f", "F.cpp", 1, "C", 3000, "text"}, "trace 3000 C f F.cpp:1 text\n"},
        // Names that are missing, forged, or so long that the text would have no room.
        {{Channel::log, nullptr, nullptr, -1, "", -5, ""}, "log -5 - - -:-1 \n"},
        {{Channel::log, "", "", 0, "", 0, ""}, "log 0 - - -:0 \n"},
        {{Channel::log, "f g", "F\n.cpp", 1, "C D", 3000, "a\nb"},
         "log 3000 C\\x20D f\\x20g F\\x0A.cpp:1 a\\x0Ab\n"},
        {{Channel::log, name.c_str(), name.c_str(), 1, name, 3000, "the text"},
         "log 3000 " + cut + " " + cut + " " + cut + ":1 the text\n"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(lineOf(row.record), "2024-02-29T23:59:59.123Z 4711 4713 " + row.afterTheThread);
    }
}

TEST(RecordLine, BeginsWithItsTimeInUtcWithMilliseconds) {
    const struct {
        timespec instant;
        const char* expected;
    } rows[] = {
        {{0, 0}, "1970-01-01T00:00:00.000Z "},
        {{1709251199, 7000000}, "2024-02-29T23:59:59.007Z "},
        {{-1, 500000000}, "1969-12-31T23:59:59.500Z "},
        {{253402300799, 0}, "9999-12-31T23:59:59.000Z "},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(lineOf({Channel::log, "f", "F.cpp", 1, "C", 3000, ""}, row.instant).substr(0, 25),
                  row.expected);
    }
}

TEST(RecordLine, HoldsTheLongestTextOfTheProviderWhole) {
    std::string whole = "2024-02-29T23:59:59.123Z 4711 4713 log 3000 C f F.cpp:1 ";
    for (int count = 0; count < 511; ++count) whole += "\\x0A";
    EXPECT_EQ(lineOf({Channel::log, "f", "F.cpp", 1, "C", 3000, std::string(511, '\n')}),
              whole + "\n");
}

TEST(RecordLine, NamesTheProgramInTheSystemsLog) {
    LineBuffer line;
    formatForSystemLog(line, {Channel::log, "f", "F.cpp", 12, "Zumbrel.OSStatusProvider", 3000,
                              "MESSAGE [File: F.cpp, Line: 12]: 100%s\n"});
    EXPECT_STREQ(line.nulTerminated(),
                 "korva-osstatus: log 3000 Zumbrel.OSStatusProvider f F.cpp:12 "
                 "MESSAGE [File: F.cpp, Line: 12]: 100%s\\x0A");
}

TEST(RecordLine, RanksFailuresAboveEverythingElseInTheSystemsLog) {
    const struct {
        int level;
        const char* text;
        int severity;
    } rows[] = {
        {3000, "MESSAGE [File: A, Line: 9]: B", LOG_ERR},
        {4000, "MESSAGE [File: A, Line: 9]: B", LOG_WARNING},
        {3000, "ENTERING: G() in A [Line: 3]", LOG_INFO},
        {3001, "ENTERING: G() in A [Line: 3]", LOG_DEBUG},
        {4000, "ENTERING: G() in A [Line: 3]", LOG_DEBUG},
        {3000, " MESSAGE [", LOG_INFO},
        {3000, "MESSAGE", LOG_INFO},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(systemLogPriority({Channel::log, "f", "F.cpp", 1, "C", row.level, row.text}),
                  LOG_DAEMON | row.severity)
            << row.level << " " << row.text;
    }
}

}  // namespace
