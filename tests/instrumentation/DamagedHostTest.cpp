// Each source missing, cut short or damaged in turn: what stands in for it, and what is then
// absent. Nothing may crash, hang, throw or give a value that was not read.
#include <gtest/gtest.h>

#include <functional>

#include "framework/instrumentation/Linux/Dates.h"
#include "framework/instrumentation/Linux/Kernel.h"
#include "support/TestHost.h"

namespace {

using namespace VA::NodeLexicon;

constexpr Properties memory[] = {
    TotalVirtualMemorySize, FreeVirtualMemory,       FreePhysicalMemory,    TotalVisibleMemorySize,
    TotalSwapSpaceSize,     SizeStoredInPagingFiles, FreeSpaceInPagingFiles};

struct Fallbacks : testing::Test {
    Fallbacks() { host.tree().writeCompleteHost(); }
    const FixtureTree& tree() { return host.tree(); }
    TestHost host;
};

TEST_F(Fallbacks, UsrLibOsReleaseStandsInForEtcOsReleaseOrALinkThatLeadsNowhere) {
    tree().write("usr/lib/os-release", "NAME=Vendor\nVERSION_ID=8\n");
    EXPECT_EQ(host.text(Name), "Test Linux");
    tree().remove("etc/os-release");
    EXPECT_EQ(host.text(Name), "Vendor");
    EXPECT_EQ(host.text(Version), "8");
    tree().makeLink("etc/os-release", "../usr/lib/os-release.missing");
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

TEST_F(Fallbacks, KernelNamesTheSystemWhereNoOsReleaseDoesUnlessItIsSilentToo) {
    tree().remove("etc/os-release");
    EXPECT_EQ(host.text(Name), "Linux");
    EXPECT_EQ(host.text(Version), "6.1.0-18");
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
    for (const char* name : {"proc/4a", "proc/a4", "proc/-7", "proc/ 9", "proc/9 ", "proc/9 (x)"})
        tree().makeFolder(name);
    EXPECT_EQ(host.number(NumberOfProcesses), 3u);
    tree().write("proc/7/stat", "7 (a) b (c d)) S 1\n");
    tree().write("proc/10", "a file with a number for a name");
    EXPECT_EQ(host.number(NumberOfProcesses), 5u);
}

TEST_F(Fallbacks, ProcessesAreAbsentWhereProcListsNone) {
    EXPECT_EQ(host.number(NumberOfProcesses), 3u);
    for (const char* name : {"proc/1", "proc/20", "proc/300"}) tree().remove(name);
    EXPECT_EQ(host.number(NumberOfProcesses), std::nullopt);
    tree().remove("proc");
    EXPECT_EQ(host.number(NumberOfProcesses), std::nullopt);
}

TEST_F(Fallbacks, VirtualMemoryIsAbsentWhereAPartIsAndNeverWraps) {
    using Value = std::optional<unsigned int>;
    const std::pair<const char*, std::vector<Value>> rows[] = {
        {"MemTotal: 1000 kB\nMemAvailable: 600 kB\n", {1000, 600, 600, 1000, 0, 0, 0}},
        {"MemTotal: 4000 kB\nMemFree: 100 kB\n", {4000, std::nullopt, std::nullopt, 4000, 0, 0, 0}},
        {"MemTotal: 4000 kB\nMemAvailable: 5 kB\nSwapTotal: x kB\nSwapFree: 7 kB\n",
         {std::nullopt, 12, 5, 4000, std::nullopt, std::nullopt, 7}},
        {"MemTotal: 6597069766656 kB\nMemAvailable: 5497558138880 kB\n"
         "SwapTotal: 4294967294 kB\nSwapFree: 1 kB\n",
         {~0u, ~0u, ~0u, ~0u, 4294967294, 4294967294, 1}},
    };
    for (const auto& [meminfo, values] : rows) {
        tree().write("proc/meminfo", meminfo);
        for (std::size_t i = 0; i < values.size(); ++i)
            EXPECT_EQ(host.number(memory[i]), values[i]) << meminfo << memory[i];
    }
}

TEST_F(Fallbacks, StatusIsRunningWhereNoSystemdRunsAndItsOwnWhereItDoes) {
    host.manager->state = "maintenance";
    EXPECT_EQ(host.cursor()->nodeStatus(), 1u);
    tree().write("run/systemd/system", "a file is no folder");
    EXPECT_EQ(host.cursor()->nodeStatus(), 1u);
    EXPECT_EQ(host.manager->calls, 0);
    tree().remove("run/systemd/system");
    tree().makeFolder("run/systemd/system");
    EXPECT_EQ(host.cursor()->nodeStatus(), 8u);
    host.manager->state = std::nullopt;
    EXPECT_EQ(host.cursor()->nodeStatus(), 0u);
    EXPECT_EQ(host.manager->calls, 2);
}

// Damages

struct Damage {
    const char* description;
    std::function<void(const FixtureTree&, const std::string& path)> apply;
};

std::string allBytes() {
    std::string bytes;
    for (int i = 0; i < 4096; ++i) bytes += static_cast<char>(i * 31 + i / 256);
    return bytes;
}

void replace(const FixtureTree& tree, const std::string& path, const std::string& content) {
    tree.remove(path);
    tree.write(path, content);
}

const Damage damages[] = {
    {"Removed", [](auto& tree, auto& path) { tree.remove(path); }},
    {"Empty", [](auto& tree, auto& path) { replace(tree, path, ""); }},
    {"Binary", [](auto& tree, auto& path) { replace(tree, path, allBytes()); }},
    {"ZeroBytes", [](auto& tree, auto& path) { replace(tree, path, std::string(5000, '\0')); }},
    {"LineOfAMegabyte",
     [](auto& tree, auto& path) { replace(tree, path, std::string(1024 * 1024 - 1, 'x') + '\n'); }},
    {"PastTheCap",
     [](auto& tree, auto& path) { replace(tree, path, std::string(3 * 1024 * 1024, '\n')); }},
    {"DigitsOfAMegabyte",
     [](auto& tree, auto& path) { replace(tree, path, std::string(1024 * 1024, '9')); }},
    {"Quotes", [](auto& tree, auto& path) { replace(tree, path, "\"'\\\n'\"\\\n\\\"\n=\n:\n"); }},
    {"Fifo", [](auto& tree, auto& path) { tree.remove(path), tree.makeFifo(path); }},
    {"Folder", [](auto& tree, auto& path) { tree.remove(path), tree.makeFolder(path); }},
    {"LinkLoop", [](auto& tree, auto& path) { tree.remove(path), tree.makeLink(path, "stat"); }},
    {"EndlessDevice",
     [](auto& tree, auto& path) { tree.remove(path), tree.makeLink(path, "/dev/zero"); }},
    {"ReadError",
     [](auto& tree, auto& path) { tree.remove(path), tree.makeLink(path, "/proc/self/mem"); }},
};

// A whole host, whose kernel tells nothing that could stand in.
struct SilentHost : TestHost {
    SilentHost() {
        tree().writeCompleteHost();
        kernel->fixedNames = std::nullopt;
        kernel->fixedBootTime = std::nullopt;
    }
};

TEST(DamagedFiles, GiveNoValue) {
    const std::pair<const char*, std::vector<Properties>> rows[] = {
        {"etc/os-release", {Name, Version}},
        {"proc/stat", {LastBootUpTime}},
        {"proc/meminfo", {std::begin(memory), std::end(memory)}},
        {"proc", {NumberOfProcesses, TotalVisibleMemorySize}},
    };
    for (const Damage& damage : damages) {
        for (const auto& [path, properties] : rows) {
            SilentHost host;
            damage.apply(host.tree(), path);
            for (const Properties id : properties) {
                EXPECT_EQ(host.text(id), std::nullopt) << damage.description << path << id;
                EXPECT_EQ(host.number(id), std::nullopt) << damage.description << path << id;
            }
        }
    }
}

TEST(DamagedFiles, LeaveTheOtherLimitInForce) {
    for (const Damage& damage : damages) {
        SilentHost host;
        damage.apply(host.tree(), "proc/sys/kernel/pid_max");
        EXPECT_EQ(host.number(MaxNumberOfProcesses), 127412u) << damage.description;
        damage.apply(host.tree(), "proc/sys/kernel/threads-max");
        EXPECT_EQ(host.number(MaxNumberOfProcesses), std::nullopt) << damage.description;
    }
}

TEST(DamagedFiles, AreNoSessions) {
    using Count = std::optional<unsigned int>;
    for (const Damage& damage : damages) {
        const std::string damaged = damage.description;
        SCOPED_TRACE(damaged);
        SilentHost one;
        damage.apply(one.tree(), "run/systemd/sessions/1");
        const bool unreadable = damaged == "PastTheCap" || damaged == "ReadError";
        EXPECT_EQ(one.number(NumberOfUsers), unreadable ? std::nullopt : Count(1));

        SilentHost all;
        damage.apply(all.tree(), "run/systemd/sessions");
        EXPECT_EQ(all.number(NumberOfUsers), damaged == "Folder" ? Count(0) : std::nullopt);

        SilentHost utmp;
        utmp.tree().remove("run/systemd");
        utmp.tree().write("run/utmp", "");
        damage.apply(utmp.tree(), "run/utmp");
        // None of the damages is a record of a user; only an empty file is one of whole records.
        EXPECT_EQ(utmp.number(NumberOfUsers), damaged == "Empty" ? Count(0) : std::nullopt);
    }
}

// A file that was cut at any byte tells what the whole does, or nothing.
TEST(FilesCutShort, TellWhatTheWholeDoesOrNothing) {
    TestHost host;
    host.tree().writeCompleteHost();
    const auto textOf = [&](const char* path) { return host.files->text(path).value(); };
    const std::string meminfo = textOf("proc/meminfo");
    const auto whole = VA::Linux::parseMemoryInfo(meminfo).value();
    for (std::size_t length = 0; length < meminfo.size(); ++length) {
        const auto info = VA::Linux::parseMemoryInfo(meminfo.substr(0, length));
        if (!info) continue;
        EXPECT_EQ(info->totalKiB, whole.totalKiB);
        EXPECT_EQ(info->availableKiB.value_or(*whole.availableKiB), whole.availableKiB) << length;
        // No swap yet, or what there is of it.
        const auto free = info->swapFreeKiB.value_or(0);
        EXPECT_TRUE(free == 0 || free == whole.swapFreeKiB) << length << ' ' << free;
    }
    const std::string stat = textOf("proc/stat");
    for (std::size_t length = 0; length <= stat.size(); ++length) {
        const auto boot = VA::Linux::parseBootTime(stat.substr(0, length));
        EXPECT_EQ(boot.value_or(1700000000), 1700000000) << length;
    }
}

}  // namespace
