// What the program tells about itself: the examples of its help, how long it took, what providers
// record.
#include <gmock/gmock.h>

#include <filesystem>

#include "host/cli/Cmpihost.h"
#include "support/GoldenFile.h"
#include "support/TemporaryDirectory.h"

namespace {

using testing::HasSubstr;
using testing::MatchesRegex;
using testing::Not;
using testing::StartsWith;

/// A host that is the same everywhere.
const char* const fixture = "LD_LIBRARY_PATH=" KORVA_BINARY_DIR "/fixture-host";

/// The commands that the help lists.
std::vector<std::string> commands() {
    std::vector<std::string> result;
    bool listed = false;
    for (const std::string& line : lines(cmpihost({"--help"}).out)) {
        if (line == "Operations:") listed = true;
        if (line == "Paths:") listed = false;
        const bool isCommand = listed && line.substr(0, 2) == "  " && line.find(' ', 2) > 2;
        if (isCommand) result.push_back(line.substr(2, line.find(' ', 2) - 2));
    }
    return result;
}

/// The lines of a help that begin with the program's name.
std::vector<std::string> examples(const std::string& command) {
    std::vector<std::string> result;
    for (const std::string& line : lines(cmpihost({command, "--help"}).out))
        if (line.substr(0, 11) == "  cmpihost ") result.push_back(line.substr(2));
    return result;
}

TEST(ProgramHelp, HasAnExampleForEachCommandThatRunsAsItStands) {
    ASSERT_EQ(commands().size(), 17U);
    std::string text;
    for (const std::string& command : commands()) {
        // It runs until it is stopped, and its help is another program's.
        if (command == "serve") continue;
        const std::vector<std::string> found = examples(command);
        EXPECT_EQ(found.size(), 1U) << command;
        for (const std::string& example : found) {
            const ProgramRun run =
                runProgram("/bin/sh", {"-c", "PATH=" KORVA_BINARY_DIR "/bin:$PATH; " + example},
                           {fixture, "TZ=UTC0", "LC_ALL=C.UTF-8"});
            text += "$ " + example + "\n" + run.out;
            for (const std::string& line : lines(run.err)) text += "! " + line + "\n";
            text += "exit " + std::to_string(run.status) + "\n\n";
        }
    }
    expectGolden(KORVA_TEST_DATA "/cli/runs/Examples.txt", text);
}

TEST(ProgramHelp, FitsATerminalOfTheUsualWidth) {
    std::vector<Words> runs = {{"--help"}};
    for (const std::string& command : commands()) {
        if (command != "serve") runs.push_back({command, "--help"});
    }
    for (const Words& run : runs)
        for (const std::string& line : lines(cmpihost(run).out))
            EXPECT_LE(line.size(), 80U) << line;
}

TEST(ProgramServe, SaysWhatBringsTheServerWhereThereIsNone) {
    const TemporaryDirectory directory;
    const std::string program = directory.path("cmpihost");
    std::filesystem::copy_file(KORVA_CMPIHOST, program);
    const ProgramRun run = runProgram(program, {"serve", "--help"});
    EXPECT_EQ(run.status, 3);
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.err, "cmpihost: " + program +
                           "-serve is not there; it is a 64-bit program, which the package "
                           "korva-osstatus-server brings\n");
}

TEST(ProgramTime, IsTheLastLineOfTheStandardError) {
    const std::string line =
        "cmpihost: time: load [0-9]+\\.[0-9] ms \\(schema, libraries\\), request [0-9]+\\.[0-9] ms "
        "\\(the providers' answer\\), output [0-9]+\\.[0-9] ms";
    for (const Words& run : std::vector<Words>{{"--time", "ein", "KORVA_OperatingSystem"},
                                               {"ei", "KORVA_Unknown", "--time"},
                                               {"tree", "--time"},
                                               {"classes", "--time"}}) {
        const std::vector<std::string> told = lines(cmpihost(run).err);
        ASSERT_FALSE(told.empty());
        EXPECT_THAT(told.back(), MatchesRegex(line));
    }
    EXPECT_EQ(cmpihost({"tree"}).err, "");
    EXPECT_THAT(cmpihost({"--time", "zz"}).err, Not(HasSubstr("time: ")));
}

/// A request whose answer is empty because of a failure that the provider records.
ProgramRun emptyAnswer(const Words& options, const Words& environment = {}) {
    Words words = {"--bare", "ain", "KORVA_OperatingSystem.CreationClassName=\"x\"",
                   "--assoc-class", "KORVA_InstalledOS"};
    words.insert(words.begin(), options.begin(), options.end());
    return cmpihost(words, environment);
}

const char* const failure = "Could not find 'CSName' or 'Name' Key in Moniker\n";

TEST(ProgramRecords, ExplainAnEmptyAnswer) {
    const std::string nothing =
        "cmpihost: note: nothing is associated with root/cimv2:KORVA_OperatingSystem."
        "CreationClassName=\"x\" that passes --assoc-class KORVA_InstalledOS\n";
    const ProgramRun run = emptyAnswer({});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.err, nothing + "cmpihost: note: the provider recorded: " + failure);
    // Who names a configuration has the records go where that says.
    EXPECT_EQ(emptyAnswer({}, {"ZBLOG_CONF="}).err, nothing);
}

TEST(ProgramRecords, AreShownAsFarAsLevelAndChannelSay) {
    const auto shown = [](const char* option) { return emptyAnswer({option}).err; };
    EXPECT_THAT(shown("--log=failures"), HasSubstr(" log 3000 Zumbrel.OperatingSystemProvider "));
    EXPECT_THAT(shown("--log=failures"), Not(HasSubstr("ENTERING")));
    EXPECT_THAT(shown("--log=3000"), HasSubstr("ENTERING: setObjectPath() in "));
    EXPECT_THAT(shown("--log=3000"), Not(HasSubstr(" log 4000 ")));
    EXPECT_THAT(shown("--log"), HasSubstr(" log 4000 "));
    EXPECT_THAT(shown("--log"), Not(HasSubstr(" trace ")));
    EXPECT_THAT(shown("--log=4000,trace"), HasSubstr(" trace 4000 "));
    EXPECT_THAT(shown("--log=4000,trace"), Not(HasSubstr(" log ")));
    EXPECT_THAT(shown("--log=4000,cmpi"), StartsWith("cmpihost: note: nothing is associated"));
}

}  // namespace
