#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <chrono>
#include <ctime>
#include <filesystem>
#include <thread>
#include <vector>

#include "tests/instrumentation/HostParts.h"

namespace {

using namespace VA::NodeLexicon;

void readEverything(VA::NodeCursor& cursor) {
    std::string text;
    unsigned int number = 0;
    bool flag = false;
    for (unsigned int id = 100; id < 160; ++id) {
        cursor.readProperty(Properties(id), text);
        cursor.readProperty(Properties(id), number);
        cursor.readProperty(Properties(id), flag);
        cursor.readOnlyProperty(Properties(id), flag);
    }
    cursor.readComputerName(text);
    cursor.nodeStatus();
}

TEST(LinuxHostThreads, EachWithItsCursorReadTheSameHost) {
    FixtureHost host;
    host.tree().writeCompleteHost();
    host.tree().makeFolder("run/systemd/system");
    const auto machine = VA::makeLinuxHost();
    std::vector<std::thread> threads;
    for (int i = 0; i < 8; ++i) {
        threads.emplace_back([&] {
            for (int round = 0; round < 10; ++round) {
                auto cursor = host.cursor();
                readEverything(*cursor);
                std::string name;
                EXPECT_TRUE(cursor->readProperty(Name, name));
                EXPECT_EQ(name, "Test Linux");
                unsigned int memory = 0;
                EXPECT_TRUE(cursor->readProperty(TotalVisibleMemorySize, memory));
                EXPECT_EQ(memory, 16777216u);
                EXPECT_EQ(cursor->nodeStatus(), 1u);
                auto real = machine->openCursor();
                EXPECT_TRUE(real->select(OperatingSystemNode));
                readEverything(*real);
            }
        });
    }
    for (auto& thread : threads) thread.join();
    EXPECT_EQ(host.files->counts()["etc/os-release"], 80);
}

TEST(LinuxHostThreads, ShareWhatIsKeptWhileItChanges) {
    FixtureHost host;
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

std::ptrdiff_t openDescriptors() {
    const std::filesystem::directory_iterator all("/proc/self/fd"), end;
    return std::distance(all, end);
}

TEST(LinuxHostResources, ReadingAThousandTimesLeavesNoDescriptorOpen) {
    FixtureHost host;
    host.tree().writeCompleteHost();
    host.tree().makeFifo("run/systemd/sessions/1.ref");
    host.tree().makeFolder("run/systemd/system");
    const auto fixture =
        VA::makeLinuxHost(host.tree().root());  // its bus is a socket that does not exist
    const auto machine = VA::makeLinuxHost();
    const auto before = openDescriptors();
    for (int i = 0; i < 1000; ++i) {
        for (const auto& each : {fixture, machine}) {
            auto cursor = each->openCursor();
            cursor->select(OperatingSystemNode);
            readEverything(*cursor);
        }
    }
    EXPECT_EQ(openDescriptors(), before);
}

}  // namespace
