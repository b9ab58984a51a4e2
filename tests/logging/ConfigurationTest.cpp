#include "framework/logging/Configuration.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using namespace ZBLog;

std::string describe(const ChannelConfiguration& channel) {
    const char* const names[] = {"off", "stderr", "syslog", "file"};
    return std::string(names[static_cast<std::size_t>(channel.destination)]) + "[" + channel.path +
           "] " + std::to_string(channel.level) + (channel.failuresOnly ? " failures" : " all") +
           (channel.categories.passes("Zumbrel.A") ? " A" : "") +
           (channel.categories.passes("Zumbrel.B") ? " B" : "");
}

std::string describe(const Configuration& configuration) {
    return describe(configuration.of(Channel::log)) + "; " +
           describe(configuration.of(Channel::trace));
}

std::string describe(const ParsedConfiguration& parsed) {
    std::string text;
    for (const ConfigurationError& error : parsed.errors) {
        text += std::to_string(error.line) + ": " + error.message + "\n";
    }
    return text;
}

constexpr const char* defaults = "syslog[] 3000 failures A B; off[] 4000 all A B";

struct GoodRow {
    const char* description;
    const char* text;
    const char* expected;
};

const GoodRow goodRows[] = {
    {"nothing", "", defaults},
    {"empty lines and comments", "\n  \n# log.sink = off\n\t#\r\n", defaults},
    {"sink off", "log.sink = off", "off[] 3000 failures A B; off[] 4000 all A B"},
    {"sink file", "log.sink = file:/var/log/korva.log\n",
     "file[/var/log/korva.log] 3000 failures A B; off[] 4000 all A B"},
    {"a path with blanks and signs", "log.sink = file:/a b/#=,*.log\n",
     "file[/a b/#=,*.log] 3000 failures A B; off[] 4000 all A B"},
    {"levels", "log.level = 0\ntrace.level=999999\n",
     "syslog[] 0 failures A B; off[] 999999 all A B"},
    {"level with leading zeros", "log.level = 004000\n",
     "syslog[] 4000 failures A B; off[] 4000 all A B"},
    {"records", "log.records = all\ntrace.records = failures\n",
     "syslog[] 3000 all A B; off[] 4000 failures A B"},
    {"a category", "log.category = Zumbrel.A\n", "syslog[] 3000 failures A; off[] 4000 all A B"},
    {"categories", "log.category = Other , Zumbrel.B,X*\n",
     "syslog[] 3000 failures B; off[] 4000 all A B"},
    {"a beginning", "trace.category = Zumbrel.*\n", defaults},
    {"every category", "log.category = *\ntrace.category = No.*\n",
     "syslog[] 3000 failures A B; off[] 4000 all"},
    {"a comment, and a last line without a newline, of another system", "# x\r\nlog.level = 1\r",
     "syslog[] 1 failures A B; off[] 4000 all A B"},
    {"blanks everywhere", " \tlog.level\t =  7 \t", "syslog[] 7 failures A B; off[] 4000 all A B"},
    {"all keys in any order",
     "trace.category = Zumbrel.B\ntrace.records = failures\ntrace.level = 3000\n"
     "trace.sink = file:/t\nlog.category = Zumbrel.A\nlog.records = all\nlog.level = 4000\n"
     "log.sink = stderr\n",
     "stderr[] 4000 all A; file[/t] 3000 failures B"},
};

TEST(ConfigurationParser, ReadsEveryKeyInEveryForm) {
    for (const GoodRow& row : goodRows) {
        const ParsedConfiguration parsed = parseConfiguration(row.text);
        EXPECT_EQ(describe(parsed), "") << row.description;
        EXPECT_EQ(describe(parsed.configuration), row.expected) << row.description;
    }
}

struct BadRow {
    const char* description;
    std::string text;
    const char* errors;
};

const BadRow badRows[] = {
    {"no equals sign", "log.sink off\n", "1: not of the form KEY = VALUE: \"log.sink off\"\n"},
    {"unknown key", "\n# x\nlog.sinks = off\n", "3: unknown key \"log.sinks\"\n"},
    {"key in capitals", "Log.Sink = off\n", "1: unknown key \"Log.Sink\"\n"},
    {"no key", " = off\n", "1: unknown key \"\"\n"},
    {"key twice", "log.level = 1\nlog.level = 1\n", "2: log.level is given twice\n"},
    {"a carriage return within a line", "log.level = 1\rtrace.level = 2\r\n",
     "1: control character in \"log.level = 1\\x0Dtrace.level = 2\"\n"},
    {"two carriage returns", "log.level = 1\r\r\n",
     "1: control character in \"log.level = 1\\x0D\"\n"},
    {"several errors", "x\nlog.level = y\n\nz = 1",
     "1: not of the form KEY = VALUE: \"x\"\n"
     "2: log.level must be a number from 0 to 999999, not \"y\"\n"
     "4: unknown key \"z\"\n"},
    {"NUL", std::string("log.level = 1\0\n", 15),
     "1: control character in \"log.level = 1\\x00\"\n"},
    {"terminal sequence", "log.sink = file:/a\x1b[2J\n",
     "1: control character in \"log.sink = file:/a\\x1B[2J\"\n"},
    {"DEL", "log.sink = file:/a\x7f\n", "1: control character in \"log.sink = file:/a\\x7F\"\n"},
    {"mark of byte order", "\xEF\xBB\xBFlog.level = 1\n",
     "1: unknown key \"\\xEF\\xBB\\xBFlog.level\"\n"},
    {"bytes that are no text", "\xFF\xFE = 1\n", "1: unknown key \"\\xFF\\xFE\"\n"},
    {"a long key is cut", std::string(100, 'k') + " = 1\n",
     "1: unknown key \"kkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkk\\...\"\n"},
};

