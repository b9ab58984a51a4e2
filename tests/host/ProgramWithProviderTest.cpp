// The built program with the built provider on the machine that the tests run on.
#include <gmock/gmock.h>
#include <sys/utsname.h>
#include <time.h>

#include <cstdio>
#include <fstream>

#include "support/ProgramRun.h"

namespace {

using testing::HasSubstr;
using testing::StartsWith;

ProgramRun cmpihost(const std::vector<std::string>& arguments,
                    const std::vector<std::string>& environment = {}) {
    return runProgram(KORVA_CMPIHOST, arguments, environment);
}

std::string nodeName() {
    utsname names{};
    uname(&names);
    return names.nodename;
}

TEST(ProgramWithProvider, FindsTheLibraryOfItsOwnBuild) {
    const ProgramRun run = cmpihost({"ein", "KORVA_OperatingSystem"});
    EXPECT_EQ(run.status, 0);
    EXPECT_THAT(run.out, StartsWith("root/cimv2:KORVA_OperatingSystem.CSCreationClassName="
                                    "\"KORVA_ComputerSystem\",CSName=\"" +
                                    nodeName() + "\","));
    EXPECT_EQ(run.err, "");
}

TEST(ProgramWithProvider, GetsEveryInstanceThatItNames) {
    for (const char* name :
         {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities", "KORVA_InstalledOS",
          "KORVA_RunningOS", "KORVA_OSElementCapabilities"}) {
        const ProgramRun names = cmpihost({"ein", name});
        EXPECT_EQ(names.status, 0) << name;
        EXPECT_EQ(lines(names.out).size(), 1U) << names.out;
        for (const std::string& path : lines(names.out)) {
            const ProgramRun instance = cmpihost({"gi", path});
            EXPECT_EQ(instance.status, 0) << path;
            EXPECT_THAT(instance.out, StartsWith(path + "\n  ")) << path;
            EXPECT_EQ(instance.err, "") << path;
        }
    }
}

TEST(ProgramWithProvider, NamesTheNumbersOfARunningSystem) {
    const ProgramRun run = cmpihost({"ei", "KORVA_OperatingSystem", "OSType,EnabledState"});
    EXPECT_THAT(run.out, HasSubstr("  OSType               36 (LINUX)\n"));
    EXPECT_THAT(run.out, HasSubstr("  EnabledState         "));
}

TEST(ProgramWithProvider, WalksAnAssociation) {
    const std::string path = lines(cmpihost({"ein", "KORVA_OperatingSystem"}).out).at(0);
    const ProgramRun run = cmpihost({"ain", path, "--assoc-class", "KORVA_RunningOS"});
    EXPECT_EQ(run.status, 0);
    EXPECT_THAT(run.out, StartsWith("root/cimv2:KORVA_ComputerSystem."));
    EXPECT_THAT(run.out, HasSubstr("Name=\"" + nodeName() + "\""));
    EXPECT_EQ(run.err, "");
}

TEST(ProgramWithProvider, NamesTheStatusOfARefusal) {
    for (const char* operation : {"ri", "rin"}) {
        const ProgramRun references =
            cmpihost({"--bare", operation, "KORVA_OperatingSystem.Name=\"x\""});
        EXPECT_EQ(references.status, 1);
        EXPECT_EQ(references.err, "cmpihost: CIM_ERR_NOT_SUPPORTED (7)\n");
    }
    const ProgramRun unknown = cmpihost({"--bare", "ei", "KORVA_Unknown"});
    EXPECT_EQ(unknown.status, 1);
    EXPECT_EQ(unknown.err, "cmpihost: CIM_ERR_INVALID_CLASS (5)\n");
}

TEST(ProgramWithProvider, IsAskedWithPathsAsTheyAre) {
    for (const std::vector<std::string>& request :
         {std::vector<std::string>{"--bare", "gi", "KORVA_OperatingSystem"},
          {"--bare", "ain", "KORVA_OperatingSystem", "--assoc-class", "KORVA_RunningOS"}}) {
        const ProgramRun run = cmpihost(request);
        EXPECT_EQ(run.status, 0);
        EXPECT_NE(run.out, "");
        EXPECT_EQ(run.err, "");
    }
}

TEST(ProgramWithProvider, TellsHowToNameTheAssociationThatTheProviderNeeds) {
    for (const char* operation : {"ai", "ain"}) {
        const ProgramRun run = cmpihost({"--bare", operation, "KORVA_OperatingSystem"});
        EXPECT_EQ(run.status, 1);
        EXPECT_EQ(run.err,
                  "cmpihost: CIM_ERR_INVALID_CLASS (5)\n"
                  "hint: name the association with --assoc-class, one of KORVA_InstalledOS, "
                  "KORVA_OSElementCapabilities, KORVA_RunningOS\n");
    }
    const ProgramRun named =
        cmpihost({"--bare", "ain", "KORVA_OperatingSystem", "--assoc-class", "CIM_RunningOS"});
    EXPECT_EQ(named.err, "cmpihost: CIM_ERR_INVALID_CLASS (5)\n");
    const ProgramRun misspelt =
        cmpihost({"--bare", "ain", "KORVA_OperatingSystem", "--assoc-class", "KORVA_RunninOS"});
    EXPECT_EQ(misspelt.err,
              "cmpihost: CIM_ERR_INVALID_CLASS (5)\n"
              "hint: the schema has no class 'KORVA_RunninOS'\n");
}

TEST(ProgramWithProvider, ShowsTheRecordsOnlyWhenAskedTo) {
    EXPECT_EQ(cmpihost({"ei", "KORVA_OperatingSystem"}).err, "");
    const ProgramRun run = cmpihost({"--log", "ei", "KORVA_OperatingSystem"});
    EXPECT_EQ(run.status, 0);
    EXPECT_THAT(run.out, StartsWith("root/cimv2:KORVA_OperatingSystem."));
    EXPECT_THAT(run.err, HasSubstr("ENTERING: OperatingSystem_EnumInstances() in "));
    EXPECT_THAT(run.err, HasSubstr("EXITING: OperatingSystem_EnumInstances() in "));
    EXPECT_THAT(run.err, HasSubstr("VARIABLE: 'classId' has Value '55'"));
}

std::time_t bootTime() {
    std::ifstream stream("/proc/stat");
    for (std::string line; std::getline(stream, line);) {
        long long seconds = 0;
        if (std::sscanf(line.c_str(), "btime %lld", &seconds) == 1) {
            return static_cast<std::time_t>(seconds);
        }
    }
    return 0;
}

/// The instant of "... (YYYY-MM-DD hh:mm:ss +hh:mm)" in a line of the table; 0 when there is none.
std::time_t readableInstant(const std::string& text) {
    std::tm fields{};
    char sign = '+';
    int hours = 0;
    int minutes = 0;
    const std::size_t start = text.find('(');
    if (start == std::string::npos ||
        std::sscanf(text.c_str() + start, "(%d-%d-%d %d:%d:%d %c%d:%d)", &fields.tm_year,
                    &fields.tm_mon, &fields.tm_mday, &fields.tm_hour, &fields.tm_min,
                    &fields.tm_sec, &sign, &hours, &minutes) != 9) {
        return 0;
    }
    fields.tm_year -= 1900;
    fields.tm_mon -= 1;
    const int offset = (hours * 60 + minutes) * 60;
    return timegm(&fields) - (sign == '-' ? -offset : offset);
}

TEST(ProgramWithProvider, ShowsTheBootTimeAsTheSameInstantInEveryZone) {
    for (const char* zone : {"TZ=UTC0", "TZ=EST5", "TZ=IST-5:30", "TZ=NST3:30", "TZ=CET-1CEST"}) {
        const ProgramRun run = cmpihost({"ei", "KORVA_OperatingSystem", "LastBootUpTime"}, {zone});
        const std::size_t line = run.out.find("LastBootUpTime");
        ASSERT_NE(line, std::string::npos) << run.out;
        EXPECT_EQ(readableInstant(run.out.substr(line)), bootTime()) << zone << "\n" << run.out;
    }
}

}  // namespace
