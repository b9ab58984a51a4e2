#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <utility>
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

TEST_F(CapabilitiesElement, WalksEveryNodeWhateverFilterIsSet) {
    for (const char* name : {"a", "b", "c"}) addNode(name);
    OperatingSystemCapabilities element;
    element.setFilter(OperatingSystemCapabilities::InstanceIDFilter, "c");
    EXPECT_EQ(host->calls(Operation::Next), 0U);
    std::string identifiers;
    for (; element; ++element) {
        std::string identifier;
        EXPECT_TRUE(element.getInstanceID(identifier));
        identifiers += identifier;
    }
    EXPECT_EQ(identifiers, "abc");
    EXPECT_EQ(host->calls(Operation::Next), 3U);
}

/// Capabilities that a derived class has narrowed, as setFilter does not.
class NarrowedCapabilities : public OperatingSystemCapabilities {
  public:
    explicit NarrowedCapabilities(std::vector<Filter> narrowing) {
        filterSet = true;
        filters = std::move(narrowing);
    }

    // The identifiers of the nodes that it stands on, from the second one on.
    std::string furtherIdentifiers() {
        std::string result;
        for (++*this; *this; ++*this) {
            std::string identifier = "(none) ";
            if (getInstanceID(identifier)) identifier += ' ';
            result += identifier;
        }
        return result;
    }
};

TEST_F(CapabilitiesElement, AdvancePassesOverNodesThatFailAFilterOnceThereIsOne) {
    using Filter = OperatingSystemCapabilities::Filter;
    const auto identifier = OperatingSystemCapabilities::InstanceIDFilter;
    const auto unknown = static_cast<OperatingSystemCapabilities::FilterType>(1);
    for (const char* name : {"first", "b", "Wanted", "b"}) addNode(name);
    host->addNode({});
    for (const char* name : {"WANTED", "wanted ", "b"}) addNode(name);
    const std::pair<std::vector<Filter>, std::string> rows[] = {
        {{}, "b Wanted b (none) WANTED wanted  b "},
        {{{identifier, "wanted"}}, "Wanted WANTED "},
        {{{unknown, "x"}}, "b Wanted b (none) WANTED wanted  b "},
        {{{unknown, "x"}, {identifier, "wanted"}, {unknown, "y"}}, "Wanted WANTED "},
        {{{identifier, "wanted"}, {identifier, "b"}}, ""},
        {{{identifier, ""}}, ""},
        {{{identifier, "nowhere"}}, ""},
    };
    for (const auto& [filters, expected] : rows) {
        NarrowedCapabilities element(filters);
        EXPECT_EQ(element.furtherIdentifiers(), expected);
    }
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

TEST_F(CapabilitiesElement, NameIsEditableWhenItIsKnownNotToBeReadOnly) {
    for (const bool held : {true, false}) {
        host->clearNodes();
        host->addNode({{}, {{Name, held}}, 1});
        bool editable = held;
        EXPECT_TRUE(OperatingSystemCapabilities().getElementNameEditSupported(editable));
        EXPECT_EQ(editable, !held);
        // Not known: the output is as the framework left it.
        host->clearNodes();
        addNode("a");
        editable = held;
        EXPECT_FALSE(OperatingSystemCapabilities().getElementNameEditSupported(editable));
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
