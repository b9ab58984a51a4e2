// What a walk looks at, and how often.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/instrumentation/HostParts.h"

namespace {

using namespace VA::NodeLexicon;
using testing::Each;
using testing::IsEmpty;
using testing::Pair;
using testing::UnorderedElementsAre;

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

    void readEverything() {
        bool flag = false;
        for (unsigned int id = 100; id < 160; ++id) {
            text(Properties(id));
            number(Properties(id));
            cursor->readProperty(Properties(id), flag);
            cursor->readOnlyProperty(Properties(id), flag);
        }
        std::string name;
        cursor->readComputerName(name);
        cursor->nodeStatus();
    }

    FixtureHost host;
    std::unique_ptr<VA::NodeCursor> cursor;
};

TEST_F(SnapshotTest, SelectingReadsNothing) {
    EXPECT_THAT(host.files->counts(), IsEmpty());
    EXPECT_EQ(host.kernel->namesCalls, 0);
    EXPECT_EQ(host.manager->calls, 0);
}

TEST_F(SnapshotTest, EachSourceIsReadAtMostOnce) {
    for (int i = 0; i < 3; ++i) readEverything();
    EXPECT_THAT(
        host.files->counts(),
        UnorderedElementsAre(
            Pair("look at /etc/os-release", 1), Pair("etc/os-release", 1), Pair("proc/stat", 1),
            Pair("proc/meminfo", 1), Pair("proc/sys/kernel/pid_max", 1),
            Pair("proc/sys/kernel/threads-max", 1), Pair("proc", 1),
            Pair("look at /run/systemd/sessions", 1), Pair("run/systemd/sessions", 1),
            Pair("look at /run/systemd/sessions/1", 1), Pair("run/systemd/sessions/1", 1),
            Pair("look at /run/systemd/sessions/c2", 1), Pair("run/systemd/sessions/c2", 1),
            Pair("look at /run/systemd/system", 1), Pair("look at /", 1),
            Pair("look at /var/log/installer", 1), Pair("look at /etc/machine-id", 1)));
    EXPECT_EQ(host.kernel->namesCalls, 1);
    EXPECT_EQ(host.manager->calls, 1);
}

TEST_F(SnapshotTest, SourceThatIsMissingIsLookedForOnce) {
    host.tree().remove("etc");
    host.tree().remove("proc");
    host.tree().remove("run/systemd/sessions");
    host.manager->state = std::nullopt;
    for (int i = 0; i < 3; ++i) readEverything();
    EXPECT_THAT(host.files->counts(), Each(Pair(testing::_, 1)));
    EXPECT_THAT(host.files->counts(), testing::Contains(Pair("look at /usr/lib/os-release", 1)));
    EXPECT_THAT(host.files->counts(), testing::Contains(Pair("look at /var/run/utmp", 1)));
    EXPECT_EQ(host.manager->calls, 1);
}

TEST_F(SnapshotTest, WalkThatAsksForNamesReadsOsReleaseOnly) {
    std::string name;
    EXPECT_TRUE(cursor->readComputerName(name));
    EXPECT_EQ(text(Name), "Test Linux");
    bool readOnly = false;
    EXPECT_TRUE(cursor->readOnlyProperty(Name, readOnly));
    EXPECT_THAT(host.files->counts(), UnorderedElementsAre(Pair("look at /etc/os-release", 1),
                                                           Pair("etc/os-release", 1)));
    EXPECT_EQ(host.manager->calls, 0);
}

TEST_F(SnapshotTest, EachPropertyReadsItsOwnSourcesOnly) {
    using Paths = std::vector<std::string>;
    const Paths osRelease{"look at /etc/os-release", "etc/os-release"};
    const Paths meminfo{"proc/meminfo"};
    const std::vector<std::pair<Properties, Paths>> sources{
        {Name, osRelease},
        {OSType, {}},
        {Version, osRelease},
        {InstallDate,
         {"look at /", "look at /etc/machine-id", "look at /var/log/installer", "proc/stat"}},
        {Distributed, {}},
        {LastBootUpTime, {"proc/stat"}},
        {MaxNumberOfProcesses, {"proc/sys/kernel/pid_max", "proc/sys/kernel/threads-max"}},
        {MaxProcessMemorySize, {}},
        {NumberOfProcesses, {"proc"}},
        {NumberOfUsers,
         {"look at /run/systemd/sessions", "run/systemd/sessions",
          "look at /run/systemd/sessions/1", "run/systemd/sessions/1",
          "look at /run/systemd/sessions/c2", "run/systemd/sessions/c2"}},
        {NumberOfLicensedUsers, {}},
        {TotalVirtualMemorySize, meminfo},
        {FreeVirtualMemory, meminfo},
        {FreePhysicalMemory, meminfo},
        {TotalVisibleMemorySize, meminfo},
        {TotalSwapSpaceSize, meminfo},
        {SizeStoredInPagingFiles, meminfo},
        {FreeSpaceInPagingFiles, meminfo},
    };
    for (const auto& [id, expected] : sources) {
        FixtureHost fresh;
        fresh.tree().writeCompleteHost();
        fresh.text(id);
        fresh.number(id);
        fresh.flag(id);
        std::map<std::string, int> opened;
        // Three walks, of which one reads: the type of a property is known without its source.
        for (const auto& path : expected) opened[path] = 1;
        EXPECT_EQ(fresh.files->counts(), opened) << id;
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
    EXPECT_FALSE(cursor->readOnlyProperty(Name, flag));
    EXPECT_EQ(cursor->nodeStatus(), 0u);
    EXPECT_THAT(host.files->counts(), IsEmpty());
    cursor->next();
    EXPECT_FALSE(cursor->valid());
}

TEST_F(SnapshotTest, PropertyHasOneTypeOnly) {
    for (unsigned int id = 0; id < 300; ++id) {
        std::string asText;
        unsigned int asNumber = 0;
        bool asFlag = false;
        const int types = cursor->readProperty(Properties(id), asText) +
                          cursor->readProperty(Properties(id), asNumber) +
                          cursor->readProperty(Properties(id), asFlag);
        const bool known = id == Name || id == OSType || id == Version ||
                           (id >= InstallDate && id <= FreeSpaceInPagingFiles);
        // The fixture's files are too young to date an installation.
        EXPECT_EQ(types, known && id != InstallDate ? 1 : 0) << id;
    }
}

TEST_F(SnapshotTest, OnlyTheNameIsKnownToBeReadOnly) {
    for (unsigned int id = 0; id < 300; ++id) {
        bool readOnly = false;
        EXPECT_EQ(cursor->readOnlyProperty(Properties(id), readOnly), id == 108) << id;
        EXPECT_EQ(readOnly, id == 108) << id;
    }
}

TEST(LinuxNodes, AreOfTheOperatingSystemTypeAlone) {
    FixtureHost host;
    const auto linuxHost = VA::makeLinuxHost(host.tree().root());
    for (unsigned int type = 0; type < 40; ++type) {
        auto cursor = linuxHost->openCursor();
        EXPECT_FALSE(cursor->valid());
        EXPECT_EQ(cursor->select(NodeType(type)), type == 17) << type;
        EXPECT_EQ(cursor->valid(), type == 17) << type;
    }
}

}  // namespace
