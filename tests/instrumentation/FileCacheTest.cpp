// What is kept from one request to the next: as long as it holds, and no longer.
#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include <filesystem>
#include <functional>
#include <limits>
#include <thread>

#include "support/TestHost.h"

namespace {

using namespace std::chrono_literals;
using namespace VA::NodeLexicon;
using testing::UnorderedElementsAre;

using Counts = std::map<std::string, int>;

const std::string sessions = "run/systemd/sessions";

/// A host whose files were all changed long ago, by its clock.
struct OldHost : TestHost {
    OldHost() {
        tree().writeCompleteHost();
        kernel->fixedNow = std::time(nullptr) + 1000;
    }

    // What a new request for one property looks at and reads.
    template <class T>
    Counts countsOf(Properties id) {
        files->resetCounts();
        read<T>(id);
        return files->counts();
    }
};

struct FileCacheTest : testing::Test {
    const FixtureTree& tree() { return host.tree(); }

    template <class T>
    Counts countsOf(Properties id) {
        return host.countsOf<T>(id);
    }

    OldHost host;
};

// Past the grain of the file system's clock.
void wait() {
    std::this_thread::sleep_for(20ms);
}

struct Change {
    const char* description;
    std::function<void(const FixtureTree&)> apply;
};

void renameOver(const FixtureTree& tree, const std::string& path, const std::string& content) {
    tree.write(path + ".new", content);
    std::filesystem::rename(tree.path(path + ".new"), tree.path(path));
}

void putLink(const FixtureTree& tree, const std::string& path, const std::string& target) {
    tree.makeLink(path + ".new", target);
    std::filesystem::rename(tree.path(path + ".new"), tree.path(path));
}

// os-release

constexpr const char* first = "NAME=First\n";
constexpr const char* other = "NAME=Other\n";  // of the same size

const Change osReleaseChanges[] = {
    {"Replaced", [](auto& tree) { renameOver(tree, "etc/os-release", other); }},
    {"RewrittenInPlace", [](auto& tree) { tree.write("etc/os-release", other); }},
    {"RewrittenWithItsOldDate",
     [](auto& tree) {
         struct stat info;
         ASSERT_EQ(::stat(tree.path("etc/os-release").c_str(), &info), 0);
         tree.write("etc/os-release", other);
         const struct timespec times[2] = {info.st_atim, info.st_mtim};
         ASSERT_EQ(::utimensat(AT_FDCWD, tree.path("etc/os-release").c_str(), times, 0), 0);
     }},
    {"LongerByALine", [](auto& tree) { tree.write("etc/os-release", std::string(first) + other); }},
    {"TurnedIntoALink", [](auto& tree) { putLink(tree, "etc/os-release", "../data/other"); }},
    {"RemovedWithAnotherBehind",
     [](auto& tree) {
         tree.write("usr/lib/os-release", other);
         tree.remove("etc/os-release");
     }},
};

TEST(FileCache, ChangeOfOsReleaseIsSeenByTheNextRequest) {
    for (const Change& change : osReleaseChanges) {
        SCOPED_TRACE(change.description);
        OldHost host;
        host.tree().write("data/other", other);
        host.tree().write("etc/os-release", first);
        EXPECT_EQ(host.text(Name), "First");
        EXPECT_EQ(host.countsOf<std::string>(Name), (Counts{{"look at /etc/os-release", 1}}));
        wait();
        change.apply(host.tree());
        EXPECT_EQ(host.text(Name), "Other");
        EXPECT_EQ(host.text(Name), "Other");
    }
}

TEST_F(FileCacheTest, OsReleaseLinkThatIsPointedElsewhereIsFollowedThere) {
    tree().write("data/first", first);
    tree().write("data/other", other);
    putLink(tree(), "etc/os-release", "../data/first");
    for (const char* name : {"First", "Other", "First"}) {
        putLink(tree(), "etc/os-release", name[0] == 'F' ? "../data/first" : "../data/other");
        EXPECT_EQ(host.text(Name), name);
        EXPECT_EQ(countsOf<std::string>(Name), (Counts{{"look at /etc/os-release", 1}}));
    }
}

TEST_F(FileCacheTest, OsReleaseIsSeenWhereThereWasNone) {
    tree().remove("etc/os-release");
    EXPECT_EQ(host.text(Name), "Linux");
    const Counts twoLooks{{"look at /etc/os-release", 1}, {"look at /usr/lib/os-release", 1}};
    EXPECT_EQ(countsOf<std::string>(Name), twoLooks);
    tree().write("usr/lib/os-release", first);
    EXPECT_EQ(host.text(Name), "First");
    EXPECT_EQ(countsOf<std::string>(Name), twoLooks);
    tree().write("etc/os-release", other);
    EXPECT_EQ(host.text(Name), "Other");
    EXPECT_EQ(countsOf<std::string>(Name), (Counts{{"look at /etc/os-release", 1}}));
}

TEST_F(FileCacheTest, FileIsReadEachTimeUntilItIsOlderThanTheGrainOfItsClock) {
    const auto isReadAgain = [&] {
        return countsOf<std::string>(Name).count("etc/os-release") != 0;
    };
    for (const std::int64_t date : {std::int64_t{1500000000}, std::int64_t{4000000000}}) {
        const struct timespec dates[2] = {{0, UTIME_OMIT}, {date, 999999999}};
        ASSERT_EQ(::utimensat(AT_FDCWD, tree().path("etc/os-release").c_str(), dates, 0), 0);
        const auto newest = std::max(date, host.files->state("etc/os-release")->changed.seconds);
        for (const auto now : {newest - 1000, newest, newest + 2}) {
            host.kernel->fixedNow = now;
            EXPECT_TRUE(isReadAgain()) << now - newest;
        }
        host.kernel->fixedNow = newest + 3;
        EXPECT_TRUE(isReadAgain());
        EXPECT_EQ(countsOf<std::string>(Name), (Counts{{"look at /etc/os-release", 1}}));
    }
    tree().write("etc/os-release", first);
    for (const std::int64_t now : {std::int64_t{1}, std::numeric_limits<std::int64_t>::min()}) {
        host.kernel->fixedNow = now;
        EXPECT_TRUE(isReadAgain()) << now;
    }
}

TEST_F(FileCacheTest, FileThatIsNotReadWholeOrHasNoSizeIsReadEachTime) {
    tree().write("data/large", std::string(2 * 1024 * 1024, '\n'));
    const Counts onceEach{{"look at /etc/os-release", 1}, {"etc/os-release", 1}};
    for (const char* target : {"../data/large", "/proc/version", "/proc/self/mem"}) {
        putLink(tree(), "etc/os-release", target);
        for (int i = 0; i < 3; ++i) {
            EXPECT_EQ(countsOf<std::string>(Name), onceEach) << target;
            EXPECT_EQ(host.text(Name), "Linux");
        }
    }
}

TEST_F(FileCacheTest, WhatCouldNotBeOpenedIsTriedAgain) {
    struct rlimit before;
    ASSERT_EQ(::getrlimit(RLIMIT_NOFILE, &before), 0);
    struct rlimit none = before;
    none.rlim_cur = 0;
    ASSERT_EQ(::setrlimit(RLIMIT_NOFILE, &none), 0);
    const auto name = host.text(Name);
    const auto users = host.number(NumberOfUsers);
    ASSERT_EQ(::setrlimit(RLIMIT_NOFILE, &before), 0);
    EXPECT_EQ(name, "Linux");
    EXPECT_EQ(users, std::nullopt);
    EXPECT_EQ(host.text(Name), "Test Linux");
    EXPECT_EQ(host.number(NumberOfUsers), 2u);
}

// Sessions

const Change sessionChanges[] = {
    {"NewSession", [](auto& tree) { tree.write(sessions + "/4", "CLASS=user\n"); }},
    {"RewrittenInPlace",
     [](auto& tree) { tree.write(sessions + "/3", "CLASS=user\nSTATE=opening\n"); }},
    {"Replaced",
     [](auto& tree) { renameOver(tree, sessions + "/3", "CLASS=user\nSTATE=opening\n"); }},
    {"FolderReplaced",
     [](auto& tree) {
         tree.remove(sessions);
         for (const char* name : {"/4", "/5", "/6"}) tree.write(sessions + name, "CLASS=user\n");
     }},
};

TEST(FileCache, ChangeOfSessionsIsSeenByTheNextRequest) {
    for (const Change& change : sessionChanges) {
        SCOPED_TRACE(change.description);
        OldHost host;
        host.tree().write(sessions + "/3", "CLASS=user\nSTATE=closing\n");
        EXPECT_EQ(host.number(NumberOfUsers), 2u);
        EXPECT_EQ(host.countsOf<unsigned int>(NumberOfUsers),
                  (Counts{{"look at /run/systemd/sessions", 1},
                          {"look at /run/systemd/sessions/1", 1},
                          {"look at /run/systemd/sessions/3", 1},
                          {"look at /run/systemd/sessions/c2", 1}}));
        wait();
        change.apply(host.tree());
        EXPECT_EQ(host.number(NumberOfUsers), 3u);
        EXPECT_EQ(host.number(NumberOfUsers), 3u);
    }
}

TEST_F(FileCacheTest, SessionThatEndsIsGone) {
    EXPECT_EQ(host.number(NumberOfUsers), 2u);
    tree().remove(sessions + "/1");
    EXPECT_EQ(host.number(NumberOfUsers), 1u);
    tree().remove("run/systemd");
    EXPECT_EQ(host.number(NumberOfUsers), std::nullopt);
    tree().write(sessions + "/1", "CLASS=user\n");
    EXPECT_EQ(host.number(NumberOfUsers), 1u);
}

TEST_F(FileCacheTest, OnlyFoldersAreListedAndOnlyRegularFilesOpened) {
    tree().remove("run");
    tree().makeFifo("etc/os-release.fifo");
    putLink(tree(), "etc/os-release", "os-release.fifo");
    tree().makeFifo("run/systemd/sessions");
    tree().makeFifo("run/utmp");
    EXPECT_EQ(countsOf<std::string>(Name),
              (Counts{{"look at /etc/os-release", 1}, {"look at /usr/lib/os-release", 1}}));
    EXPECT_EQ(countsOf<unsigned int>(NumberOfUsers), (Counts{{"look at /run/systemd/sessions", 1},
                                                             {"look at /run/utmp", 1},
                                                             {"look at /var/run/utmp", 1}}));
    tree().remove("run/systemd/sessions");
    tree().makeFifo("run/systemd/sessions/1.ref");
    EXPECT_EQ(countsOf<unsigned int>(NumberOfUsers),
              (Counts{{"look at /run/systemd/sessions", 2},
                      {"run/systemd/sessions", 1},
                      {"look at /run/systemd/sessions/1.ref", 1}}));
}

TEST_F(FileCacheTest, ManySessionsAreReadEachTime) {
    tree().remove(sessions + "/1");
    tree().remove(sessions + "/c2");
    for (int i = 1; i < 256; ++i) tree().write(sessions + '/' + std::to_string(i), "CLASS=user\n");
    EXPECT_EQ(host.number(NumberOfUsers), 255u);
    EXPECT_EQ(countsOf<unsigned int>(NumberOfUsers).count(sessions), 0u);
    tree().write(sessions + "/256", "CLASS=user\n");
    EXPECT_EQ(host.number(NumberOfUsers), 256u);
    EXPECT_EQ(countsOf<unsigned int>(NumberOfUsers).count(sessions), 1u);
}

// The boot time

class BootTimeCache : public FileCacheTest {
  protected:
    BootTimeCache() {
        host.kernel->fixedBootTime = 1700000000;
        host.files->sizeless.insert("proc/stat");
    }

