#include <gmock/gmock.h>

#include <functional>
#include <memory>
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

/// A way from one end of an association to the other.
struct Mapping {
    const char* name;
    std::function<VA::Moniker(VA::Moniker&)> map;
    std::vector<std::string> sought;  ///< the names of keys, any of which names the far end
    const char* farKey;
    const char* message;   ///< when there is none of these
    const char* entering;  ///< the function that writes records, null: none
};

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

class KeyMapping : public testing::Test {
  protected:
    InstalledOS installed;
    RunningOS running;
    // Not a member itself: destroying it may throw, destroying a fixture must not.
    std::unique_ptr<OSElementCapabilities> capabilities = std::make_unique<OSElementCapabilities>();

    const Mapping mappings[6] = {
        {"InstalledOS, computer",
         [this](auto& os) { return installed.getComputerSystemMoniker(os); },
         {"CSName", "Name"},
         "Name",
         noComputer,
         "getComputerSystemMoniker"},
        {"InstalledOS, system",
         [this](auto& cs) { return installed.getOperatingSystemMoniker(cs); },
         {"Name"},
         "CSName",
         noName,
         "getOperatingSystemMoniker"},
        {"RunningOS, computer",
         [this](auto& os) { return running.getComputerSystemMoniker(os); },
         {"CSName", "Name"},
         "Name",
         noComputer,
         nullptr},
        {"RunningOS, system",
         [this](auto& cs) { return running.getOperatingSystemMoniker(cs); },
         {"Name"},
         "CSName",
         noName,
         nullptr},
        {"OSElementCapabilities, system",
         [this](auto& of) { return capabilities->getOperatingSystemMoniker(of); },
         {"InstanceID"},
         "Name",
         noInstanceId,
         "getOperatingSystemMoniker"},
        {"OSElementCapabilities, capabilities",
         [this](auto& os) { return capabilities->getOSCapabilitiesMoniker(os); },
         {"Name"},
         "InstanceID",
         noName,
         "getOSCapabilitiesMoniker"},
    };
};

TEST_F(KeyMapping, CarriesTheFirstKeySoughtAcrossByteForByte) {
    const std::string anyBytes("a\0b\xff%n\n", 8);
    for (const Mapping& mapping : mappings)
        for (const std::string& sought : mapping.sought)
            for (const std::string& value : {std::string("one"), std::string(), anyBytes}) {
                VA::Moniker source = moniker({{"CreationClassName", "x"},
                                              {"Other", "y"},
                                              {sought, value},
                                              {mapping.sought.back(), "two"},
                                              {mapping.sought.front(), "three"}});
                unsigned int selections = 0;
                VA::Moniker mapped;
                {
                    const Selections counted;
                    mapped = mapping.map(source);
                    selections = counted.count;
                }
                EXPECT_EQ(keysOf(mapped), (Keys{{mapping.farKey, value}})) << mapping.name;
                EXPECT_EQ(selections, 3U) << mapping.name;  // none past the one found
            }
}

TEST_F(KeyMapping, PassesOverAKeyThatCannotBeSelected) {
    for (const Mapping& mapping : mappings) {
        const std::string& sought = mapping.sought.back();
        VA::Moniker source = moniker({{sought, "one"}, {sought, "two"}, {sought, "three"}});
        source.selectKey(2);
        VA::Moniker mapped;
        {
            const Selections first(0);
            mapped = mapping.map(source);
        }
        EXPECT_EQ(keysOf(mapped), (Keys{{mapping.farKey, "two"}})) << mapping.name;
    }
}

TEST_F(KeyMapping, ThrowsAfterTheEnteringRecordWithoutAKeyOfThatVeryName) {
    const Keys rows[] = {
        {},
        {{"csname", "a"}, {"name", "b"}, {"instanceid", "c"}},
        {{"CSNames", "a"}, {"ame", "b"}, {"InstanceIDs", "c"}},
    };
    for (const Mapping& mapping : mappings)
        for (const Keys& keys : rows) {
            SCOPED_TRACE(mapping.name);
            VA::Moniker source = moniker(keys);
            recording::clear();
            const Selections selections;
            EXPECT_EQ(messageOf([&] { mapping.map(source); }), mapping.message);
            EXPECT_EQ(selections.count, keys.size());
            const std::vector<recording::Record> records = recording::take();
            EXPECT_EQ(records.size(), mapping.entering == nullptr ? 0U : 2U);
            for (const recording::Record& record : records)
                EXPECT_THAT(record.text, testing::StartsWith(std::string("ENTERING: ") +
                                                             mapping.entering + "()"));
        }
    VA::Moniker computer = moniker({{"CSName", "host1"}});
    EXPECT_EQ(messageOf([&] { installed.getOperatingSystemMoniker(computer); }), noName);
    EXPECT_EQ(messageOf([&] { running.getOperatingSystemMoniker(computer); }), noName);
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

TEST(CapabilitiesRecords, BearACategoryOfTheirOwn) {
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
