#include "support/SimulatedHost.h"

#include <Instrumentation.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <map>
#include <optional>
#include <stdexcept>
#include <vector>

namespace {

using namespace VA::NodeLexicon;
using VA::Instrumentation;
using VA::SimulatedHost;
using Operation = SimulatedHost::Operation;

class SimulatedHostTest : public testing::Test {
  protected:
    SimulatedHostTest() { VA::setHostSource(host); }
    ~SimulatedHostTest() override { VA::setHostSource(nullptr); }

    const std::shared_ptr<SimulatedHost> host = SimulatedHost::withOneNode();
};

// The index of the type that reads the property, in the order of SimulatedHost::Value; nothing
// where none does.
std::optional<std::size_t> typeOf(Instrumentation& cursor, Properties id) {
    std::string text;
    unsigned int number = 0;
    bool flag = false;
    const bool found[] = {cursor.getProperty(id, text), cursor.getProperty(id, number),
                          cursor.getProperty(id, flag)};
    EXPECT_LE(found[0] + found[1] + found[2], 1) << id;
    const auto first = std::find(std::begin(found), std::end(found), true);
    return first == std::end(found) ? std::nullopt : std::optional(first - std::begin(found));
}

TEST_F(SimulatedHostTest, PlausibleNodeHasEachPropertyThroughOneOverload) {
    Instrumentation cursor;
    ASSERT_TRUE(cursor.selectNode(OperatingSystemNode));
    for (const auto& [id, value] : SimulatedHost::plausibleNode().properties)
        EXPECT_EQ(typeOf(cursor, id), value.index()) << id;
    bool readOnly = false;
    EXPECT_TRUE(cursor.isPropertyReadOnly(Name, readOnly));
    EXPECT_TRUE(readOnly);
    EXPECT_FALSE(cursor.isPropertyReadOnly(Version, readOnly));
    EXPECT_EQ(cursor.getNodeStatus(), 1u);
    std::string name;
    EXPECT_TRUE(cursor.getComputerName(name));
    EXPECT_EQ(name, "simulated.example");
}

TEST_F(SimulatedHostTest, NodesComeInTheOrderTheyWereAddedEachWithItsOwnValues) {
    host->clearNodes();
    for (unsigned int i = 0; i < 3; ++i) {
        SimulatedHost::Node node;
        node.properties[Name] = "node " + std::to_string(i);
        node.readOnly[Name] = i % 2 == 0;
        node.status = 20 + i;
        host->addNodes(node, i);  // none, one, two
    }
    Instrumentation cursor;
    cursor.selectNode(OperatingSystemNode);
    for (const unsigned int i : {1u, 2u, 2u}) {
        ASSERT_TRUE(static_cast<bool>(cursor));
        std::string name;
        bool readOnly = false;
        EXPECT_TRUE(cursor.getProperty(Name, name));
        EXPECT_EQ(name, "node " + std::to_string(i));
        EXPECT_TRUE(cursor.isPropertyReadOnly(Name, readOnly));
        EXPECT_EQ(readOnly, i % 2 == 0);
        EXPECT_EQ(cursor.getNodeStatus(), 20 + i);
        ++cursor;
    }
    EXPECT_FALSE(static_cast<bool>(cursor));
}

TEST_F(SimulatedHostTest, WalkKeepsTheHostAsItStoodWhenItWasSelected) {
    Instrumentation cursor;
    cursor.selectNode(OperatingSystemNode);
    host->clearNodes();
    host->setComputerName(std::nullopt);
    EXPECT_TRUE(static_cast<bool>(cursor));
    std::string name;
    EXPECT_TRUE(cursor.getComputerName(name));
    EXPECT_EQ(name, "simulated.example");
    Instrumentation later;
    EXPECT_FALSE(later.selectNode(OperatingSystemNode));
    EXPECT_FALSE(later.getComputerName(name));
    EXPECT_EQ(name, "simulated.example");
}

// Calls every operation once, in the order of the enumeration.
void callEverything() {
    std::string text;
    unsigned int number = 0;
    bool flag = false;
    Instrumentation cursor;
    cursor.selectNode(OperatingSystemNode);
    static_cast<void>(static_cast<bool>(cursor));
    ++cursor;
    cursor.getProperty(Name, text);
    cursor.getProperty(OSType, number);
    cursor.getProperty(Distributed, flag);
    cursor.isPropertyReadOnly(Name, flag);
    cursor.getNodeStatus();
    cursor.getComputerName(text);
}

const Operation everyOperation[] = {
    Operation::Construct,  Operation::Select,      Operation::Valid,    Operation::Next,
    Operation::ReadText,   Operation::ReadNumber,  Operation::ReadFlag, Operation::ReadOnlyQuery,
    Operation::NodeStatus, Operation::ComputerName};

TEST_F(SimulatedHostTest, HookSeesEachCallInOrderAsItIsCountedByOperationAndByProperty) {
    std::vector<SimulatedHost::Call> seen;
    host->setHook([&](const SimulatedHost::Call& call) { seen.push_back(call); });
    callEverything();
    const std::map<std::size_t, Properties> ids{
        {4, Name}, {5, OSType}, {6, Distributed}, {7, Name}};
    ASSERT_EQ(seen.size(), 10u);
    for (std::size_t i = 0; i < seen.size(); ++i) {
        EXPECT_EQ(seen[i].operation, everyOperation[i]);
        EXPECT_EQ(seen[i].number, i + 1);
        EXPECT_EQ(seen[i].numberOfOperation, 1u);
        EXPECT_EQ(seen[i].id, ids.count(i) != 0 ? std::optional(ids.at(i)) : std::nullopt) << i;
    }
    host->setHook({});
    callEverything();
    EXPECT_EQ(seen.size(), 10u);
    EXPECT_EQ(host->calls(), 20u);
    for (const Operation operation : everyOperation)
        EXPECT_EQ(host->calls(operation), 2u) << static_cast<int>(operation);
    for (const auto& [i, id] : ids) EXPECT_EQ(host->calls(everyOperation[i], id), 2u) << i;
    EXPECT_EQ(host->calls(Operation::ReadText, Version), 0u);
    EXPECT_EQ(host->calls(Operation::ReadNumber, Name), 0u);
    host->resetCounts();
    EXPECT_EQ(host->calls(), 0u);
    EXPECT_EQ(host->calls(Operation::Select), 0u);
    EXPECT_EQ(host->calls(Operation::ReadText, Name), 0u);
}

TEST_F(SimulatedHostTest, NthCallOfAllOrOfOneOperationAndEachLaterOneFails) {
    for (std::uint64_t n = 1; n <= 11; ++n) {
        host->resetCounts();
        host->throwFromCall(n, std::runtime_error("fault"));
        if (n <= 10) {
            EXPECT_THROW(callEverything(), std::runtime_error) << n;
            EXPECT_EQ(host->calls(), n);
        } else {
            EXPECT_NO_THROW(callEverything());
        }
    }
    for (const Operation operation : everyOperation) {
        host->resetCounts();
        host->throwFromCall(operation, 2, std::runtime_error("fault"));
        EXPECT_NO_THROW(callEverything());
        EXPECT_THROW(callEverything(), std::runtime_error);
        EXPECT_THROW(callEverything(), std::runtime_error);
    }
}

}  // namespace
