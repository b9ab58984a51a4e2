#include <gtest/gtest.h>

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
    VA::LinuxHost machine;
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
                auto real = machine.openCursor();
                EXPECT_TRUE(real->select(OperatingSystemNode));
                readEverything(*real);
            }
        });
    }
    for (auto& thread : threads) thread.join();
    EXPECT_EQ(host.files->counts()["etc/os-release"], 80);
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
    VA::LinuxHost fixture(host.tree().root());  // its bus is a socket that does not exist
    VA::LinuxHost machine;
    const auto before = openDescriptors();
    for (int i = 0; i < 1000; ++i) {
        for (VA::LinuxHost* each : {&fixture, &machine}) {
            auto cursor = each->openCursor();
            cursor->select(OperatingSystemNode);
            readEverything(*cursor);
        }
    }
    EXPECT_EQ(openDescriptors(), before);
}

}  // namespace
