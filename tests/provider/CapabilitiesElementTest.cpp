#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <vector>

#include "Linux/OperatingSystemCapabilities.h"
#include "provider/SimulatedFixture.h"

namespace {

using VA::NodeLexicon::Name;
using VA::OSStatusProvider::OperatingSystemCapabilities;
using Operation = VA::SimulatedHost::Operation;

class CapabilitiesElement : public SimulatedFixture {};

TEST_F(CapabilitiesElement, WithoutANodeItIsFalseAtOnce) {
    OperatingSystemCapabilities element;
    EXPECT_FALSE(static_cast<bool>(element));
}

TEST_F(CapabilitiesElement, FilterChangesNothing) {
    addNode("a");
    addNode("b");
    addNode("c");
    OperatingSystemCapabilities element;
    element.setFilter(OperatingSystemCapabilities::InstanceIDFilter, "c");
    std::string identifier;
    EXPECT_TRUE(element.getInstanceID(identifier));
    EXPECT_EQ(identifier, "a");
    ++element;
    EXPECT_TRUE(element.getInstanceID(identifier));
    EXPECT_EQ(identifier, "b");
    EXPECT_EQ(host->calls(Operation::Advance), 1U);
}

TEST_F(CapabilitiesElement, WalksEveryNode) {
    addNode("a");
    addNode("b");
    int count = 0;
    for (OperatingSystemCapabilities element; element; ++element) ++count;
    EXPECT_EQ(count, 2);
}

TEST_F(CapabilitiesElement, ShutdownBehaviourIsAlwaysThreeEvenWithoutANode) {
    OperatingSystemCapabilities element;
    unsigned short value = 0;
    EXPECT_TRUE(element.getHostShutdownBehavior(value));
    EXPECT_EQ(value, 3);
    EXPECT_EQ(host->calls(Operation::ReadNumber), 0U);
}

TEST_F(CapabilitiesElement, UnsupportedPropertiesAreFalseAndLeaveTheOutputAlone) {
    addNode("a");
    OperatingSystemCapabilities element;
    unsigned short length = 4711;
    EXPECT_FALSE(element.getMaxElementNameLen(length));
    EXPECT_EQ(length, 4711);
    std::vector<unsigned short> states = {4711};
    EXPECT_FALSE(element.getRequestedStatesSupported(states));
    EXPECT_EQ(states, (std::vector<unsigned short>{4711}));
}

TEST_F(CapabilitiesElement, NameIsEditableWhenItIsNotReadOnly) {
    for (bool readOnly : {true, false}) {
        host->clearNodes();
        host->addNode({{}, {{Name, readOnly}}, 1});
        OperatingSystemCapabilities element;
        bool editable = readOnly;
        EXPECT_TRUE(element.getElementNameEditSupported(editable));
        EXPECT_EQ(editable, !readOnly);
    }
}

TEST_F(CapabilitiesElement, EditabilityThatIsNotKnownLeavesTheOutputAsTheFrameworkLeftIt) {
    addNode("a");
    OperatingSystemCapabilities element;
    for (bool held : {true, false}) {
        bool editable = held;
        EXPECT_FALSE(element.getElementNameEditSupported(editable));
        EXPECT_EQ(editable, held);
    }
}

TEST_F(CapabilitiesElement, ElementNameIsTheIdentifier) {
    addNode("Linux");
    OperatingSystemCapabilities element;
    std::string identifier;
    std::string name;
    EXPECT_TRUE(element.getInstanceID(identifier));
    EXPECT_TRUE(element.getElementName(name));
    EXPECT_EQ(identifier, "Linux");
    EXPECT_EQ(name, "Linux");
    host->clearNodes();
    host->addNode({});
    OperatingSystemCapabilities nameless;
    EXPECT_FALSE(nameless.getInstanceID(identifier));
    EXPECT_FALSE(nameless.getElementName(name));
}

TEST_F(CapabilitiesElement, WalkLeavesItsRecords) {
    addNode("a");
    OperatingSystemCapabilities element;
    EXPECT_TRUE(recording::take().empty());
    EXPECT_TRUE(static_cast<bool>(element));
    ++element;
    EXPECT_EQ(
        recording::takeRendered(),
        R"(both operator bool Linux/OperatingSystemCapabilities.cpp:# Zumbrel.OperatingSystemProvider 4000 null 0 0 | METHOD: operator bool() was invoked in Linux/OperatingSystemCapabilities.cpp [Line: #]
both operator++ Linux/OperatingSystemCapabilities.cpp:# Zumbrel.OperatingSystemProvider 4000 null 0 0 | ENTERING: operator++() in Linux/OperatingSystemCapabilities.cpp [Line: #]
both operator++ Linux/OperatingSystemCapabilities.cpp:# Zumbrel.OperatingSystemProvider 4000 null 0 0 | EXITING: operator++() in Linux/OperatingSystemCapabilities.cpp [Line: #]
)");
}

TEST_F(CapabilitiesElement, ExceptionsOfTheFrameworkPassThrough) {
    host->throwFromCall(Operation::Select, 1, std::runtime_error("select"));
    EXPECT_THROW(OperatingSystemCapabilities{}, std::runtime_error);
}

}  // namespace
