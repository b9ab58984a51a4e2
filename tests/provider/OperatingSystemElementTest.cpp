#include <gtest/gtest.h>
#include <stdlib.h>
#include <time.h>

#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

#include "Linux/OperatingSystem.h"
#include "provider/SimulatedFixture.h"

namespace {

using namespace VA::NodeLexicon;
using VA::SimulatedHost;
using VA::OSStatusProvider::OperatingSystem;
using Operation = VA::SimulatedHost::Operation;

class OperatingSystemElement : public SimulatedFixture {
  protected:
    // The names that a walk meets, from where the element stands.
    static std::vector<std::string> walked(OperatingSystem& element) {
        std::vector<std::string> names;
        for (; element; ++element) {
            std::string name = "(none)";
            element.getName(name);
            names.push_back(name);
        }
        return names;
    }

    void addNodes(const std::vector<std::string>& names) {
        for (const std::string& name : names) addNode(name);
    }
};

using Names = std::vector<std::string>;

TEST_F(OperatingSystemElement, WalkMeetsTheNodesThatPassEveryFilter) {
    constexpr auto csName = OperatingSystem::CSNameFilter;
    constexpr auto name = OperatingSystem::NameFilter;
    constexpr auto other = static_cast<OperatingSystem::FilterType>(7);
    addNodes({"a", "Linux"});
    host->addNode({});  // without a name
    addNodes({"b", "LINUX"});
    const Names all = {"a", "Linux", "(none)", "b", "LINUX"};
    const std::pair<std::vector<OperatingSystem::Filter>, Names> rows[] = {
        {{}, all},
        {{{name, "linux"}}, {"Linux", "LINUX"}},  // letter case aside
        {{{name, "linux "}}, {}},                 // nothing is trimmed
        {{{name, ""}}, {}},
        {{{csName, "hOST1"}}, all},
        {{{csName, "Host1 "}}, {}},
        {{{name, "b"}, {csName, "host1"}}, {"b"}},
        {{{name, "b"}, {name, "a"}}, {}},
        {{{other, "x"}}, all},
        {{{other, "x"}, {name, "b"}, {other, "y"}}, {"b"}},
    };
    for (const auto& [filters, expected] : rows) {
        OperatingSystem element;
        for (const OperatingSystem::Filter& filter : filters)
            element.setFilter(filter.type, filter.value);
        EXPECT_EQ(walked(element), expected);
        ++element;
        EXPECT_FALSE(static_cast<bool>(element));
    }
    host->setComputerName(std::nullopt);
    OperatingSystem nameless;
    nameless.setFilter(csName, "");
    EXPECT_FALSE(static_cast<bool>(nameless));
}

TEST_F(OperatingSystemElement, FiltersReadAndMoveNoMoreThanTheyNeed) {
    const auto other = static_cast<OperatingSystem::FilterType>(7);
    const auto readings = [this] {
        return host->calls(Operation::ReadText) + host->calls(Operation::ComputerName);
    };
    OperatingSystem absent;  // on a host without a node
    absent.setFilter(OperatingSystem::CSNameFilter, "Host1");
    absent.setFilter(OperatingSystem::NameFilter, "a");
    EXPECT_FALSE(static_cast<bool>(absent));
    EXPECT_EQ(readings(), 0U);
    addNodes({"a", "a", "b"});
    OperatingSystem element;
    element.setFilter(other, "x");
    EXPECT_EQ(readings(), 0U);
    // The current node passes.
    element.setFilter(OperatingSystem::NameFilter, "A");
    EXPECT_EQ(host->calls(Operation::Next), 0U);
    EXPECT_EQ(walked(element), (Names{"a", "a"}));
    // The first filter that fails ends the test of a node.
    OperatingSystem narrowed;
    narrowed.setFilter(OperatingSystem::NameFilter, "a");
    narrowed.setFilter(OperatingSystem::CSNameFilter, "host1");
    host->resetCounts();
    EXPECT_EQ(walked(narrowed), (Names{"a", "a"}));
    EXPECT_EQ(host->calls(Operation::ComputerName), 1U);  // of the second node
}

TEST_F(OperatingSystemElement, OSTypeIsShiftedAgainstTheFrameworksNumber) {
    const std::pair<unsigned int, unsigned short> rows[] = {
        {0, 0}, {1, 2}, {35, 36}, {64, 65}, {65, 67}, {68, 70}, {69, 1}, {4294967295U, 1}};
    unsigned short value = 4711;
    for (const auto& [raw, published] : rows) {
        setProperty(OSType, raw);
        EXPECT_TRUE(OperatingSystem().getOSType(value)) << raw;
        EXPECT_EQ(value, published) << raw;
    }
    setProperty(Name, std::string("a"));
    value = 4711;
    EXPECT_FALSE(OperatingSystem().getOSType(value));
    EXPECT_EQ(value, 4711);
}

TEST_F(OperatingSystemElement, EveryStatusCodeHasItsMeaningInTheThreeMaps) {
    const struct {
        unsigned int first, last;
        unsigned short enabledState, healthState;
        std::vector<unsigned short> operationalStatus;
    } rows[] = {
        {0, 0, 0, 0, {0}},    {1, 1, 2, 5, {2, 11}}, {2, 2, 10, 0, {0}},
        {3, 7, 5, 0, {0}},    {8, 8, 9, 0, {0}},     {9, 9, 10, 0, {0}},
        {10, 11, 5, 0, {0}},  {12, 12, 6, 0, {0}},   {13, 15, 5, 0, {0}},
        {16, 16, 3, 0, {0}},  {17, 19, 5, 0, {0}},   {20, 20, 5, 10, {3, 5}},
        {21, 26, 5, 10, {3}}, {27, 30, 5, 0, {0}},   {4294967294U, 4294967294U, 5, 0, {0}},
    };
    const auto expectMeaning = [this](unsigned int code, const auto& expected) {
        host->clearNodes();
        host->addNode({{}, {}, code});
        OperatingSystem element;
        unsigned short enabledState = 4711;
        unsigned short healthState = 4711;
        std::vector<unsigned short> operationalStatus;
        EXPECT_TRUE(element.getEnabledState(enabledState));
        EXPECT_TRUE(element.getHealthState(healthState));
        EXPECT_TRUE(element.getOperationalStatus(operationalStatus));
        EXPECT_EQ(enabledState, expected.enabledState) << code;
        EXPECT_EQ(healthState, expected.healthState) << code;
        EXPECT_EQ(operationalStatus, expected.operationalStatus) << code;
    };
    for (const auto& row : rows)
        for (unsigned int code = row.first; code <= row.last; ++code) expectMeaning(code, row);
    expectMeaning(4294967295U, rows[3]);
}

TEST_F(OperatingSystemElement, OperationalStatusIsAppendedWithoutClearing) {
    host->addNode({{}, {}, 1});
    OperatingSystem element;
    std::vector<unsigned short> value = {99};
    element.getOperationalStatus(value);
    element.getOperationalStatus(value);
    EXPECT_EQ(value, (std::vector<unsigned short>{99, 2, 11, 2, 11}));
}

// A number of the framework in the only property of the only node, and in none.
template <class Value, std::size_t count>
void expectOwnProperty(
    const std::pair<Properties, bool (OperatingSystem::*)(Value&)> (&rows)[count],
    const std::function<void(Properties, SimulatedHost::Value)>& setProperty, Value unknown) {
    for (const auto& [id, getter] : rows) {
        setProperty(id, 4294967295U);
        Value value = 4711;
        EXPECT_TRUE((OperatingSystem().*getter)(value)) << id;
        EXPECT_EQ(value, Value{4294967295U}) << id;
        setProperty(Name, std::string("a"));
        value = 4711;
        EXPECT_FALSE((OperatingSystem().*getter)(value)) << id;
        EXPECT_EQ(value, unknown) << id;
    }
}

TEST_F(OperatingSystemElement, NumbersComeUnscaledFromTheirOwnPropertyAndUnknownSizesAreZero) {
    using OS = OperatingSystem;
    const std::pair<Properties, bool (OS::*)(unsigned long long&)> sizes[] = {
        {TotalSwapSpaceSize, &OS::getTotalSwapSpaceSize},
        {TotalVirtualMemorySize, &OS::getTotalVirtualMemorySize},
        {FreeVirtualMemory, &OS::getFreeVirtualMemory},
        {FreePhysicalMemory, &OS::getFreePhysicalMemory},
        {TotalVisibleMemorySize, &OS::getTotalVisibleMemorySize},
        {SizeStoredInPagingFiles, &OS::getSizeStoredInPagingFiles},
        {FreeSpaceInPagingFiles, &OS::getFreeSpaceInPagingFiles},
        {MaxProcessMemorySize, &OS::getMaxProcessMemorySize},
    };
    const std::pair<Properties, bool (OS::*)(unsigned int&)> counts[] = {
        {NumberOfLicensedUsers, &OS::getNumberOfLicensedUsers},
        {NumberOfUsers, &OS::getNumberOfUsers},
        {NumberOfProcesses, &OS::getNumberOfProcesses},
        {MaxNumberOfProcesses, &OS::getMaxNumberOfProcesses},
    };
    const auto set = [this](Properties id, SimulatedHost::Value value) {
        setProperty(id, std::move(value));
    };
    expectOwnProperty<unsigned long long>(sizes, set, 0);
    expectOwnProperty<unsigned int>(counts, set, 4711);
}

TEST_F(OperatingSystemElement, TextsAndFlagComeFromTheirOwnSource) {
    SimulatedHost::Node node;
    node.properties[Name] = std::string("Linux");
    node.properties[Version] = std::string("12");
    node.properties[Distributed] = true;
    host->addNode(node);
    OperatingSystem element;
    std::string text;
    EXPECT_TRUE(element.getName(text));
    EXPECT_EQ(text, "Linux");
    EXPECT_TRUE(element.getVersion(text));
    EXPECT_EQ(text, "12");
    EXPECT_TRUE(element.getCSName(text));
    EXPECT_EQ(text, "Host1");
    bool distributed = false;
    EXPECT_TRUE(element.isDistributed(distributed));
    EXPECT_TRUE(distributed);
}

TEST_F(OperatingSystemElement, ConstantsAreAlwaysReported) {
    host->setComputerName(std::nullopt);
    OperatingSystem element;
    std::string text;
    EXPECT_TRUE(element.getCreationClassName(text));
    EXPECT_EQ(text, "KORVA_OperatingSystem");
    EXPECT_TRUE(element.getCSCreationClassName(text));
    EXPECT_EQ(text, "KORVA_ComputerSystem");
    EXPECT_TRUE(element.getStatus(text));
    EXPECT_EQ(text, "OK");
    EXPECT_FALSE(element.getCSName(text));
}

TEST_F(OperatingSystemElement, DescriptionIsASuccessWithoutAValue) {
    OperatingSystem element;
    std::string text = "held before";
    EXPECT_TRUE(element.getDescription(text));
    EXPECT_EQ(text, "held before");
}

template <class Value>
void expectUnsupported(std::initializer_list<bool (OperatingSystem::*)(Value&)> getters,
                       const Value& held) {
    OperatingSystem element;
    for (const auto getter : getters) {
        Value value = held;
        EXPECT_FALSE((element.*getter)(value));
        EXPECT_EQ(value, held);
    }
}

TEST_F(OperatingSystemElement, UnsupportedPropertiesAreFalseAndLeaveTheOutputAlone) {
    using OS = OperatingSystem;
    host = SimulatedHost::withOneNode();
    VA::setHostSource(host);
    expectUnsupported<std::string>(
        {&OS::getCaption, &OS::getElementName, &OS::getOtherEnabledState,
         &OS::getTimeOfLastStateChange, &OS::getOtherTypeDescription, &OS::getLocalDateTime},
        "held");
    expectUnsupported<unsigned short>(
        {&OS::getPrimaryStatus, &OS::getDetailedStatus, &OS::getOperatingStatus,
         &OS::getCommunicationStatus, &OS::getRequestedState, &OS::getEnabledDefault,
         &OS::getTransitioningToState},
        4711);
    expectUnsupported<std::vector<std::string>>({&OS::getStatusDescriptions}, {"held"});
    expectUnsupported<std::vector<unsigned short>>({&OS::getAvailableRequestedStates}, {4711});
    expectUnsupported<short>({&OS::getCurrentTimeZone}, -11);
    expectUnsupported<unsigned int>({&OS::getMaxProcessesPerUser}, 4711);
}

TEST_F(OperatingSystemElement, StateChangesAreNotOffered) {
    EXPECT_FALSE(VA::OSStatusProvider::executeReboot());
    EXPECT_FALSE(VA::OSStatusProvider::executeShutdown());
}

TEST_F(OperatingSystemElement, WalkLeavesItsRecordsAndFiltersLeaveNone) {
    addNodes({"a", "b"});
    OperatingSystem element;
    element.setFilter(OperatingSystem::NameFilter, "b");
    EXPECT_TRUE(recording::take().empty());
    EXPECT_TRUE(static_cast<bool>(element));
    ++element;
    EXPECT_EQ(
        recording::takeRendered(),
        R"(both operator bool Linux/OperatingSystem.cpp:# Zumbrel.OperatingSystemProvider 4000 null 0 0 | METHOD: operator bool() was invoked in Linux/OperatingSystem.cpp [Line: #]
both operator++ Linux/OperatingSystem.cpp:# Zumbrel.OperatingSystemProvider 4000 null 0 0 | ENTERING: operator++() in Linux/OperatingSystem.cpp [Line: #]
both operator++ Linux/OperatingSystem.cpp:# Zumbrel.OperatingSystemProvider 4000 null 0 0 | EXITING: operator++() in Linux/OperatingSystem.cpp [Line: #]
)");
}

TEST_F(OperatingSystemElement, ExceptionsOfTheFrameworkPassThrough) {
    addNode("a");
    host->throwFromCall(Operation::Select, 1, std::runtime_error("select"));
    EXPECT_THROW(OperatingSystem{}, std::runtime_error);
    host->setHook({});
    OperatingSystem element;
    host->throwFromCall(Operation::ReadText, 1, 17);
    std::string name;
    EXPECT_THROW(element.getName(name), int);
}

/// Sets libc's zone for one test, as it would stand in the host process.
class DateTime : public SimulatedFixture {
  protected:
    ~DateTime() override { timezone = before_; }

