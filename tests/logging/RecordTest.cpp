#include "framework/logging/Record.h"

#include <gtest/gtest.h>
#include <syslog.h>

#include <string>

namespace {

using ZBLog::Channel;
using ZBLog::LineBuffer;
using ZBLog::Record;

std::string lineOf(const Record& record, timespec instant = {1709251199, 123456789}) {
    LineBuffer line;
    ZBLog::formatLine(line, record, {instant, 4711, 4713});
    return std::string(line.line());
}

std::string systemLogTextOf(const Record& record) {
    LineBuffer line;
    ZBLog::formatForSystemLog(line, record);
    return line.nulTerminated();
}

TEST(RecordLine, HoldsEveryFieldInOrder) {
    EXPECT_EQ(
        lineOf({Channel::log, "OperatingSystem_GetInstance", "OperatingSystemProvider.cpp", 77,
                "Zumbrel.OperatingSystemProvider", 4000, "METHOD: B() was invoked"}),
        "2024-02-29T23:59:59.123Z 4711 4713 log 4000 Zumbrel.OperatingSystemProvider "
        "OperatingSystem_GetInstance OperatingSystemProvider.cpp:77 METHOD: B() was invoked\n");
    EXPECT_EQ(lineOf({Channel::trace, "f", "F.cpp", 1, "C", 3000, "text"}),
              "2024-02-29T23:59:59.123Z 4711 4713 trace 3000 C f F.cpp:1 text\n");
}

TEST(RecordLine, BeginsWithItsTimeInUtcWithMilliseconds) {
    const struct {
        timespec instant;
        const char* expected;
    } rows[] = {
        {{0, 0}, "1970-01-01T00:00:00.000Z"},
        {{1000000000, 999999999}, "2001-09-09T01:46:40.999Z"},
        {{1709251199, 7000000}, "2024-02-29T23:59:59.007Z"},
        {{1709251200, 0}, "2024-03-01T00:00:00.000Z"},
        {{4107542400, 0}, "2100-03-01T00:00:00.000Z"},
        {{-1, 500000000}, "1969-12-31T23:59:59.500Z"},
        {{253402300799, 0}, "9999-12-31T23:59:59.000Z"},
    };
    for (const auto& row : rows) {
        const std::string line =
            lineOf({Channel::log, "f", "F.cpp", 1, "C", 3000, ""}, row.instant);
        EXPECT_EQ(line.substr(0, line.find(' ')), row.expected);
    }
}

TEST(RecordLine, PrintsADashForNamesThatAreMissing) {
    EXPECT_EQ(lineOf({Channel::log, nullptr, nullptr, -1, "", -5, ""}),
              "2024-02-29T23:59:59.123Z 4711 4713 log -5 - - -:-1 \n");
    EXPECT_EQ(lineOf({Channel::log, "", "", 0, "", 0, ""}),
              "2024-02-29T23:59:59.123Z 4711 4713 log 0 - - -:0 \n");
}

TEST(RecordLine, KeepsForgedNamesInTheirFields) {
    EXPECT_EQ(lineOf({Channel::log, "f g", "F\n.cpp", 1, "C D", 3000, "a\nb"}),
              "2024-02-29T23:59:59.123Z 4711 4713 log 3000 C\\x20D f\\x20g F\\x0A.cpp:1 a\\x0Ab\n");
}

TEST(RecordLine, CutsNamesSoThatTheTextHasRoom) {
    const std::string name(10000, 'n');
    const std::string line =
        lineOf({Channel::log, name.c_str(), name.c_str(), 1, name, 3000, "the text"});
    const std::string cut = std::string(252, 'n') + "\\...";
    EXPECT_EQ(line, "2024-02-29T23:59:59.123Z 4711 4713 log 3000 " + cut + " " + cut + " " + cut +
                        ":1 the text\n");
}

TEST(RecordLine, HoldsTheLongestTextOfTheProviderWhole) {
    const std::string text(511, '\n');
    EXPECT_NE(lineOf({Channel::log, "f", "F.cpp", 1, "C", 3000, text}).find(":1 \\x0A\\x0A"),
              std::string::npos);
    EXPECT_EQ(lineOf({Channel::log, "f", "F.cpp", 1, "C", 3000, text}).find("\\..."),
              std::string::npos);
}

TEST(RecordLine, NamesTheProgramInTheSystemsLog) {
    EXPECT_EQ(systemLogTextOf({Channel::log, "f", "F.cpp", 12, "Zumbrel.OSStatusProvider", 3000,
                               "MESSAGE [File: F.cpp, Line: 12]: 100%s\n"}),
              "korva-osstatus: log 3000 Zumbrel.OSStatusProvider f F.cpp:12 "
              "MESSAGE [File: F.cpp, Line: 12]: 100%s\\x0A");
}

TEST(RecordLine, RanksFailuresAboveEverythingElseInTheSystemsLog) {
    const auto priority = [](int level, const char* text) {
        return ZBLog::systemLogPriority({Channel::log, "f", "F.cpp", 1, "C", level, text});
    };
    EXPECT_EQ(priority(3000, "MESSAGE [File: A, Line: 9]: B"), LOG_DAEMON | LOG_ERR);
    EXPECT_EQ(priority(4000, "MESSAGE [File: A, Line: 9]: B"), LOG_DAEMON | LOG_WARNING);
    EXPECT_EQ(priority(3000, "ENTERING: G() in A [Line: 3]"), LOG_DAEMON | LOG_INFO);
    EXPECT_EQ(priority(3001, "ENTERING: G() in A [Line: 3]"), LOG_DAEMON | LOG_DEBUG);
    EXPECT_EQ(priority(4000, "ENTERING: G() in A [Line: 3]"), LOG_DAEMON | LOG_DEBUG);
    EXPECT_EQ(priority(3000, " MESSAGE ["), LOG_DAEMON | LOG_INFO);
    EXPECT_EQ(priority(3000, "MESSAGE"), LOG_DAEMON | LOG_INFO);
}

}  // namespace
