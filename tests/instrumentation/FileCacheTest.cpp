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

#include "tests/instrumentation/FixtureHost.h"

namespace {

using namespace std::chrono_literals;
using namespace VA::NodeLexicon;
using testing::UnorderedElementsAre;

using Counts = std::map<std::string, int>;

const std::string sessions = "run/systemd/sessions";

/// A host whose files were all changed long ago, by its clock.
class KeptTest : public testing::Test {
  protected:
    KeptTest() {
        host.tree().writeCompleteHost();
        host.kernel->fixedNow = std::time(nullptr) + 1000;
    }

    const FixtureTree& tree() { return host.tree(); }

    // What a new request for one property looks at and reads.
    template <class T>
    Counts countsOf(Properties id) {
        host.files->resetCounts();
        host.read<T>(id);
        return host.files->counts();
    }

    // Past the grain of the file system's clock.
    static void wait() { std::this_thread::sleep_for(20ms); }

    FixtureHost host;
};

struct Change {
    const char* description;
    std::function<void(const FixtureTree&)> apply;
};

void PrintTo(const Change& change, std::ostream* out) {
    *out << change.description;
}

std::string nameOf(const testing::TestParamInfo<Change>& info) {
    return info.param.description;
}

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

class OsReleaseChanges : public KeptTest, public testing::WithParamInterface<Change> {
  protected:
    OsReleaseChanges() {
        tree().remove("etc/os-release");
        tree().write("data/first", first);
        tree().write("data/other", other);
        tree().write("etc/os-release", first);
    }
};

TEST_P(OsReleaseChanges, AreSeenByTheNextRequest) {
    EXPECT_EQ(host.text(Name), "First");
    EXPECT_EQ(countsOf<std::string>(Name), (Counts{{"look at /etc/os-release", 1}}));
    wait();
    GetParam().apply(tree());
    EXPECT_EQ(host.text(Name), "Other");
    EXPECT_EQ(host.text(Name), "Other");
}

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

INSTANTIATE_TEST_SUITE_P(Of, OsReleaseChanges, testing::ValuesIn(osReleaseChanges), nameOf);

TEST_F(KeptTest, OsReleaseLinkThatIsPointedElsewhereIsFollowedThere) {
    tree().write("data/first", first);
    tree().write("data/other", other);
    putLink(tree(), "etc/os-release", "../data/first");
    for (const char* name : {"First", "Other", "First"}) {
        putLink(tree(), "etc/os-release", name[0] == 'F' ? "../data/first" : "../data/other");
        EXPECT_EQ(host.text(Name), name);
        EXPECT_EQ(countsOf<std::string>(Name), (Counts{{"look at /etc/os-release", 1}}));
    }
}

TEST_F(KeptTest, OsReleaseIsSeenWhereThereWasNone) {
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

const Counts readAnew{{"look at /etc/os-release", 2}, {"etc/os-release", 1}};
const Counts readAtFirst{{"look at /etc/os-release", 1}, {"etc/os-release", 1}};

TEST_F(KeptTest, YoungFileIsReadEachTime) {
    const struct timespec dates[2] = {{0, UTIME_OMIT}, {1500000000, 999999999}};
    ASSERT_EQ(::utimensat(AT_FDCWD, tree().path("etc/os-release").c_str(), dates, 0), 0);
    const auto changed = host.files->state("etc/os-release")->changed.seconds;
    for (const auto now : {changed - 100, changed, changed + 2}) {
        host.kernel->fixedNow = now;
        EXPECT_EQ(countsOf<std::string>(Name), readAtFirst) << now - changed;
    }
    host.kernel->fixedNow = changed + 3;
    EXPECT_EQ(countsOf<std::string>(Name), readAtFirst);
    EXPECT_EQ(countsOf<std::string>(Name), (Counts{{"look at /etc/os-release", 1}}));
}

TEST_F(KeptTest, FileOfTheFutureIsReadEachTime) {
    constexpr std::int64_t date = 4000000000;
    const struct timespec dates[2] = {{0, UTIME_OMIT}, {date, 0}};
    ASSERT_EQ(::utimensat(AT_FDCWD, tree().path("etc/os-release").c_str(), dates, 0), 0);
    for (const auto now : {date - 1000, date + 2}) {
        host.kernel->fixedNow = now;
        EXPECT_EQ(countsOf<std::string>(Name), readAtFirst) << now - date;
    }
    host.kernel->fixedNow = date + 3;
    EXPECT_EQ(countsOf<std::string>(Name), readAtFirst);
    EXPECT_EQ(countsOf<std::string>(Name), (Counts{{"look at /etc/os-release", 1}}));
}

TEST_F(KeptTest, ClockBeforeTheEpochKeepsNothing) {
    for (const std::int64_t now : {std::int64_t{1}, std::numeric_limits<std::int64_t>::min()}) {
        host.kernel->fixedNow = now;
        EXPECT_EQ(countsOf<std::string>(Name), readAtFirst) << now;
    }
}

TEST_F(KeptTest, FileThatIsNotReadWholeOrHasNoSizeIsReadEachTime) {
    tree().write("data/large", std::string(2 * 1024 * 1024, '\n'));
    for (const char* target : {"../data/large", "/proc/version", "/proc/self/mem"}) {
        putLink(tree(), "etc/os-release", target);
        for (int i = 0; i < 3; ++i) {
            EXPECT_EQ(countsOf<std::string>(Name), readAtFirst) << target;
            EXPECT_EQ(host.text(Name), "Linux");
        }
    }
}

TEST_F(KeptTest, WhatCouldNotBeOpenedIsTriedAgain) {
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

TEST_F(KeptTest, NothingIsMixedUpBetweenTwoRoots) {
    FixtureHost second;
    second.kernel->fixedNow = host.kernel->fixedNow;
    second.tree().write("etc/os-release", other);
    for (int i = 0; i < 2; ++i) {
        EXPECT_EQ(host.text(Name), "Test Linux");
        EXPECT_EQ(second.text(Name), "Other");
        EXPECT_EQ(host.number(NumberOfUsers), 2u);
        EXPECT_EQ(second.number(NumberOfUsers), std::nullopt);
    }
}

// Sessions

class SessionChanges : public KeptTest, public testing::WithParamInterface<Change> {};

TEST_P(SessionChanges, AreSeenByTheNextRequest) {
    tree().write(sessions + "/3", "CLASS=user\nSTATE=closing\n");
    EXPECT_EQ(host.number(NumberOfUsers), 2u);
    EXPECT_EQ(countsOf<unsigned int>(NumberOfUsers),
              (Counts{{"look at /run/systemd/sessions", 1},
                      {"look at /run/systemd/sessions/1", 1},
                      {"look at /run/systemd/sessions/3", 1},
                      {"look at /run/systemd/sessions/c2", 1}}));
    wait();
    GetParam().apply(tree());
    EXPECT_EQ(host.number(NumberOfUsers), 3u);
    EXPECT_EQ(host.number(NumberOfUsers), 3u);
}

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

INSTANTIATE_TEST_SUITE_P(Of, SessionChanges, testing::ValuesIn(sessionChanges), nameOf);

TEST_F(KeptTest, SessionThatEndsIsGone) {
    EXPECT_EQ(host.number(NumberOfUsers), 2u);
    tree().remove(sessions + "/1");
    EXPECT_EQ(host.number(NumberOfUsers), 1u);
    tree().remove("run/systemd");
    EXPECT_EQ(host.number(NumberOfUsers), std::nullopt);
    tree().write(sessions + "/1", "CLASS=user\n");
    EXPECT_EQ(host.number(NumberOfUsers), 1u);
}

TEST_F(KeptTest, OnlyFoldersAreListedAndOnlyRegularFilesOpened) {
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

TEST_F(KeptTest, ManySessionsAreReadEachTime) {
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

class KeptBootTime : public KeptTest {
  protected:
    KeptBootTime() {
        host.kernel->fixedBootTime = 1700000000;
        host.files->sizeless.insert("proc/stat");
    }

    bool isReadAgain() { return countsOf<std::string>(LastBootUpTime).count("proc/stat") != 0; }
};

TEST_F(KeptBootTime, IsReadOnceWhileTheClocksAgreeWithIt) {
    EXPECT_TRUE(isReadAgain());
    EXPECT_FALSE(isReadAgain());
    EXPECT_EQ(countsOf<std::string>(LastBootUpTime), (Counts{{"look at /proc/stat", 1}}));
    EXPECT_EQ(host.text(LastBootUpTime), "2023-11-14-22:13:20");
}

TEST_F(KeptBootTime, IsReadAgainOnceTheClockWasSet) {
    EXPECT_EQ(host.text(LastBootUpTime), "2023-11-14-22:13:20");
    host.kernel->fixedBootTime = 1700000001;
    tree().write("proc/stat", "btime 1700000001\nprocesses 1\n");
    EXPECT_EQ(host.text(LastBootUpTime), "2023-11-14-22:13:21");
    EXPECT_FALSE(isReadAgain());
    host.kernel->fixedBootTime = std::nullopt;
    EXPECT_TRUE(isReadAgain());
}

TEST_F(KeptBootTime, IsReadAgainWhileTheClocksAreInDoubt) {
    EXPECT_TRUE(isReadAgain());
    host.kernel->bootTimeIsExact = false;
    EXPECT_TRUE(isReadAgain());
    host.kernel->bootTimeIsExact = true;
    EXPECT_FALSE(isReadAgain());
}

TEST_F(KeptBootTime, IsReadAgainFromAnotherFile) {
    EXPECT_TRUE(isReadAgain());
    wait();
    renameOver(tree(), "proc/stat", "btime 1800000000\nprocesses 1\n");
    EXPECT_EQ(host.text(LastBootUpTime), "2027-01-15-08:00:00");
}

TEST_F(KeptBootTime, IsNotKeptWhileTheClocksDifferOrDoubt) {
    host.kernel->fixedBootTime = 1699999999;
    EXPECT_TRUE(isReadAgain());
    EXPECT_TRUE(isReadAgain());
    host.kernel->fixedBootTime = 1700000000;
    host.kernel->bootTimeIsExact = false;
    EXPECT_TRUE(isReadAgain());
    host.kernel->bootTimeIsExact = true;
    EXPECT_TRUE(isReadAgain());
    EXPECT_FALSE(isReadAgain());
}

TEST_F(KeptBootTime, OfAFileThatIsNotTheKernelsIsNotKept) {
    host.files->sizeless.clear();
    EXPECT_TRUE(isReadAgain());
    EXPECT_TRUE(isReadAgain());
}

TEST_F(KeptBootTime, OfTheClocksIsNotKept) {
    tree().write("proc/stat", "cpu 1\n");
    EXPECT_TRUE(isReadAgain());
    EXPECT_TRUE(isReadAgain());
    EXPECT_EQ(host.text(LastBootUpTime), "2023-11-14-22:13:20");
}

}  // namespace
