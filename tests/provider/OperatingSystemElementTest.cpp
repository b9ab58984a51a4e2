#include <gtest/gtest.h>

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

TEST_F(OperatingSystemElement, WithoutANodeItIsFalseAtOnceAndFiltersReadNothing) {
    OperatingSystem element;
    element.setFilter(OperatingSystem::CSNameFilter, "Host1");
    element.setFilter(OperatingSystem::NameFilter, "a");
    EXPECT_FALSE(static_cast<bool>(element));
    EXPECT_EQ(host->calls(Operation::ReadText), 0U);
    EXPECT_EQ(host->calls(Operation::ComputerName), 0U);
}

TEST_F(OperatingSystemElement, WithoutFiltersItWalksEveryNode) {
    addNodes({"a", "b", "c"});
    OperatingSystem element;
    EXPECT_EQ(walked(element), (Names{"a", "b", "c"}));
    ++element;
    EXPECT_FALSE(static_cast<bool>(element));
}

TEST_F(OperatingSystemElement, NameFilterIgnoresLetterCaseAndTrimsNothing) {
    addNodes({"a", "Linux", "b", "LINUX"});
    OperatingSystem element;
    element.setFilter(OperatingSystem::NameFilter, "linux");
    EXPECT_EQ(walked(element), (Names{"Linux", "LINUX"}));
    OperatingSystem trailing;
    trailing.setFilter(OperatingSystem::NameFilter, "linux ");
    EXPECT_FALSE(static_cast<bool>(trailing));
}

TEST_F(OperatingSystemElement, CSNameFilterIgnoresLetterCaseAndTrimsNothing) {
    addNode("a");
    OperatingSystem element;
    element.setFilter(OperatingSystem::CSNameFilter, "hOST1");
    EXPECT_TRUE(static_cast<bool>(element));
    OperatingSystem trailing;
    trailing.setFilter(OperatingSystem::CSNameFilter, "Host1 ");
    EXPECT_FALSE(static_cast<bool>(trailing));
}

TEST_F(OperatingSystemElement, NodePassesOnlyIfEveryFilterPasses) {
    addNodes({"a", "b"});
    OperatingSystem element;
    element.setFilter(OperatingSystem::NameFilter, "b");
    element.setFilter(OperatingSystem::CSNameFilter, "host1");
    EXPECT_EQ(walked(element), (Names{"b"}));
    OperatingSystem contradicting;
    contradicting.setFilter(OperatingSystem::NameFilter, "b");
    contradicting.setFilter(OperatingSystem::NameFilter, "a");
    EXPECT_FALSE(static_cast<bool>(contradicting));
}

TEST_F(OperatingSystemElement, FirstFailingFilterEndsTheTest) {
    addNode("a");
    OperatingSystem element;
    element.setFilter(OperatingSystem::CSNameFilter, "other");
    host->resetCounts();
    element.setFilter(OperatingSystem::NameFilter, "a");
    EXPECT_EQ(host->calls(Operation::ReadText, Name), 0U);
}

TEST_F(OperatingSystemElement, FilterThatTheCurrentNodeSatisfiesDoesNotMoveTheCursor) {
    addNodes({"a", "a"});
    OperatingSystem element;
    element.setFilter(OperatingSystem::NameFilter, "A");
    EXPECT_EQ(host->calls(Operation::Next), 0U);
    EXPECT_EQ(walked(element), (Names{"a", "a"}));
}

TEST_F(OperatingSystemElement, FilterOfAnotherTypePassesEveryNodeWithoutReading) {
    addNodes({"a", "b"});
    OperatingSystem element;
    element.setFilter(static_cast<OperatingSystem::FilterType>(7), "x");
    EXPECT_EQ(host->calls(Operation::ReadText), 0U);
    EXPECT_EQ(walked(element), (Names{"a", "b"}));
}

TEST_F(OperatingSystemElement, NodeWithoutTheFilteredValueFails) {
    host->addNode({});
    addNode("b");
    OperatingSystem element;
    element.setFilter(OperatingSystem::NameFilter, "b");
    EXPECT_EQ(walked(element), (Names{"b"}));
    host->setComputerName(std::nullopt);
    OperatingSystem nameless;
    nameless.setFilter(OperatingSystem::CSNameFilter, "");
    EXPECT_FALSE(static_cast<bool>(nameless));
}

TEST_F(OperatingSystemElement, OSTypeIsShiftedAgainstTheFrameworksNumber) {
    struct Row {
        unsigned int raw;
        unsigned short published;
    };
    for (const Row& row : {Row{0, 0}, Row{1, 2}, Row{35, 36}, Row{64, 65}, Row{65, 67}, Row{68, 70},
                           Row{69, 1}, Row{4294967295U, 1}}) {
        setProperty(OSType, row.raw);
        OperatingSystem element;
        unsigned short value = 4711;
        EXPECT_TRUE(element.getOSType(value)) << row.raw;
        EXPECT_EQ(value, row.published) << row.raw;
    }
}

