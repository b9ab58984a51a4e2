// The shipped MOF files, compared with what the provider publishes.
#include <gmock/gmock.h>

#include <algorithm>
#include <set>

#include "host/mof/MofAst.h"
#include "host/mof/Schema.h"

namespace {

using cmpihost::Schema;
namespace mof = cmpihost::mof;

struct ExpectedClass {
    const char* name;
    const char* superclass;
    bool association;
    /// "type name" in the order of declaration; "[]" marks an array, "*" a key.
    std::vector<std::string> properties;
};

const std::vector<ExpectedClass> expectedClasses = {
    {"KORVA_ComputerSystem",
     "CIM_ComputerSystem",
     false,
     {"string Caption", "string Description", "string ElementName", "uint16[] OperationalStatus",
      "uint16 HealthState", "uint16 EnabledState", "uint16 RequestedState",
      "*string CreationClassName", "*string Name", "string NameFormat", "string PrimaryOwnerName",
      "uint16[] Dedicated"}},
    {"KORVA_InstalledOS",
     "CIM_InstalledOS",
     true,
     {"*CIM_ComputerSystem ref GroupComponent", "*CIM_OperatingSystem ref PartComponent",
      "boolean PrimaryOS"}},
    {"KORVA_OperatingSystem",
     "CIM_OperatingSystem",
     false,
     {"string Caption",
      "string Description",
      "string ElementName",
      "datetime InstallDate",
      "uint16[] OperationalStatus",
      "string[] StatusDescriptions",
      "uint16 HealthState",
      "uint16 PrimaryStatus",
      "uint16 DetailedStatus",
      "uint16 OperatingStatus",
      "string Status",
      "uint16 CommunicationStatus",
      "uint16 EnabledState",
      "string OtherEnabledState",
      "uint16 RequestedState",
      "uint16 EnabledDefault",
      "datetime TimeOfLastStateChange",
      "uint16[] AvailableRequestedStates",
      "uint16 TransitioningToState",
      "*string CSCreationClassName",
      "*string CSName",
      "*string CreationClassName",
      "*string Name",
      "uint16 OSType",
      "string OtherTypeDescription",
      "string Version",
      "datetime LastBootUpTime",
      "datetime LocalDateTime",
      "sint16 CurrentTimeZone",
      "uint32 NumberOfLicensedUsers",
      "uint32 NumberOfUsers",
      "uint32 NumberOfProcesses",
      "uint32 MaxNumberOfProcesses",
      "uint64 TotalSwapSpaceSize",
      "uint64 TotalVirtualMemorySize",
      "uint64 FreeVirtualMemory",
      "uint64 FreePhysicalMemory",
      "uint64 TotalVisibleMemorySize",
      "uint64 SizeStoredInPagingFiles",
      "uint64 FreeSpaceInPagingFiles",
      "uint64 MaxProcessMemorySize",
      "boolean Distributed",
      "uint32 MaxProcessesPerUser"}},
    {"KORVA_OperatingSystemCapabilities",
     "CIM_OperatingSystemCapabilities",
     false,
     {"*string InstanceID", "string ElementName", "boolean ElementNameEditSupported",
      "uint16 MaxElementNameLen", "uint16[] RequestedStatesSupported",
      "uint16 HostShutdownBehavior"}},
    {"KORVA_OSElementCapabilities",
     "CIM_ElementCapabilities",
     true,
     {"*CIM_OperatingSystem ref ManagedElement",
      "*CIM_OperatingSystemCapabilities ref Capabilities"}},
    {"KORVA_RunningOS",
     "CIM_RunningOS",
     true,
     {"*CIM_OperatingSystem ref Antecedent", "*CIM_ComputerSystem ref Dependent"}},
};

/// Every qualifier that the files use is declared by the standard with this scope.
const std::set<std::string> standardQualifiers = {
    "Aggregate", "Aggregation", "ArrayType", "Association", "Description", "Gauge",
    "Key",       "Max",         "MaxLen",    "Min",         "Override",    "Propagated",
    "Required",  "ValueMap",    "Units",     "Values",      "Version",     "Weak"};

const Schema& shipped() {
    static const Schema schema = Schema::load(KORVA_SOURCE_DIR "/schema");
    return schema;
}

std::string described(const mof::Feature& property) {
    std::string text = mof::isSet(property.qualifiers, "Key") ? "*" : "";
    text += property.type == mof::Type::Reference ? property.referenceClass + " " : "";
    text += mof::nameOf(property.type);
    return text + (property.array ? "[] " : " ") + property.name;
}

class ShippedClass : public testing::TestWithParam<ExpectedClass> {
  protected:
    const mof::Class* declared() const { return shipped().find(GetParam().name); }
};

TEST_P(ShippedClass, HasItsSuperclassAndKind) {
    ASSERT_NE(declared(), nullptr);
    EXPECT_EQ(declared()->name, GetParam().name);
    EXPECT_EQ(declared()->superclass, GetParam().superclass);
    EXPECT_EQ(shipped().isAssociation(GetParam().name), GetParam().association);
}

TEST_P(ShippedClass, DeclaresExactlyTheExpectedPropertiesInOrder) {
    ASSERT_NE(declared(), nullptr);
    std::vector<std::string> found;
    for (const mof::Feature& property : declared()->properties) {
        found.push_back(described(property));
    }
    EXPECT_EQ(found, GetParam().properties);
}

TEST_P(ShippedClass, OverridesAndDescribesEveryProperty) {
    ASSERT_NE(declared(), nullptr);
    EXPECT_GT(mof::text(declared()->qualifiers, "Description").size(), 40U);
    for (const mof::Feature& property : declared()->properties) {
        EXPECT_EQ(mof::text(property.qualifiers, "Override"), property.name);
        EXPECT_GT(mof::text(property.qualifiers, "Description").size(), 15U) << property.name;
    }
}

TEST_P(ShippedClass, UsesStandardQualifiersOnly) {
    ASSERT_NE(declared(), nullptr);
    const auto check = [](const std::vector<mof::Qualifier>& qualifiers) {
        for (const mof::Qualifier& qualifier : qualifiers) {
            EXPECT_EQ(standardQualifiers.count(qualifier.name), 1U) << qualifier.name;
        }
    };
    check(declared()->qualifiers);
    for (const mof::Feature& property : declared()->properties) {
        check(property.qualifiers);
    }
}

INSTANTIATE_TEST_SUITE_P(Schema, ShippedClass, testing::ValuesIn(expectedClasses),
                         [](const auto& row) { return std::string(row.param.name); });

TEST(ShippedSchema, HoldsNoOtherClass) {
    std::vector<std::string> expected;
    for (const ExpectedClass& row : expectedClasses) {
        expected.emplace_back(row.name);
    }
    EXPECT_THAT(shipped().classNames(), testing::UnorderedElementsAreArray(expected));
}

struct NamedNumber {
    const char* className;
    const char* property;
    std::int64_t number;
    const char* name;
};

TEST(ShippedSchema, NamesTheNumbersThatTheProviderPublishes) {
    const NamedNumber rows[] = {
        {"KORVA_OperatingSystem", "OSType", 0, "Unknown"},
        {"KORVA_OperatingSystem", "OSType", 1, "Other"},
        {"KORVA_OperatingSystem", "OSType", 36, "LINUX"},
        {"KORVA_OperatingSystem", "OSType", 59, "Dedicated"},
        {"KORVA_OperatingSystem", "OSType", 66, "Not Applicable"},
        {"KORVA_OperatingSystem", "OSType", 70, "Microsoft Windows Server 2003 64-Bit"},
        {"KORVA_OperatingSystem", "OSType", 96, "Debian 64-Bit"},
        {"KORVA_OperatingSystem", "OSType", 109, "Oracle Linux 64-bit"},
        {"KORVA_OperatingSystem", "EnabledState", 2, "Enabled"},
        {"KORVA_OperatingSystem", "EnabledState", 5, "Not Applicable"},
        {"KORVA_OperatingSystem", "EnabledState", 6, "Enabled but Offline"},
        {"KORVA_OperatingSystem", "EnabledState", 9, "Quiesce"},
        {"KORVA_OperatingSystem", "EnabledState", 10, "Starting"},
        {"KORVA_OperatingSystem", "HealthState", 5, "OK"},
        {"KORVA_OperatingSystem", "HealthState", 10, "Degraded/Warning"},
        {"KORVA_OperatingSystem", "OperationalStatus", 2, "OK"},
        {"KORVA_OperatingSystem", "OperationalStatus", 3, "Degraded"},
        {"KORVA_OperatingSystem", "OperationalStatus", 5, "Predictive Failure"},
        {"KORVA_OperatingSystem", "OperationalStatus", 11, "In Service"},
        {"KORVA_OperatingSystem", "RequestedState", 12, "Not Applicable"},
        {"KORVA_OperatingSystemCapabilities", "HostShutdownBehavior", 3, "No effect"},
        {"KORVA_ComputerSystem", "Dedicated", 0, "Not Dedicated"},
        {"KORVA_ComputerSystem", "Dedicated", 33, "Laptop"},
    };
    for (const NamedNumber& row : rows) {
        const std::string* name = shipped().valueMap(row.className, row.property).find(row.number);
        ASSERT_NE(name, nullptr) << row.property << " " << row.number;
        EXPECT_EQ(*name, row.name) << row.property << " " << row.number;
    }
}

TEST(ShippedSchema, NamesEveryOperatingSystemTypeUpToSeventy) {
    const cmpihost::ValueMap& types = shipped().valueMap("KORVA_OperatingSystem", "OSType");
    for (std::int64_t number = 0; number <= 70; ++number) {
        EXPECT_NE(types.find(number), nullptr) << number;
    }
    EXPECT_EQ(types.find(71), nullptr);
}

TEST(ShippedSchema, CountsMemoryInKilobytes) {
    const char* sizes[] = {"TotalSwapSpaceSize",     "TotalVirtualMemorySize",
                           "FreeVirtualMemory",      "FreePhysicalMemory",
                           "TotalVisibleMemorySize", "SizeStoredInPagingFiles",
                           "FreeSpaceInPagingFiles", "MaxProcessMemorySize"};
    for (const char* name : sizes) {
        const mof::Feature* property = shipped().findProperty("KORVA_OperatingSystem", name);
        ASSERT_NE(property, nullptr) << name;
        EXPECT_EQ(mof::text(property->qualifiers, "Units"), "KiloBytes") << name;
    }
}

TEST(ShippedSchema, BoundsTheKeysOfTheOperatingSystemAt256Characters) {
    for (const char* name : {"CSCreationClassName", "CSName", "CreationClassName", "Name"}) {
        const mof::Feature* property = shipped().findProperty("KORVA_OperatingSystem", name);
        ASSERT_NE(property, nullptr) << name;
        const mof::Qualifier* length = mof::findQualifier(property->qualifiers, "MaxLen");
        ASSERT_NE(length, nullptr) << name;
        ASSERT_EQ(length->value->items.size(), 1U);
        EXPECT_EQ(length->value->items[0], mof::Scalar(std::uint64_t{256})) << name;
    }
}

}  // namespace