TEST(ConfigurationParser, TellsTheLineOfEveryErrorAndKeepsTheDefaults) {
    for (const BadRow& row : badRows) {
        const ParsedConfiguration parsed =
            parseConfiguration("trace.records = failures\n" + row.text);
        EXPECT_EQ(describe(parsed.configuration), defaults) << row.description;
        EXPECT_EQ(describe(parseConfiguration(row.text)), row.errors) << row.description;
    }
}

TEST(ConfigurationParser, TellsWhatAWrongValueMustBe) {
    const struct {
        std::string key, form;
        std::vector<std::string> values;
    } rows[] = {
        {"sink", "off, stderr, syslog or file:/PATH", {"console", "OFF", "", "file:"}},
        {"sink", "file:/PATH with a path that begins with /", {"file:korva.log"}},
        {"sink", "file:/PATH with a path that does not end in /", {"file:/var/log/"}},
        {"level", "a number from 0 to 999999", {"-1", "+1", "0000001", "4000 # fine", "1x", ""}},
        {"records", "all or failures", {"some", "All", ""}},
        {"category",
         "NAME or BEGINNING*, separated by commas",
         {"A,,B", "A,", "", "A B", "A*B", "A**"}},
    };
    for (const std::string channel : {"log.", "trace."}) {
        for (const auto& row : rows) {
            for (const std::string& value : row.values) {
                const std::string key = channel + row.key;
                EXPECT_EQ(describe(parseConfiguration(key + " = " + value + "\n")),
                          "1: " + key + " must be " + row.form + ", not \"" + value + "\"\n");
            }
        }
    }
}

TEST(ConfigurationParser, AllowsControlCharactersInComments) {
    EXPECT_EQ(describe(parseConfiguration("# \x1b[0m\x07\nlog.level = 1\n")), "");
}

TEST(ConfigurationParser, TakesThePathAsLongAsTheSystemDoesAndNoLonger) {
    const std::string key = "log.sink = file:";
    EXPECT_EQ(describe(parseConfiguration(key + "/" + std::string(4094, 'a'))), "");
    const ParsedConfiguration parsed = parseConfiguration(key + "/" + std::string(4095, 'a'));
    ASSERT_EQ(parsed.errors.size(), 1u);
    EXPECT_EQ(parsed.errors.front().message.substr(0, 60),
              "log.sink must be file:/PATH with a path of at most 4095 byte");
}

TEST(ConfigurationParser, RefusesMoreThan65536BytesWithoutLookingAtThem) {
    const std::string longest = "log.level = 1\n" + std::string(65536 - 14, '\n');
    EXPECT_EQ(describe(parseConfiguration(longest)), "");
    const ParsedConfiguration parsed = parseConfiguration(longest + "\n");
    EXPECT_EQ(describe(parsed), "0: longer than 65536 bytes\n");
    EXPECT_EQ(describe(parsed.configuration), defaults);
}

TEST(ConfigurationParser, TellsTenErrorsAndThatThereAreMore) {
    std::string text;
    for (int line = 0; line < 10; ++line) text += "x\n";
    EXPECT_EQ(parseConfiguration(text).errors.size(), 10u);
    for (int line = 0; line < 20000; ++line) text += "x\n";
    const ParsedConfiguration parsed = parseConfiguration(text);
    ASSERT_EQ(parsed.errors.size(), 11u);
    EXPECT_EQ(parsed.errors.back().line, 11u);
    EXPECT_EQ(parsed.errors.back().message, "further errors are not told");
}

TEST(CategoryFilter, LetsPassWhatOneOfItsPatternsMatches) {
    constexpr const char* whole = "Zumbrel.OSStatusProvider";
    const struct {
        std::vector<const char*> patterns;
        const char* category;
        bool passes;
    } rows[] = {
        {{}, whole, true},
        {{}, "", true},
        {{"*"}, whole, true},
        {{"*"}, "", true},
        {{whole}, whole, true},
        {{whole}, "Zumbrel.OSStatusProvider2", false},
        {{whole}, "Zumbrel.OSStatus", false},
        {{whole}, "zumbrel.osstatusprovider", false},
        {{whole}, "", false},
        {{"Zumbrel.*"}, "Zumbrel.OperatingSystemProvider", true},
        {{"Zumbrel.*"}, "Zumbrel.", true},
        {{"Zumbrel.*"}, "Zumbrel", false},
        {{"Zumbrel.*"}, "Other.Zumbrel.", false},
        {{"A", "B*"}, "A", true},
        {{"A", "B*"}, "Bee", true},
        {{"A", "B*"}, "C", false},
    };
    for (const auto& row : rows) {
        CategoryFilter filter;
        for (const char* const pattern : row.patterns) filter.add(pattern);
        EXPECT_EQ(filter.passes(row.category), row.passes)
            << testing::PrintToString(row.patterns) << " " << row.category;
    }
}

}  // namespace
