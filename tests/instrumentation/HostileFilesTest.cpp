// Every file of a host, damaged in every way: no crash, no hang, nothing thrown, and no value that
// was not read.
#include <gtest/gtest.h>

#include <functional>

#include "tests/instrumentation/HostParts.h"

namespace {

using namespace VA::NodeLexicon;

struct Damage {
    const char* description;
    std::function<void(const FixtureTree&, const std::string& path)> apply;
};

void PrintTo(const Damage& damage, std::ostream* out) {
    *out << damage.description;
}

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

class HostileFiles : public testing::TestWithParam<Damage> {
  protected:
    HostileFiles() {
        host.tree().writeCompleteHost();
        host.kernel->fixedNames = std::nullopt;
        host.kernel->fixedBootTime = std::nullopt;
    }
    void damage(const std::string& path) { GetParam().apply(host.tree(), path); }

    FixtureHost host;
};

TEST_P(HostileFiles, OsRelease) {
    damage("etc/os-release");
    EXPECT_EQ(host.text(Name), std::nullopt);
    EXPECT_EQ(host.text(Version), std::nullopt);
}

TEST_P(HostileFiles, ProcStat) {
    damage("proc/stat");
    EXPECT_EQ(host.text(LastBootUpTime), std::nullopt);
}

TEST_P(HostileFiles, MemInfo) {
    damage("proc/meminfo");
    for (const Properties id :
         {TotalVirtualMemorySize, FreeVirtualMemory, FreePhysicalMemory, TotalVisibleMemorySize,
          TotalSwapSpaceSize, SizeStoredInPagingFiles, FreeSpaceInPagingFiles}) {
        EXPECT_EQ(host.number(id), std::nullopt) << id;
    }
}

TEST_P(HostileFiles, ProcessLimits) {
    damage("proc/sys/kernel/pid_max");
    EXPECT_EQ(host.number(MaxNumberOfProcesses), 127412u);
    damage("proc/sys/kernel/threads-max");
    EXPECT_EQ(host.number(MaxNumberOfProcesses), std::nullopt);
}

TEST_P(HostileFiles, SessionFile) {
    damage("run/systemd/sessions/1");
    const std::string damaged = GetParam().description;
    const bool unreadable = damaged == "PastTheCap" || damaged == "ReadError";
    EXPECT_EQ(host.number(NumberOfUsers),
              unreadable ? std::nullopt : std::optional<unsigned int>(1));
}

TEST_P(HostileFiles, Utmp) {
    host.tree().remove("run/systemd");
    host.tree().write("run/utmp", "");
    damage("run/utmp");
    // None of the damages is a record of a user; some are a whole number of other records.
    EXPECT_EQ(host.number(NumberOfUsers).value_or(0), 0u);
}

TEST_P(HostileFiles, FolderOfProcesses) {
    damage("proc");
    EXPECT_EQ(host.number(NumberOfProcesses), std::nullopt);
    EXPECT_EQ(host.number(TotalVisibleMemorySize), std::nullopt);
}

TEST_P(HostileFiles, FolderOfSessions) {
    damage("run/systemd/sessions");
    const auto expected = GetParam().description == std::string("Folder")
                              ? std::optional<unsigned int>(0)
                              : std::nullopt;
    EXPECT_EQ(host.number(NumberOfUsers), expected);
}

std::string nameOfDamage(const testing::TestParamInfo<Damage>& info) {
    return info.param.description;
}

INSTANTIATE_TEST_SUITE_P(Damages, HostileFiles, testing::ValuesIn(damages), nameOfDamage);

// A host whose files were cut at any byte tells what was there before or nothing.
TEST(HostileFilesCutShort, NoPrefixOfAFileGivesAValueThatTheWholeDoesNot) {
    struct File {
        const char* path;
        Properties id;
        std::optional<unsigned int> whole;
    };
    FixtureHost host;
    host.tree().writeCompleteHost();
    const File files[] = {{"proc/meminfo", TotalVisibleMemorySize, 16777216u},
                          {"proc/meminfo", FreePhysicalMemory, 8388608u},
                          {"proc/meminfo", FreeSpaceInPagingFiles, 1048576u}};
    const std::string meminfo = host.files->text("proc/meminfo").value();
    for (std::size_t length = 0; length < meminfo.size(); ++length) {
        host.tree().write("proc/meminfo", meminfo.substr(0, length));
        for (const File& file : files) {
            const auto value = host.number(file.id);
            const bool noSwapYet = file.id == FreeSpaceInPagingFiles && value == 0u;
            EXPECT_TRUE(!value || value == file.whole || noSwapYet) << length << ' ' << *value;
        }
    }
}

TEST(HostileFilesCutShort, NoPrefixOfProcStatGivesAnotherBootTime) {
    FixtureHost host;
    host.kernel->fixedBootTime = std::nullopt;
    const std::string whole = "cpu  1 2 3 4\nbtime 1700000000\nprocesses 5\n";
    for (std::size_t length = 0; length <= whole.size(); ++length) {
        host.tree().write("proc/stat", whole.substr(0, length));
        const auto text = host.text(LastBootUpTime);
        EXPECT_TRUE(!text || text == "2023-11-14-22:13:20") << length << ' ' << *text;
    }
    EXPECT_EQ(host.text(LastBootUpTime), "2023-11-14-22:13:20");
}

TEST(HostileNames, ProcessFoldersWithBlanksAndParenthesesInTheirFilesStillCount) {
    FixtureHost host;
    host.tree().write("proc/7/stat", "7 (a) b (c d)) S 1\n");
    host.tree().write("proc/8/comm", "(x y)\n\n");
    host.tree().makeFolder("proc/9 (x)");
    host.tree().write("proc/10", "a file with a number for a name");
    EXPECT_EQ(host.number(NumberOfProcesses), 3u);
}

}  // namespace
