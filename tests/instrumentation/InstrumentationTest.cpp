// The contract of VA::Instrumentation, and the seam behind it.
#include <Instrumentation.h>
#include <gtest/gtest.h>

#include <thread>
#include <type_traits>
#include <vector>

#include "framework/instrumentation/HostSource.h"
#include "support/SimulatedHost.h"

namespace {

using namespace VA::NodeLexicon;
using VA::Instrumentation;
using VA::SimulatedHost;

// The numbers are the contract: other libraries of the same interface know nothing else.
static_assert(OperatingSystemNode == 17);
static_assert(Name == 108 && OSType == 128 && Version == 134 && InstallDate == 139);
static_assert(Distributed == 140 && LastBootUpTime == 141 && MaxNumberOfProcesses == 142);
static_assert(MaxProcessMemorySize == 143 && NumberOfProcesses == 144 && NumberOfUsers == 145);
static_assert(NumberOfLicensedUsers == 146 && TotalVirtualMemorySize == 147);
static_assert(FreeVirtualMemory == 148 && FreePhysicalMemory == 149);
static_assert(TotalVisibleMemorySize == 150 && TotalSwapSpaceSize == 151);
static_assert(SizeStoredInPagingFiles == 152 && FreeSpaceInPagingFiles == 153);

static_assert(!std::is_copy_constructible_v<Instrumentation>);
static_assert(!std::is_copy_assignable_v<Instrumentation>);
static_assert(sizeof(NodeType) == 4 && sizeof(Properties) == 4);

class InstrumentationTest : public testing::Test {
  protected:
    ~InstrumentationTest() override { VA::setHostSource(nullptr); }

    static void expectNothing(Instrumentation& cursor) {
        std::string text;
        unsigned int number = 0;
        bool flag = false;
        EXPECT_FALSE(static_cast<bool>(cursor));
        for (unsigned int id = 100; id < 160; ++id) {
            EXPECT_FALSE(cursor.getProperty(Properties(id), text)) << id;
            EXPECT_FALSE(cursor.getProperty(Properties(id), number)) << id;
            EXPECT_FALSE(cursor.getProperty(Properties(id), flag)) << id;
            EXPECT_FALSE(cursor.isPropertyReadOnly(Properties(id), flag)) << id;
        }
        EXPECT_EQ(cursor.getNodeStatus(), 0u);
    }

    static std::string nameOf(Instrumentation& cursor) {
        std::string name = "none";
        cursor.getProperty(Name, name);
        return name;
    }

    static std::shared_ptr<VA::HostSource> hostNamed(const std::string& name) {
        auto host = std::make_shared<SimulatedHost>();
        SimulatedHost::Node node;
        node.properties[Name] = name;
        host->addNode(node);
        return host;
    }
};

TEST_F(InstrumentationTest, FindsOneOperatingSystemOnThisMachineAndNothingBehindIt) {
    Instrumentation cursor;
    expectNothing(cursor);
    EXPECT_TRUE(cursor.selectNode(OperatingSystemNode));
    EXPECT_TRUE(static_cast<bool>(cursor));
    EXPECT_NE(nameOf(cursor), "none");
    EXPECT_EQ(&++cursor, &cursor);
    expectNothing(cursor);
    std::string name;
    EXPECT_TRUE(cursor.getComputerName(name));
    EXPECT_NE(name, "");
}

TEST_F(InstrumentationTest, IsOnNoNodeBeforeTheFirstAndForGoodAfterTheLast) {
    for (const bool hasNode : {true, false}) {
        VA::setHostSource(hasNode ? SimulatedHost::withOneNode()
                                  : std::make_shared<SimulatedHost>());
        Instrumentation cursor;
        expectNothing(cursor);
        EXPECT_EQ(cursor.selectNode(OperatingSystemNode), hasNode);
        for (int i = 0; i < 3; ++i) {
            if (i > 0 || hasNode) ++cursor;
            expectNothing(cursor);
        }
    }
}

TEST_F(InstrumentationTest, OtherNodeTypesHaveNoNodes) {
    for (const unsigned int type : {0u, 1u, 16u, 18u, 4294967295u}) {
        Instrumentation cursor;
        EXPECT_FALSE(cursor.selectNode(NodeType(type))) << type;
        expectNothing(cursor);
    }
}

TEST_F(InstrumentationTest, ReadsTheSourceThatWasCurrentWhenItWasConstructed) {
    VA::setHostSource(hostNamed("first"));
    Instrumentation first;
    VA::setHostSource(hostNamed("second"));
    Instrumentation second;
    first.selectNode(OperatingSystemNode);
    second.selectNode(OperatingSystemNode);
    EXPECT_EQ(nameOf(first), "first");
    EXPECT_EQ(nameOf(second), "second");
}

TEST_F(InstrumentationTest, KeepsItsSourceAliveAndLetsItGo) {
    auto host = hostNamed("kept");
    const std::weak_ptr<VA::HostSource> watched = host;
    VA::setHostSource(std::move(host));
    {
        Instrumentation cursor;
        cursor.selectNode(OperatingSystemNode);
        VA::setHostSource(nullptr);
        EXPECT_FALSE(watched.expired());
        EXPECT_EQ(nameOf(cursor), "kept");
    }
    EXPECT_TRUE(watched.expired());
}

TEST_F(InstrumentationTest, CurrentSourceIsTheOneThatWasSetAndWithNoneThisMachineForAll) {
    const auto host = hostNamed("simulated");
    VA::setHostSource(host);
    EXPECT_EQ(VA::currentHostSource(), host);
    VA::setHostSource(nullptr);
    const auto machine = VA::currentHostSource();
    ASSERT_TRUE(machine);
    EXPECT_EQ(VA::currentHostSource(), machine);
    Instrumentation cursor;
    cursor.selectNode(OperatingSystemNode);
    EXPECT_NE(nameOf(cursor), "simulated");
    unsigned int type = 0;
    EXPECT_TRUE(cursor.getProperty(OSType, type));
    EXPECT_EQ(type, 35u);
}

TEST_F(InstrumentationTest, SourceMayBeReplacedWhileManyThreadsRead) {
    std::vector<std::thread> threads;
    for (int i = 0; i < 8; ++i) {
        threads.emplace_back([i] {
            for (int round = 0; round < 50; ++round) {
                if (i == 0) VA::setHostSource(round % 2 ? hostNamed("even") : nullptr);
                Instrumentation cursor;
                EXPECT_TRUE(cursor.selectNode(OperatingSystemNode));
                EXPECT_NE(nameOf(cursor), "none");
                ++cursor;
                EXPECT_FALSE(static_cast<bool>(cursor));
            }
        });
    }
    for (auto& thread : threads) thread.join();
}

}  // namespace