TEST_F(OperatingSystemElement, OSTypeThatIsNotKnownLeavesTheOutputAlone) {
    host->addNode({});
    OperatingSystem element;
    unsigned short value = 4711;
    EXPECT_FALSE(element.getOSType(value));
    EXPECT_EQ(value, 4711);
}

TEST_F(OperatingSystemElement, EveryStatusCodeHasItsMeaningInTheThreeMaps) {
    using Numbers = std::vector<unsigned short>;
    struct Row {
        unsigned short enabledState;
        unsigned short healthState;
        Numbers operationalStatus;
    };
    const Row notApplicable = {5, 0, {0}};
    std::vector<std::pair<unsigned int, Row>> rows;
    for (unsigned int code = 0; code <= 30; ++code) rows.push_back({code, notApplicable});
    rows.push_back({4294967295U, notApplicable});
    rows[0].second = {0, 0, {0}};
    rows[1].second = {2, 5, {2, 11}};
    rows[2].second = {10, 0, {0}};
    rows[8].second = {9, 0, {0}};
    rows[9].second = {10, 0, {0}};
    rows[12].second = {6, 0, {0}};
    rows[16].second = {3, 0, {0}};
    rows[20].second = {5, 10, {3, 5}};
    for (unsigned int code = 21; code <= 26; ++code) rows[code].second = {5, 10, {3}};

    for (const auto& [code, expected] : rows) {
        host->clearNodes();
        host->addNode({{}, {}, code});
        OperatingSystem element;
        unsigned short enabledState = 4711;
        unsigned short healthState = 4711;
        Numbers operationalStatus;
        EXPECT_TRUE(element.getEnabledState(enabledState));
        EXPECT_TRUE(element.getHealthState(healthState));
        EXPECT_TRUE(element.getOperationalStatus(operationalStatus));
        EXPECT_EQ(enabledState, expected.enabledState) << code;
        EXPECT_EQ(healthState, expected.healthState) << code;
        EXPECT_EQ(operationalStatus, expected.operationalStatus) << code;
    }
}

TEST_F(OperatingSystemElement, OperationalStatusIsAppendedWithoutClearing) {
    host->addNode({{}, {}, 1});
    OperatingSystem element;
    std::vector<unsigned short> value = {99};
    element.getOperationalStatus(value);
    element.getOperationalStatus(value);
    EXPECT_EQ(value, (std::vector<unsigned short>{99, 2, 11, 2, 11}));
}

using SizeGetter = bool (OperatingSystem::*)(unsigned long long&);
struct SizeRow {
    Properties id;
    SizeGetter getter;
};
const SizeRow sizeRows[] = {
    {TotalSwapSpaceSize, &OperatingSystem::getTotalSwapSpaceSize},
    {TotalVirtualMemorySize, &OperatingSystem::getTotalVirtualMemorySize},
    {FreeVirtualMemory, &OperatingSystem::getFreeVirtualMemory},
    {FreePhysicalMemory, &OperatingSystem::getFreePhysicalMemory},
    {TotalVisibleMemorySize, &OperatingSystem::getTotalVisibleMemorySize},
    {SizeStoredInPagingFiles, &OperatingSystem::getSizeStoredInPagingFiles},
    {FreeSpaceInPagingFiles, &OperatingSystem::getFreeSpaceInPagingFiles},
    {MaxProcessMemorySize, &OperatingSystem::getMaxProcessMemorySize},
};

TEST_F(OperatingSystemElement, SizesAreWidenedUnscaled) {
    for (const SizeRow& row : sizeRows) {
        setProperty(row.id, 4294967295U);
        OperatingSystem element;
        unsigned long long value = 0;
        EXPECT_TRUE((element.*row.getter)(value)) << row.id;
        EXPECT_EQ(value, 4294967295ULL) << row.id;
    }
}

TEST_F(OperatingSystemElement, SizeThatIsNotKnownIsFalseAndStillWritesZero) {
    host->addNode({});
    for (const SizeRow& row : sizeRows) {
        OperatingSystem element;
        unsigned long long value = 4711;
        EXPECT_FALSE((element.*row.getter)(value)) << row.id;
        EXPECT_EQ(value, 0ULL) << row.id;
    }
}

using CountGetter = bool (OperatingSystem::*)(unsigned int&);

TEST_F(OperatingSystemElement, CountsComeFromTheirOwnProperty) {
    const std::pair<Properties, CountGetter> rows[] = {
        {NumberOfLicensedUsers, &OperatingSystem::getNumberOfLicensedUsers},
        {NumberOfUsers, &OperatingSystem::getNumberOfUsers},
        {NumberOfProcesses, &OperatingSystem::getNumberOfProcesses},
        {MaxNumberOfProcesses, &OperatingSystem::getMaxNumberOfProcesses},
    };
    for (const auto& [id, getter] : rows) {
        setProperty(id, 17U);
        OperatingSystem element;
        unsigned int value = 0;
        EXPECT_TRUE((element.*getter)(value)) << id;
        EXPECT_EQ(value, 17U) << id;
        setProperty(Name, std::string("a"));
        OperatingSystem without;
        EXPECT_FALSE((without.*getter)(value)) << id;
    }
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

}  // namespace
