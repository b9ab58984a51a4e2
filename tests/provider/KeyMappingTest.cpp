#include <gmock/gmock.h>

#include <sstream>
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

using Texts = std::vector<std::string>;

// The functions whose entering records, and no others, were written.
Texts entered() {
    Texts functions;
    for (const recording::Record& record : recording::take()) {
        EXPECT_THAT(record.text, testing::StartsWith("ENTERING: " + record.function + "()"));
        if (record.channel == "log") functions.push_back(record.function);
    }
    return functions;
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

TYPED_TEST(HostMapping, ComputerSystemIsNamedByTheFirstOfCSNameAndName) {
    const std::string anyBytes("a\0b\xff%n\n", 8);
    const std::pair<Keys, std::string> rows[] = {
        {{{"CSCreationClassName", "KORVA_ComputerSystem"},
          {"CSName", "host1"},
          {"CreationClassName", "KORVA_OperatingSystem"},
          {"Name", "os1"}},
         "host1"},
        {{{"Name", "os1"}, {"CSName", "host1"}}, "os1"},
        {{{"CSName", anyBytes}}, anyBytes},
        {{{"CSName", ""}}, ""},
    };
    for (const auto& [keys, name] : rows)
        EXPECT_EQ(this->computerSystem(keys), (Keys{{"Name", name}}));
}

TYPED_TEST(HostMapping, OperatingSystemIsNamedByTheFirstNameOfTheComputer) {
    EXPECT_EQ(
        this->operatingSystem({{"CreationClassName", "KORVA_ComputerSystem"}, {"Name", "host1"}}),
        (Keys{{"CSName", "host1"}}));
    EXPECT_EQ(this->operatingSystem({{"Name", "one"}, {"Name", "two"}}), (Keys{{"CSName", "one"}}));
}

TYPED_TEST(HostMapping, WithoutAKeyOfThatVeryNameTheMethodsMessageIsThrown) {
    for (const Keys& keys :
         {Keys{}, Keys{{"csname", "host1"}}, Keys{{"CSNames", "x"}, {"ame", "y"}}})
        EXPECT_EQ(messageOf([&] { this->computerSystem(keys); }), noComputer);
    for (const Keys& keys : {Keys{}, Keys{{"name", "host1"}}, Keys{{"CSName", "host1"}}})
        EXPECT_EQ(messageOf([&] { this->operatingSystem(keys); }), noName);
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

TYPED_TEST(HostMapping, SearchSelectsEachKeyOnceUntilItFindsTheOneSought) {
    const auto selectionsIn = [this](const Keys& keys) {
        VA::Moniker source = moniker(keys);
        const Selections selections;
        messageOf([&] { this->mapping.getOperatingSystemMoniker(source); });
        return selections.count;
    };
    EXPECT_EQ(selectionsIn({{"Other", "x"}, {"Name", "n"}, {"Name", "later"}}), 2U);
    EXPECT_EQ(selectionsIn({{"Other", "x"}, {"Another", "y"}}), 2U);
    EXPECT_EQ(selectionsIn({}), 0U);
    VA::Moniker empty;
    const Selections selections;
    EXPECT_THROW(this->mapping.getComputerSystemMoniker(empty), VA::FrameworkException);
    EXPECT_EQ(selections.count, 0U);
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

TEST(InstalledOSRecords, FrameTheMappingWithTheMonikersAddress) {
    InstalledOS mapping;
    VA::Moniker source = moniker({{"CSName", "h"}, {"Name", "n"}});
    std::ostringstream address;
    address << static_cast<const void*>(&source);
    recording::clear();
    mapping.getComputerSystemMoniker(source);
    mapping.getOperatingSystemMoniker(source);
    const auto records = recording::take();
    for (const recording::Record& record : records)
        EXPECT_THAT(record.text, testing::EndsWith("=" + address.str()));
    EXPECT_EQ(
        recording::rendered(records),
        R"(both getComputerSystemMoniker Linux/InstalledOS.cpp:# Zumbrel.OperatingSystemProvider 3000 null 0 0 | ENTERING: getComputerSystemMoniker() in Linux/InstalledOS.cpp [Line: #],Parameters List:  monikerOS=0x*
both getComputerSystemMoniker Linux/InstalledOS.cpp:# Zumbrel.OperatingSystemProvider 3000 null 0 0 | EXITING: getComputerSystemMoniker() in Linux/InstalledOS.cpp [Line: #],Parameters List:  monikerOS=0x*
both getOperatingSystemMoniker Linux/InstalledOS.cpp:# Zumbrel.OperatingSystemProvider 3000 null 0 0 | ENTERING: getOperatingSystemMoniker() in Linux/InstalledOS.cpp [Line: #],Parameters List:  monikerComputer=0x*
both getOperatingSystemMoniker Linux/InstalledOS.cpp:# Zumbrel.OperatingSystemProvider 3000 null 0 0 | EXITING: getOperatingSystemMoniker() in Linux/InstalledOS.cpp [Line: #],Parameters List:  monikerComputer=0x*
)");
}

TEST(InstalledOSRecords, LackTheExitingOneWhenTheMappingThrows) {
    InstalledOS mapping;
    VA::Moniker empty;
    recording::clear();
    EXPECT_THROW(mapping.getComputerSystemMoniker(empty), VA::FrameworkException);
    EXPECT_THROW(mapping.getOperatingSystemMoniker(empty), VA::FrameworkException);
    EXPECT_EQ(entered(), (Texts{"getComputerSystemMoniker", "getOperatingSystemMoniker"}));
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

TEST(CapabilitiesMapping, TurnsInstanceIDIntoNameAndBack) {
    OSElementCapabilities mapping;
    for (const std::string& value : {std::string("os1"), std::string(), std::string("a\0b", 3)}) {
        VA::Moniker capabilities = moniker({{"Other", "x"}, {"InstanceID", value}, {"Name", "y"}});
        VA::Moniker system = mapping.getOperatingSystemMoniker(capabilities);
        EXPECT_EQ(keysOf(system), (Keys{{"Name", value}}));
        EXPECT_EQ(keysOf(mapping.getOSCapabilitiesMoniker(system)), (Keys{{"InstanceID", value}}));
    }
    VA::Moniker system = moniker({{"CSName", "h"}, {"Name", "os1"}});
    EXPECT_EQ(keysOf(mapping.getOSCapabilitiesMoniker(system)), (Keys{{"InstanceID", "os1"}}));
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
    EXPECT_EQ(entered(), (Texts{"getOperatingSystemMoniker", "getOSCapabilitiesMoniker"}));
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
