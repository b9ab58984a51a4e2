// What a walk looks at, and how often; walks of many threads and processes.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <chrono>
#include <ctime>
#include <filesystem>
#include <thread>
#include <vector>

#include "support/Properties.h"
#include "support/TestHost.h"

namespace {

using namespace VA::NodeLexicon;
using testing::Each;
using testing::IsEmpty;
using testing::Pair;

using Paths = std::vector<std::string>;

// What a source makes a walk look at and read; one that is not here is read as it is.
const std::map<std::string, Paths> readings{
    {"", {}},
    {"etc/os-release", {"look at /etc/os-release", "etc/os-release"}},
    {"(dates)",
     {"look at /", "look at /etc/machine-id", "look at /var/log/installer", "proc/stat"}},
    {"proc/sys/kernel", {"proc/sys/kernel/pid_max", "proc/sys/kernel/threads-max"}},
    {"run/systemd/sessions",
     {"look at /run/systemd/sessions", "run/systemd/sessions", "look at /run/systemd/sessions/1",
      "run/systemd/sessions/1", "look at /run/systemd/sessions/c2", "run/systemd/sessions/c2"}},
};

// Every property, and what it alone makes a walk look at and read.
std::map<unsigned int, Paths> readingsOfProperties() {
    std::map<unsigned int, Paths> result;
    for (const PublishedProperty& each : operatingSystemProperties) {
        const auto found = readings.find(each.source);
        if (each.id != 0)
            result[each.id] = found == readings.end() ? Paths{each.source} : found->second;
    }
    return result;
}
const std::map<unsigned int, Paths> sources = readingsOfProperties();

std::map<std::string, int> onceEach(const Paths& paths) {
    std::map<std::string, int> counts;
    for (const auto& path : paths) counts[path] = 1;
    return counts;
}

struct SnapshotTest : testing::Test {
    SnapshotTest() {
        host.tree().writeCompleteHost();
        host.tree().makeFolder("run/systemd/system");
        cursor = host.cursor();
    }

    std::string text(Properties id) {
        std::string value = "absent";
        cursor->readProperty(id, value);
        return value;
    }

    unsigned int number(Properties id) {
        unsigned int value = 4711;
        cursor->readProperty(id, value);
        return value;
    }

