#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "FrameworkException.h"
#include "Linux/ElementCapabilities.h"
#include "Linux/InstalledOS.h"
#include "Linux/RunningOS.h"
#include "support/RecordingLog.h"

namespace {

using Keys = std::vector<std::pair<std::string, std::string>>;
using VA::OSStatusProvider::InstalledOS;
using VA::OSStatusProvider::OSElementCapabilities;
using VA::OSStatusProvider::RunningOS;

constexpr const char* noComputer = "Could not find 'CSName' or 'Name' Key in Moniker";
constexpr const char* noName = "Could not find 'Name' Key in Moniker";
constexpr const char* noInstanceId = "Could not find 'InstanceID' Key in Moniker";

VA::Moniker moniker(const Keys& keys) {
    VA::Moniker result;
    for (const auto& [name, value] : keys) result.addKey(name, value);
    return result;
}

Keys keysOf(VA::Moniker moniker) {
    Keys keys;
    for (unsigned int index = 0; index < moniker.getKeyCount(); ++index) {
        moniker.selectKey(index);
        std::pair<std::string, std::string> key;
        moniker.getName(key.first);
        moniker.getValue(key.second);
        keys.push_back(key);
    }
    return keys;
}

template <class Call>
std::string messageOf(Call call) {
    try {
        call();
    } catch (const VA::FrameworkException& caught) {
        return caught.what();
    }
    return "nothing was thrown";
}

template <class Mapping>
class HostMapping : public testing::Test {
  protected:
    Keys computerSystem(const Keys& keys) {
        VA::Moniker source = moniker(keys);
        return keysOf(mapping.getComputerSystemMoniker(source));
    }
    Keys operatingSystem(const Keys& keys) {
        VA::Moniker source = moniker(keys);
        return keysOf(mapping.getOperatingSystemMoniker(source));
    }
    Mapping mapping;
};

using Both = testing::Types<InstalledOS, RunningOS>;
TYPED_TEST_SUITE(HostMapping, Both, );

TYPED_TEST(HostMapping, ComputerSystemIsNamedByTheCSNameThatComesFirst) {
    EXPECT_EQ(this->computerSystem({{"CSCreationClassName", "KORVA_ComputerSystem"},
                                    {"CSName", "host1"},
                                    {"CreationClassName", "KORVA_OperatingSystem"},
                                    {"Name", "os1"}}),
              (Keys{{"Name", "host1"}}));
}

TYPED_TEST(HostMapping, ComputerSystemIsNamedByTheNameThatComesFirst) {
    EXPECT_EQ(this->computerSystem({{"Name", "os1"}, {"CSName", "host1"}}),
              (Keys{{"Name", "os1"}}));
}

TYPED_TEST(HostMapping, KeyNamesMatchLetterForLetter) {
    EXPECT_EQ(messageOf([this] { this->computerSystem({{"csname", "host1"}}); }), noComputer);
    EXPECT_EQ(messageOf([this] {
                  this->computerSystem({{"CSNames", "x"}, {"ame", "y"}});
              }),
              noComputer);
    EXPECT_EQ(messageOf([this] { this->operatingSystem({{"name", "host1"}}); }), noName);
}

TYPED_TEST(HostMapping, EmptyMonikerThrowsTheMethodsMessage) {
    EXPECT_EQ(messageOf([this] { this->computerSystem({}); }), noComputer);
    EXPECT_EQ(messageOf([this] { this->operatingSystem({}); }), noName);
}

TYPED_TEST(HostMapping, OperatingSystemIsNamedByTheComputersName) {
    EXPECT_EQ(
        this->operatingSystem({{"CreationClassName", "KORVA_ComputerSystem"}, {"Name", "host1"}}),
        (Keys{{"CSName", "host1"}}));
}

TYPED_TEST(HostMapping, ComputerWithOnlyACSNameThrows) {
    EXPECT_EQ(messageOf([this] { this->operatingSystem({{"CSName", "host1"}}); }), noName);
}

TYPED_TEST(HostMapping, ValuesAreCarriedAcrossByteForByte) {
    const std::string value("a\0b\xff%n\n", 8);
    EXPECT_EQ(this->computerSystem({{"CSName", value}}), (Keys{{"Name", value}}));
    EXPECT_EQ(this->computerSystem({{"CSName", ""}}), (Keys{{"Name", ""}}));
}

TYPED_TEST(HostMapping, FirstOfSeveralKeysOfOneNameWins) {
    EXPECT_EQ(this->operatingSystem({{"Name", "one"}, {"Name", "two"}}), (Keys{{"CSName", "one"}}));
}

/// Counts the selections of keys while it lives; that of the key at `failing` fails.
struct Selections {
    explicit Selections(unsigned int failingIndex = 99) : failing(failingIndex) { current = this; }
    ~Selections() { current = nullptr; }
    Selections(const Selections&) = delete;
    Selections& operator=(const Selections&) = delete;

