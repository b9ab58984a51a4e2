// The built program with the built provider and, beside it, the built companion.
#include <gmock/gmock.h>
#include <sys/utsname.h>

#include "support/ProgramRun.h"

namespace {

using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

ProgramRun cmpihost(const std::vector<std::string>& arguments) {
    return runProgram(KORVA_CMPIHOST, arguments);
}

std::string nodeName() {
    utsname names{};
    uname(&names);
    return names.nodename;
}

std::size_t count(const std::string& part, const std::string& text) {
    std::size_t found = 0;
    for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1))
        ++found;
    return found;
}

TEST(ProgramWithCompanion, DrawsTheHost) {
    const ProgramRun run = cmpihost({"tree"});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.err, "");
    EXPECT_THAT(run.out, StartsWith(nodeName() + " (KORVA_ComputerSystem)\n├── KORVA_InstalledOS\n"
                                                 "│   └── "));
    EXPECT_THAT(run.out, HasSubstr("\n│       └── KORVA_OSElementCapabilities\n│           └── "));
    EXPECT_THAT(run.out, HasSubstr("\n└── KORVA_RunningOS\n    └── "));
}

TEST(ProgramWithCompanion, AnswersUpCallsWithTheComputerSystem) {
    const ProgramRun run =
        cmpihost({"ai", "KORVA_OperatingSystem", "--assoc-class", "KORVA_InstalledOS"});
    EXPECT_EQ(run.status, 0);
    EXPECT_THAT(run.out, HasSubstr("  Name               " + nodeName() + "\n"));
    EXPECT_THAT(run.out, HasSubstr("  NameFormat         Other\n"));
}

TEST(ProgramWithCompanion, AnswersForANumberOfComputerSystemsItself) {
    const ProgramRun run = cmpihost({"--computer-systems", "1", "ai", "KORVA_OperatingSystem",
                                     "--assoc-class", "KORVA_InstalledOS"});
    EXPECT_EQ(run.status, 0);
    EXPECT_THAT(run.out, HasSubstr("Name               " + nodeName() + "\n"));
    EXPECT_THAT(run.out, Not(HasSubstr("NameFormat")));
}

TEST(ProgramWithCompanion, WithoutAComputerSystemAssociationsAreEmpty) {
    for (const std::vector<std::string>& request :
         {std::vector<std::string>{"--computer-systems", "0", "ein", "KORVA_RunningOS"},
          {"--computer-systems", "0", "ain", "KORVA_OperatingSystem", "--assoc-class",
           "KORVA_InstalledOS"}}) {
        const ProgramRun run = cmpihost(request);
        EXPECT_EQ(run.status, 0);
        EXPECT_EQ(run.out, "");
    }
    EXPECT_THAT(cmpihost({"--computer-systems", "0", "tree"}).out,
                StartsWith("no KORVA_ComputerSystem, so nothing is associated\n"));
}

TEST(ProgramWithCompanion, OfSeveralComputerSystemsTheLastIsNotReportedByTheProvider) {
    const ProgramRun run = cmpihost({"--bare", "--computer-systems", "3", "ain",
                                     "KORVA_OperatingSystem", "--assoc-class", "KORVA_RunningOS"});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(count("root/cimv2:KORVA_ComputerSystem.", run.out), 2U);
    EXPECT_THAT(run.out, HasSubstr("Name=\"" + nodeName() + "-2\""));
}

TEST(ProgramWithCompanion, OfSeveralComputerSystemsOnlyThePairedOneIsAnAssociator) {
    const ProgramRun run = cmpihost({"--computer-systems", "3", "ain", "KORVA_OperatingSystem",
                                     "--assoc-class", "KORVA_RunningOS"});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out,
              "root/cimv2:KORVA_ComputerSystem.CreationClassName=\"KORVA_ComputerSystem\",Name=\"" +
                  nodeName() + "\"\n");
}

TEST(ProgramWithCompanion, DrawsTheSameWithTheFacadeAsWithout) {
    for (const char* number : {"0", "1", "3"}) {
        const ProgramRun run = cmpihost({"--computer-systems", number, "tree"});
        EXPECT_EQ(run.status, 0);
        EXPECT_EQ(run.out, cmpihost({"--bare", "--computer-systems", number, "tree"}).out);
        EXPECT_EQ(count(" (KORVA_ComputerSystem)\n", run.out), std::stoul(number));
    }
}

TEST(ProgramWithCompanion, CompletesThePathOfAComputerSystemFromTheCompanionsNames) {
    const ProgramRun run =
        cmpihost({"ain", "KORVA_ComputerSystem", "--assoc-class", "KORVA_RunningOS"});
    EXPECT_EQ(run.status, 0);
    EXPECT_THAT(run.out, StartsWith("root/cimv2:KORVA_OperatingSystem."));
    EXPECT_EQ(run.err,
              "cmpihost: completed the path: root/cimv2:KORVA_ComputerSystem.CreationClassName="
              "\"KORVA_ComputerSystem\",Name=\"" +
                  nodeName() + "\"\n");
    const ProgramRun several =
        cmpihost({"--computer-systems", "12", "ain", "KORVA_ComputerSystem"});
    EXPECT_EQ(several.status, 2);
    EXPECT_EQ(several.out, "");
    EXPECT_THAT(several.err, HasSubstr("and 12 instances of KORVA_ComputerSystem have those"));
    EXPECT_THAT(several.err, EndsWith("\n  and 2 more\n"));
}

TEST(ProgramWithCompanion, CompanionThatDoesNotLoadExitsWithThree) {
    const ProgramRun run = cmpihost({"--companion", "/nonexistent.so", "tree"});
    EXPECT_EQ(run.status, 3);
    EXPECT_THAT(run.err, HasSubstr("/nonexistent.so"));
}

TEST(ProgramWithCompanion, NumberOfComputerSystemsOutOfRangeIsWrongUsage) {
    for (const char* number : {"-1", "1001", "x"})
        EXPECT_EQ(cmpihost({"--computer-systems", number, "tree"}).status, 2) << number;
}

}  // namespace
