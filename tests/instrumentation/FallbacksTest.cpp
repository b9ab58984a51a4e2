// Each source missing in turn: what stands in for it, and what is then absent.
#include <gtest/gtest.h>

#include "tests/instrumentation/HostParts.h"
#include "tests/instrumentation/UtmpFile.h"

namespace {

using namespace VA::NodeLexicon;

struct Fallbacks : testing::Test {
    Fallbacks() { host.tree().writeCompleteHost(); }
    const FixtureTree& tree() { return host.tree(); }
    FixtureHost host;
};

TEST_F(Fallbacks, UsrLibOsReleaseStandsInForEtcOsRelease) {
    tree().remove("etc/os-release");
    tree().write("usr/lib/os-release", "NAME=Vendor\nVERSION_ID=8\n");
    EXPECT_EQ(host.text(Name), "Vendor");
    EXPECT_EQ(host.text(Version), "8");
}

TEST_F(Fallbacks, UsrLibOsReleaseStandsInForALinkThatLeadsNowhere) {
    tree().remove("etc/os-release");
    tree().makeLink("etc/os-release", "../usr/lib/os-release.missing");
    tree().write("usr/lib/os-release", "NAME=Vendor\n");
    EXPECT_EQ(host.text(Name), "Vendor");
}

TEST_F(Fallbacks, TheTwoOsReleaseFilesAreNeverMixed) {
    tree().write("etc/os-release", "ID=test\n");
    tree().write("usr/lib/os-release", "NAME=Vendor\nVERSION_ID=8\nBUILD_ID=9\n");
    EXPECT_EQ(host.text(Name), "Linux");
    EXPECT_EQ(host.text(Version), "6.1.0-18");
    for (const std::string& content : {std::string(), std::string(2 * 1024 * 1024, '\n')}) {
        tree().write("etc/os-release", content);
        EXPECT_EQ(host.text(Name), "Linux") << content.size();
    }
}

TEST_F(Fallbacks, KernelNamesTheSystemWhereNoOsReleaseDoes) {
    tree().remove("etc/os-release");
    EXPECT_EQ(host.text(Name), "Linux");
    EXPECT_EQ(host.text(Version), "6.1.0-18");
}

TEST_F(Fallbacks, NameAndVersionAreAbsentWhereTheKernelIsSilentToo) {
    tree().remove("etc/os-release");
    host.kernel->fixedNames = std::nullopt;
    EXPECT_EQ(host.text(Name), std::nullopt);
    EXPECT_EQ(host.text(Version), std::nullopt);
    std::string name;
    EXPECT_FALSE(host.cursor()->readComputerName(name));
}

TEST_F(Fallbacks, ComputerNameIsTheKernelsNodeName) {
    std::string name;
    EXPECT_TRUE(host.cursor()->readComputerName(name));
    EXPECT_EQ(name, "node.example");
    host.kernel->fixedNames->node = "";
    EXPECT_FALSE(host.cursor()->readComputerName(name));
}

TEST_F(Fallbacks, MalformedNameGivesWayToTheKernelsAndMalformedVersionToTheBuild) {
    for (const std::string& bad :
         {std::string(), std::string("\"\""), std::string("\"   \""), std::string("a\tb"),
          std::string("\"a\x01\""), std::string("\"\xff\xfe\""), std::string("a\0b", 3),
          std::string(257, 'x'), std::string("\"open")}) {
        tree().write("etc/os-release", "NAME=" + bad + "\nVERSION_ID=" + bad + "\nBUILD_ID=b7\n");
        EXPECT_EQ(host.text(Name), "Linux") << testing::PrintToString(bad);
        EXPECT_EQ(host.text(Version), "b7") << testing::PrintToString(bad);
        tree().write("etc/os-release", "NAME=Good\nVERSION_ID=" + bad + "\nBUILD_ID=" + bad + "\n");
        EXPECT_EQ(host.text(Name), "Good") << testing::PrintToString(bad);
        EXPECT_EQ(host.text(Version), "6.1.0-18") << testing::PrintToString(bad);
    }
}

TEST_F(Fallbacks, ClocksTellTheBootTimeWhereProcStatDoesNot) {
    for (const char* text : {"", "cpu 1\n", "btime x\n", "btime 17"}) {
        tree().write("proc/stat", text);
        EXPECT_EQ(host.text(LastBootUpTime), "2023-11-14-22:13:19") << text;
    }
    tree().remove("proc/stat");
    EXPECT_EQ(host.text(LastBootUpTime), "2023-11-14-22:13:19");
    host.kernel->fixedBootTime = std::nullopt;
    EXPECT_EQ(host.text(LastBootUpTime), std::nullopt);
}

TEST_F(Fallbacks, BootTimeThatHasNoFourDigitYearIsAbsent) {
    tree().write("proc/stat", "btime 253402300800\n");
    EXPECT_EQ(host.text(LastBootUpTime), std::nullopt);
}

TEST_F(Fallbacks, MostProcessesIsTheSmallerLimitOrTheOneThatIsThere) {
    EXPECT_EQ(host.number(MaxNumberOfProcesses), 32768u);
    tree().write("proc/sys/kernel/threads-max", "20000\n");
    EXPECT_EQ(host.number(MaxNumberOfProcesses), 20000u);
    tree().write("proc/sys/kernel/threads-max", "none\n");
    EXPECT_EQ(host.number(MaxNumberOfProcesses), 32768u);
    tree().write("proc/sys/kernel/threads-max", "99999999999\n");
    tree().remove("proc/sys/kernel/pid_max");
    EXPECT_EQ(host.number(MaxNumberOfProcesses), 4294967295u);
    tree().remove("proc/sys/kernel/threads-max");
    EXPECT_EQ(host.number(MaxNumberOfProcesses), std::nullopt);
}

TEST_F(Fallbacks, ProcessesAreTheNamesOfDigitsAlone) {
    for (const char* name : {"proc/4a", "proc/a4", "proc/-7", "proc/ 9", "proc/9 "})
        tree().makeFolder(name);
    EXPECT_EQ(host.number(NumberOfProcesses), 3u);
}

TEST_F(Fallbacks, ProcessesAreAbsentWhereProcListsNone) {
    EXPECT_EQ(host.number(NumberOfProcesses), 3u);
    for (const char* name : {"proc/1", "proc/20", "proc/300"}) tree().remove(name);
    EXPECT_EQ(host.number(NumberOfProcesses), std::nullopt);
    tree().remove("proc");
    EXPECT_EQ(host.number(NumberOfProcesses), std::nullopt);
}

TEST_F(Fallbacks, UtmpStandsInForSessions) {
    tree().remove("run/systemd");
    EXPECT_EQ(host.number(NumberOfUsers), std::nullopt);
    tree().write("var/run/utmp", utmpRecord(utmpUserProcess, 20, "ada"));
    EXPECT_EQ(host.number(NumberOfUsers), 1u);
    tree().write("run/utmp", "");
    EXPECT_EQ(host.number(NumberOfUsers), 0u);
    tree().write("run/utmp", "broken");
    EXPECT_EQ(host.number(NumberOfUsers), 1u);
    tree().write("var/run/utmp", "broken too");
    EXPECT_EQ(host.number(NumberOfUsers), std::nullopt);
    tree().write("var/run/utmp", std::string(384 * 3000, '\0'));  // more than is read of a file
    EXPECT_EQ(host.number(NumberOfUsers), std::nullopt);
}

TEST_F(Fallbacks, UsersAreThoseWhoseProcessTheKernelKnowsWhateverProcHides) {
    tree().remove("run/systemd");
    tree().write("run/utmp",
                 utmpRecord(utmpUserProcess, 20, "ada") + utmpRecord(utmpUserProcess, 21, "bob"));
    EXPECT_EQ(host.number(NumberOfUsers), 1u);
    tree().remove("proc");
    EXPECT_EQ(host.number(NumberOfUsers), 1u);
    host.kernel->livingPids.insert(21);
    EXPECT_EQ(host.number(NumberOfUsers), 2u);
}

TEST_F(Fallbacks, UsersAreNotKnownFromTheUtmpOfAnotherPidNamespace) {
    tree().remove("run/systemd");
    tree().write("run/utmp",
                 utmpRecord(utmpUserProcess, 21, "ada") + utmpRecord(utmpUserProcess, 22, "bob"));
    EXPECT_EQ(host.number(NumberOfUsers), std::nullopt);
    tree().write("var/run/utmp", utmpRecord(utmpUserProcess, 20, "ada"));
    EXPECT_EQ(host.number(NumberOfUsers), 1u);
}

TEST_F(Fallbacks, SessionFileThatIsBeingWrittenDoesNotCount) {
    tree().write("run/systemd/sessions/.#3abcdef", "UID=1002\nSTATE=active\nCLASS=user\n");
    EXPECT_EQ(host.number(NumberOfUsers), 2u);
}

TEST_F(Fallbacks, UsersAreNeverTooFewByMistakeWhereASessionCannotBeRead) {
    tree().write("run/utmp", "");
    tree().write("large", std::string(1024 * 1024 + 1, '\n'));
    struct Case {
        const char* target;  // of the link in the session's place
        std::optional<unsigned int> users;
    };
    const Case cases[] = {
        {"/proc/self/mem", std::nullopt},  // opens, but cannot be read
        {"1", std::nullopt},               // a loop, which cannot be opened
        {"../../../large", std::nullopt},
        {"nowhere", 1u},
        {"/dev/null", 1u},
    };
    for (const Case& each : cases) {
        tree().remove("run/systemd/sessions/1");
        tree().makeLink("run/systemd/sessions/1", each.target);
        EXPECT_EQ(host.number(NumberOfUsers), each.users) << each.target;
    }
}

TEST_F(Fallbacks, FolderWithoutSessionsMeansNobodyWhateverUtmpSays) {
    tree().write("run/utmp", utmpRecord(utmpUserProcess, 20, "ada"));
    tree().remove("run/systemd/sessions");
    tree().makeFolder("run/systemd/sessions");
    EXPECT_EQ(host.number(NumberOfUsers), 0u);
}

TEST_F(Fallbacks, MemoryIsAbsentWithoutMeminfo) {
    for (const bool removed : {false, true}) {
        tree().write("proc/meminfo", "");
        if (removed) tree().remove("proc/meminfo");
        for (const Properties id :
             {TotalVirtualMemorySize, FreeVirtualMemory, FreePhysicalMemory, TotalVisibleMemorySize,
              TotalSwapSpaceSize, SizeStoredInPagingFiles, FreeSpaceInPagingFiles}) {
            EXPECT_EQ(host.number(id), std::nullopt) << id;
        }
    }
}

TEST_F(Fallbacks, HostWithoutSwapReportsZeroSwapAndPhysicalForVirtual) {
    tree().write("proc/meminfo", "MemTotal: 1000 kB\nMemAvailable: 600 kB\n");
    EXPECT_EQ(host.number(TotalSwapSpaceSize), 0u);
    EXPECT_EQ(host.number(SizeStoredInPagingFiles), 0u);
    EXPECT_EQ(host.number(FreeSpaceInPagingFiles), 0u);
    EXPECT_EQ(host.number(TotalVirtualMemorySize), 1000u);
    EXPECT_EQ(host.number(FreeVirtualMemory), 600u);
}

TEST_F(Fallbacks, StatusIsRunningWhereNoSystemdRuns) {
    host.manager->state = "maintenance";
    EXPECT_EQ(host.cursor()->nodeStatus(), 1u);
    tree().write("run/systemd/system", "a file is no folder");
    EXPECT_EQ(host.cursor()->nodeStatus(), 1u);
    EXPECT_EQ(host.manager->calls, 0);
}

}  // namespace