    // Both dates, which are converted alike; "" where one is not known.
    std::string converted(const std::string& text, long zone) {
        timezone = zone;
        SimulatedHost::Node node;
        node.properties[InstallDate] = text;
        node.properties[LastBootUpTime] = text;
        host->clearNodes();
        host->addNode(node);
        OperatingSystem element;
        std::string installed;
        std::string booted;
        EXPECT_TRUE(element.getInstallDate(installed));
        EXPECT_TRUE(element.getLastBootUpTime(booted));
        EXPECT_EQ(installed, booted);
        return installed;
    }

  private:
    long before_ = timezone;
};

TEST_F(DateTime, IsWhatTheTextAndTheZoneMakeOfIt) {
    const std::string usual = "2009-03-17-08:15:42";
    const struct {
        std::string text;
        long zone;
        const char* expected;
    } rows[] = {
        // The sign is minus east of UTC and plus west of it.
        {usual, -3600, "20090317081542.000000-060"},
        {usual, 0, "20090317081542.000000+000"},
        {usual, 18000, "20090317081542.000000+300"},
        {usual, 50400, "20090317081542.000000+840"},
        {usual, -45900, "20090317081542.000000-765"},
        // The offset is truncated towards zero.
        {usual, -59, "20090317081542.000000-000"},
        {usual, 119, "20090317081542.000000+001"},
        // The largest fields fill the buffer; what is longer is cut. A signed field is read as a
        // huge number, whose ten digits push the rest out.
        {"9999-99-99-99:99:99", 59940, "99999999999999.000000+999"},
        {usual, 86340, "20090317081542.000000+143"},
        {"2009--1-17-08:15:42", 0, "2009429496729517081542.00"},
        // A space is no separator, any other character is one.
        {"2009-03-17 18:15:42", 0, "20090317081542.000000+000"},
        {"2009-03-17 08:15:42", 0, "20090317081542.000000+000"},
        {"2009/03/17T08.15.42", 0, "20090317081542.000000+000"},
        {"  2009 - 03 - 17 - 08 : 15 : 42 trailing", 0, "20090317081542.000000+000"},
        // What does not parse is 0; the year stands in a field of four.
        {"never", 0, "   00000000000.000000+000"},
        {"", 18000, "   00000000000.000000+300"},
        {"2009", 0, "20090000000000.000000+000"},
        {"2009-03", 0, "20090300000000.000000+000"},
        {"2009-03-17-08:1", 0, "20090317080100.000000+000"},
        {"2009-xx-17", 0, "20090000000000.000000+000"},
        {usual + std::string(1000000, '9'), 0, "20090317081542.000000+000"},
    };
    for (const auto& row : rows)
        EXPECT_EQ(converted(row.text, row.zone), row.expected) << row.text.substr(0, 40);
}

TEST_F(DateTime, WithoutThePropertyIsNotKnown) {
    host->addNode({});
    OperatingSystem element;
    std::string text = "untouched";
    EXPECT_FALSE(element.getInstallDate(text));
    EXPECT_FALSE(element.getLastBootUpTime(text));
    EXPECT_EQ(text, "untouched");
}

TEST_F(DateTime, TakesTheZoneAsItStandsWithoutInitialisation) {
    setenv("TZ", "EST5", 1);
    EXPECT_EQ(converted("2009-03-17-08:15:42", -3600), "20090317081542.000000-060");
    EXPECT_EQ(timezone, -3600);
    unsetenv("TZ");
}

}  // namespace