    static inline Selections* current = nullptr;
    unsigned int failing;
    unsigned int count = 0;
};

TYPED_TEST(HostMapping, EmptyMonikerThrowsWithoutASelection) {
    VA::Moniker empty;
    const Selections selections;
    EXPECT_THROW(this->mapping.getComputerSystemMoniker(empty), VA::FrameworkException);
    EXPECT_THROW(this->mapping.getOperatingSystemMoniker(empty), VA::FrameworkException);
    EXPECT_EQ(selections.count, 0U);
}

TYPED_TEST(HostMapping, SearchSelectsEachKeyOnceUntilItFindsTheOneSought) {
    VA::Moniker source = moniker({{"Other", "x"}, {"Name", "n"}, {"Name", "later"}});
    {
        const Selections selections;
        this->mapping.getOperatingSystemMoniker(source);
        EXPECT_EQ(selections.count, 2U);
    }
    VA::Moniker without = moniker({{"Other", "x"}, {"Another", "y"}});
    const Selections selections;
    EXPECT_THROW(this->mapping.getOperatingSystemMoniker(without), VA::FrameworkException);
    EXPECT_EQ(selections.count, 2U);
}

TYPED_TEST(HostMapping, KeyThatCannotBeSelectedIsPassedOver) {
    VA::Moniker source = moniker({{"Name", "one"}, {"Name", "two"}, {"Name", "three"}});
    source.selectKey(2);
    VA::Moniker mapped;
    {
        const Selections selections(0);
        mapped = this->mapping.getOperatingSystemMoniker(source);
    }
    EXPECT_EQ(keysOf(mapped), (Keys{{"CSName", "two"}}));
}

TEST(InstalledOSRecords, MappingIsFramedByRecordsWithTheMonikersAddress) {
    InstalledOS mapping;
    VA::Moniker source = moniker({{"CSName", "h"}, {"Name", "n"}});
    std::ostringstream address;
    address << static_cast<const void*>(&source);
    recording::clear();
    mapping.getComputerSystemMoniker(source);
    auto records = recording::take();
    ASSERT_EQ(records.size(), 4U);
    EXPECT_NE(records[0].text.find(",Parameters List:  monikerOS=" + address.str()),
              std::string::npos);
    EXPECT_EQ(
        recording::rendered(records),
        "both getComputerSystemMoniker Linux/InstalledOS.cpp:# "
        "Zumbrel.OperatingSystemProvider 3000 null 0 0 | ENTERING: getComputerSystemMoniker() "
        "in Linux/InstalledOS.cpp [Line: #],Parameters List:  monikerOS=0x*\n"
        "both getComputerSystemMoniker Linux/InstalledOS.cpp:# "
        "Zumbrel.OperatingSystemProvider 3000 null 0 0 | EXITING: getComputerSystemMoniker() "
        "in Linux/InstalledOS.cpp [Line: #],Parameters List:  monikerOS=0x*\n");
    mapping.getOperatingSystemMoniker(source);
    EXPECT_EQ(recording::takeRendered(),
              "both getOperatingSystemMoniker Linux/InstalledOS.cpp:# "
              "Zumbrel.OperatingSystemProvider 3000 null 0 0 | ENTERING: "
              "getOperatingSystemMoniker() in Linux/InstalledOS.cpp [Line: #],Parameters List:  "
              "monikerComputer=0x*\n"
              "both getOperatingSystemMoniker Linux/InstalledOS.cpp:# "
              "Zumbrel.OperatingSystemProvider 3000 null 0 0 | EXITING: "
              "getOperatingSystemMoniker() in Linux/InstalledOS.cpp [Line: #],Parameters List:  "
              "monikerComputer=0x*\n");
}

TEST(InstalledOSRecords, NoExitingRecordIsWrittenWhenTheMappingThrows) {
    InstalledOS mapping;
    VA::Moniker empty;
    recording::clear();
    EXPECT_THROW(mapping.getComputerSystemMoniker(empty), VA::FrameworkException);
    const auto records = recording::take();
    ASSERT_EQ(records.size(), 2U);
    EXPECT_EQ(records[0].text.rfind("ENTERING: getComputerSystemMoniker()", 0), 0U);
}

TEST(RunningOSRecords, MappingWritesNoRecords) {
    RunningOS mapping;
    VA::Moniker source = moniker({{"CSName", "h"}, {"Name", "n"}});
    recording::clear();
    mapping.getComputerSystemMoniker(source);
    mapping.getOperatingSystemMoniker(source);
    EXPECT_TRUE(recording::take().empty());
}

TEST(InstalledOSPrimary, IsNeverKnownAndLeavesTheArgumentAlone) {
    InstalledOS mapping;
    recording::clear();
    for (bool held : {true, false}) {
        bool primary = held;
        EXPECT_FALSE(mapping.isPrimaryOS(primary));
        EXPECT_EQ(primary, held);
    }
    EXPECT_TRUE(recording::take().empty());
}

TEST(CapabilitiesMapping, OperatingSystemIsNamedByTheInstanceID) {
    OSElementCapabilities mapping;
    VA::Moniker source = moniker({{"Other", "x"}, {"InstanceID", "os1"}, {"Name", "y"}});
    EXPECT_EQ(keysOf(mapping.getOperatingSystemMoniker(source)), (Keys{{"Name", "os1"}}));
}

TEST(CapabilitiesMapping, CapabilitiesAreIdentifiedByTheName) {
    OSElementCapabilities mapping;
    VA::Moniker source = moniker({{"CSName", "h"}, {"Name", "os1"}});
    EXPECT_EQ(keysOf(mapping.getOSCapabilitiesMoniker(source)), (Keys{{"InstanceID", "os1"}}));
}

TEST(CapabilitiesMapping, ThereAndBackGivesTheValueItStartedWith) {
    OSElementCapabilities mapping;
    for (const std::string& value : {std::string("os1"), std::string(), std::string("a\0b", 3)}) {
        VA::Moniker start = moniker({{"InstanceID", value}});
        VA::Moniker there = mapping.getOperatingSystemMoniker(start);
        EXPECT_EQ(keysOf(mapping.getOSCapabilitiesMoniker(there)), (Keys{{"InstanceID", value}}));
    }
}

TEST(CapabilitiesMapping, MissingOrDifferentlySpeltKeyThrows) {
    OSElementCapabilities mapping;
    for (const Keys& keys : {Keys{}, Keys{{"instanceid", "x"}}, Keys{{"name", "x"}}}) {
        VA::Moniker source = moniker(keys);
        EXPECT_EQ(messageOf([&] { mapping.getOperatingSystemMoniker(source); }), noInstanceId);
        EXPECT_EQ(messageOf([&] { mapping.getOSCapabilitiesMoniker(source); }), noName);
    }
}

TEST(CapabilitiesMapping, RecordsBearACategoryOfTheirOwn) {
    recording::clear();
    {
        OSElementCapabilities mapping;
        VA::Moniker capabilities = moniker({{"InstanceID", "os1"}});
        VA::Moniker system = moniker({{"Name", "os1"}});
        mapping.getOperatingSystemMoniker(capabilities);
        mapping.getOSCapabilitiesMoniker(system);
    }
    EXPECT_EQ(
        recording::takeRendered(),
        R"(both OSElementCapabilities Linux/ElementCapabilities.cpp:# Zumbrel.OSStatusProvider 4000 null 0 0 | METHOD: OSElementCapabilities() was invoked in Linux/ElementCapabilities.cpp [Line: #]
both getOperatingSystemMoniker Linux/ElementCapabilities.cpp:# Zumbrel.OSStatusProvider 3000 null 0 0 | ENTERING: getOperatingSystemMoniker() in Linux/ElementCapabilities.cpp [Line: #],Parameters List:  monikerCapabilities=0x*
both getOperatingSystemMoniker Linux/ElementCapabilities.cpp:# Zumbrel.OSStatusProvider 4000 null 0 0 | VARIABLE: 'InstanceID' has Value 'os1' at line # in Linux/ElementCapabilities.cpp
both getOperatingSystemMoniker Linux/ElementCapabilities.cpp:# Zumbrel.OSStatusProvider 3000 null 0 0 | EXITING: getOperatingSystemMoniker() in Linux/ElementCapabilities.cpp [Line: #],Parameters List:  monikerCapabilities=0x*
both getOSCapabilitiesMoniker Linux/ElementCapabilities.cpp:# Zumbrel.OSStatusProvider 3000 null 0 0 | ENTERING: getOSCapabilitiesMoniker() in Linux/ElementCapabilities.cpp [Line: #],Parameters List:  monikerOS=0x*
both getOSCapabilitiesMoniker Linux/ElementCapabilities.cpp:# Zumbrel.OSStatusProvider 3000 null 0 0 | EXITING: getOSCapabilitiesMoniker() in Linux/ElementCapabilities.cpp [Line: #],Parameters List:  monikerOS=0x*
both ~OSElementCapabilities Linux/ElementCapabilities.cpp:# Zumbrel.OSStatusProvider 4000 null 0 0 | METHOD: ~OSElementCapabilities() was invoked in Linux/ElementCapabilities.cpp [Line: #]
)");
}

TEST(CapabilitiesMapping, NoExitingRecordIsWrittenWhenTheMappingThrows) {
    OSElementCapabilities mapping;
    VA::Moniker empty;
    recording::clear();
    EXPECT_THROW(mapping.getOperatingSystemMoniker(empty), VA::FrameworkException);
    EXPECT_THROW(mapping.getOSCapabilitiesMoniker(empty), VA::FrameworkException);
    const auto records = recording::take();
    ASSERT_EQ(records.size(), 4U);
    for (const auto& record : records) EXPECT_EQ(record.text.rfind("ENTERING: ", 0), 0U);
}

}  // namespace

// The linker binds every call of Moniker::selectKey to the first, and the second to the function
// itself.
extern "C" {
bool __real__ZN2VA7Moniker9selectKeyEj(VA::Moniker* self, unsigned int index);
bool __wrap__ZN2VA7Moniker9selectKeyEj(VA::Moniker* self, unsigned int index) {
    Selections* const selections = Selections::current;
    if (selections != nullptr) ++selections->count;
    if (selections != nullptr && index == selections->failing) return false;
    return __real__ZN2VA7Moniker9selectKeyEj(self, index);
}
}