    bool isReadAgain() { return countsOf<std::string>(LastBootUpTime).count("proc/stat") != 0; }
};

TEST_F(BootTimeCache, IsReadUnlessTheClocksToldTheSameBeyondDoubtThenAndNow) {
    const struct {
        std::optional<std::int64_t> clock;
        bool exact, read;
    } steps[] = {
        {1699999999, true, true},  {1699999999, true, true},   // another second: not kept
        {1700000000, false, true}, {1700000000, true, true},   // in doubt: not kept
        {1700000000, true, false}, {1700000000, false, true},  // kept, and now in doubt
        {1700000000, true, false}, {std::nullopt, true, true}, {1700000001, true, true},
    };
    for (const auto& step : steps) {
        host.kernel->fixedBootTime = step.clock;
        host.kernel->bootTimeIsExact = step.exact;
        EXPECT_EQ(isReadAgain(), step.read) << &step - steps;
        EXPECT_EQ(host.text(LastBootUpTime), "2023-11-14-22:13:20");
    }
    host.kernel->fixedBootTime = 1700000000;
    EXPECT_EQ(countsOf<std::string>(LastBootUpTime), (Counts{{"look at /proc/stat", 1}}));
}

TEST_F(BootTimeCache, IsReadAgainOnceTheClockWasSet) {
    EXPECT_EQ(host.text(LastBootUpTime), "2023-11-14-22:13:20");
    host.kernel->fixedBootTime = 1700000001;
    tree().write("proc/stat", "btime 1700000001\nprocesses 1\n");
    EXPECT_EQ(host.text(LastBootUpTime), "2023-11-14-22:13:21");
    EXPECT_FALSE(isReadAgain());
}

TEST_F(BootTimeCache, IsReadAgainFromAnotherFile) {
    EXPECT_TRUE(isReadAgain());
    wait();
    renameOver(tree(), "proc/stat", "btime 1800000000\nprocesses 1\n");
    EXPECT_EQ(host.text(LastBootUpTime), "2027-01-15-08:00:00");
}

TEST_F(BootTimeCache, OfTheClocksOrOfAFileThatIsNotTheKernelsIsNotKept) {
    tree().write("proc/stat", "cpu 1\n");
    EXPECT_TRUE(isReadAgain());
    EXPECT_TRUE(isReadAgain());
    EXPECT_EQ(host.text(LastBootUpTime), "2023-11-14-22:13:20");
    tree().write("proc/stat", "btime 1700000000\n");
    host.files->sizeless.clear();
    EXPECT_TRUE(isReadAgain());
    EXPECT_TRUE(isReadAgain());
}

}  // namespace