    TestHost host;
    std::unique_ptr<VA::NodeCursor> cursor;
};

TEST_F(SnapshotTest, EachSourceIsReadAtMostOnce) {
    for (int i = 0; i < 3; ++i) readEverything(*cursor);
    Paths all{"look at /run/systemd/system"};  // for the status
    for (const auto& [id, paths] : sources) all.insert(all.end(), paths.begin(), paths.end());
    EXPECT_EQ(host.files->counts(), onceEach(all));
    EXPECT_EQ(host.kernel->namesCalls, 1);
    EXPECT_EQ(host.manager->calls, 1);
}

TEST_F(SnapshotTest, SourceThatIsMissingIsLookedForOnce) {
    host.tree().remove("etc");
    host.tree().remove("proc");
    host.tree().remove("run/systemd/sessions");
    host.manager->state = std::nullopt;
    for (int i = 0; i < 3; ++i) readEverything(*cursor);
    EXPECT_THAT(host.files->counts(), Each(Pair(testing::_, 1)));
    EXPECT_THAT(host.files->counts(), testing::Contains(Pair("look at /usr/lib/os-release", 1)));
    EXPECT_THAT(host.files->counts(), testing::Contains(Pair("look at /var/run/utmp", 1)));
    EXPECT_EQ(host.manager->calls, 1);
}

TEST_F(SnapshotTest, SelectingReadsNothingAndAskingForNamesOsReleaseOnly) {
    EXPECT_THAT(host.files->counts(), IsEmpty());
    EXPECT_EQ(host.kernel->namesCalls, 0);
    std::string name;
    EXPECT_TRUE(cursor->readComputerName(name));
    EXPECT_EQ(text(Name), "Test Linux");
    bool readOnly = false;
    EXPECT_TRUE(cursor->isPropertyReadOnly(Name, readOnly));
    EXPECT_EQ(host.files->counts(), onceEach(readings.at("etc/os-release")));
    EXPECT_EQ(host.manager->calls, 0);
}

TEST_F(SnapshotTest, EachPropertyReadsItsOwnSourcesOnly) {
    for (const auto& [id, paths] : sources) {
        TestHost fresh;
        fresh.tree().writeCompleteHost();
        // Three walks, of which one reads: the type of a property is known without its source.
        fresh.text(Properties(id));
        fresh.number(Properties(id));
        fresh.flag(Properties(id));
        EXPECT_EQ(fresh.files->counts(), onceEach(paths)) << id;
    }
}

TEST_F(SnapshotTest, ValuesOfOneWalkBelongTogetherWhateverTheHostDoesMeanwhile) {
    EXPECT_EQ(number(TotalVisibleMemorySize), 16777216u);
    EXPECT_EQ(text(Name), "Test Linux");
    EXPECT_EQ(text(LastBootUpTime), "2023-11-14-22:13:20");
    EXPECT_EQ(number(NumberOfProcesses), 3u);
    EXPECT_EQ(cursor->nodeStatus(), 1u);

    host.tree().write("proc/meminfo", "MemTotal: 5 kB\nMemAvailable: 4 kB\n");
    host.tree().write("etc/os-release", "NAME=Other\nVERSION_ID=99\n");
    host.tree().write("proc/stat", "btime 1800000000\n");
    host.tree().makeFolder("proc/4711");
    host.kernel->fixedNames->node = "renamed";
    host.manager->state = "stopping";

    EXPECT_EQ(number(FreePhysicalMemory), 8388608u);
    EXPECT_EQ(number(TotalVirtualMemorySize), 18874368u);
    EXPECT_EQ(number(FreeVirtualMemory), 9437184u);
    EXPECT_EQ(text(Version), "7.1");
    EXPECT_EQ(text(LastBootUpTime), "2023-11-14-22:13:20");
    EXPECT_EQ(number(NumberOfProcesses), 3u);
    EXPECT_EQ(cursor->nodeStatus(), 1u);

    EXPECT_EQ(host.text(Version), "99");
    EXPECT_EQ(host.number(TotalVirtualMemorySize), 5u);
    EXPECT_EQ(host.number(NumberOfProcesses), 4u);
    EXPECT_EQ(host.cursor()->nodeStatus(), 16u);
}

TEST_F(SnapshotTest, NothingIsReadOnceTheWalkIsOver) {
    cursor->next();
    EXPECT_FALSE(cursor->valid());
    EXPECT_EQ(text(Name), "absent");
    EXPECT_EQ(number(OSType), 4711u);
    bool flag = true;
    EXPECT_FALSE(cursor->readProperty(Distributed, flag));
    EXPECT_FALSE(cursor->isPropertyReadOnly(Name, flag));
    EXPECT_EQ(cursor->nodeStatus(), 0u);
    EXPECT_THAT(host.files->counts(), IsEmpty());
    cursor->next();
    EXPECT_FALSE(cursor->valid());
}

TEST_F(SnapshotTest, PropertyHasOneTypeOnlyAndOnlyTheNameIsKnownToBeReadOnly) {
    for (unsigned int id = 0; id < 300; ++id) {
        std::string asText;
        unsigned int asNumber = 0;
        bool asFlag = false;
        const int types = cursor->readProperty(Properties(id), asText) +
                          cursor->readProperty(Properties(id), asNumber) +
                          cursor->readProperty(Properties(id), asFlag);
        // No file of the fixture dates an installation.
        EXPECT_EQ(types, sources.count(id) != 0 && id != InstallDate ? 1 : 0) << id;
        bool readOnly = false;
        EXPECT_EQ(cursor->isPropertyReadOnly(Properties(id), readOnly), id == 108) << id;
        EXPECT_EQ(readOnly, id == 108) << id;
    }
}

TEST_F(SnapshotTest, NodesAreOfTheOperatingSystemTypeAlone) {
    const auto linuxHost = VA::makeLinuxHost(host.tree().root());
    for (unsigned int type = 0; type < 40; ++type) {
        cursor = linuxHost->openCursor();
        EXPECT_FALSE(cursor->valid());
        EXPECT_EQ(cursor->select(NodeType(type)), type == 17) << type;
        EXPECT_EQ(cursor->valid(), type == 17) << type;
    }
    cursor.reset();  // not to outlive its source
}

// Threads and processes

TEST(LinuxHostThreads, ShareWhatIsKeptWhileItChanges) {
    TestHost host;
    host.tree().writeCompleteHost();
    host.kernel->fixedNow = std::time(nullptr) + 1000;
    std::atomic<bool> done{false};
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; ++i) {
        threads.emplace_back([&] {
            while (!done) {
                const auto name = host.text(Name);
                EXPECT_TRUE(name == "Test Linux" || name == "Other Linux")
                    << testing::PrintToString(name);
                const auto users = host.number(NumberOfUsers);
                EXPECT_TRUE(users == 2u || users == 3u) << testing::PrintToString(users);
                readEverything(*host.cursor());
            }
        });
    }
    for (int round = 0; round < 20; ++round) {
        const std::string name = round % 2 ? "Test" : "Other";
        host.tree().write("new", "NAME='" + name + " Linux'\n");
        std::filesystem::rename(host.tree().path("new"), host.tree().path("etc/os-release"));
        if (round % 2)
            host.tree().remove("run/systemd/sessions/new");
        else
            host.tree().write("run/systemd/sessions/new", "CLASS=user\n");
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    done = true;
    for (auto& thread : threads) thread.join();
    EXPECT_EQ(host.text(Name), "Test Linux");
    EXPECT_EQ(host.number(NumberOfUsers), 2u);
}

// Whatever the threads had in their hands when their process was forked, the child has to answer.
TEST(LinuxHostThreads, LeaveAForkedChildAbleToRead) {
    const auto machine = VA::makeLinuxHost();
    const auto nameOf = [&] {
        const auto cursor = machine->openCursor();
        cursor->select(OperatingSystemNode);
        std::string name;
        return cursor->readProperty(Name, name) ? name : "none";
    };
    const std::string expected = nameOf();
    std::atomic<bool> done{false};
    std::vector<std::thread> threads;
    for (int i = 0; i < 3; ++i) {
        threads.emplace_back([&] {
            while (!done) nameOf();
        });
    }
    for (int round = 0; round < 100; ++round) {
        const pid_t child = ::fork();
        if (child == 0) {
            ::alarm(30);
            ::_exit(nameOf() == expected ? 0 : 1);
        }
        int status = 0;
        EXPECT_EQ(::waitpid(child, &status, 0), child);
        EXPECT_EQ(status, 0);
    }
    done = true;
    for (auto& thread : threads) thread.join();
}

}  // namespace
