// The shipped MOF files: object managers and clients know the provider by them.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <set>
#include <sstream>
#include <variant>

#include "host/mof/MofAst.h"
#include "host/mof/Schema.h"
#include "support/GoldenFile.h"

namespace {

using cmpihost::Schema;
namespace mof = cmpihost::mof;

/// Every qualifier that the files use is declared by the standard with this scope.
const std::set<std::string> standardQualifiers = {
    "Aggregate", "Aggregation", "ArrayType",      "Association", "Description",
    "Gauge",     "Key",         "MappingStrings", "Max",         "MaxLen",
    "Min",       "Override",    "Propagated",     "Required",    "ValueMap",
    "Units",     "Values",      "Version",        "Weak"};

const Schema& shipped() {
    static const Schema schema = Schema::load(KORVA_SOURCE_DIR "/schema");
    return schema;
}

std::string numberOf(const mof::Qualifier& qualifier) {
    return std::to_string(std::get<std::uint64_t>(qualifier.value->items.at(0)));
}

// "type name", "*" for a key, "[]" for an array; what it counts in, how long it may be, and whether
// the class declares it anew.
std::string described(const mof::Feature& property) {
    std::string text = mof::isSet(property.qualifiers, "Key") ? "*" : "";
    text += property.type == mof::Type::Reference ? property.referenceClass + " " : "";
    text += mof::nameOf(property.type);
    text += (property.array ? "[] " : " ") + property.name;
    const std::string units = mof::text(property.qualifiers, "Units");
    if (!units.empty()) text += ", " + units;
    if (const mof::Qualifier* length = mof::findQualifier(property.qualifiers, "MaxLen"))
        text += ", at most " + numberOf(*length);
    if (mof::text(property.qualifiers, "Override").empty()) text += ", not inherited";
    return text;
}

// Clients hold these names and types to be fixed. What they are is told by the standard, and by the
// provider's own table, which a test of the provider compares.
TEST(ShippedSchema, DeclaresTheseClassesAndProperties) {
    std::string classes;
    for (const std::string& name : shipped().classNames()) {
        const mof::Class& declared = *shipped().find(name);
        classes += declared.name + " : " + declared.superclass +
                   (shipped().isAssociation(name) ? ", association\n" : "\n");
        for (const mof::Feature& property : declared.properties)
            classes += "  " + described(property) + "\n";
    }
    expectGolden(KORVA_TEST_DATA "/schema/classes.txt", classes);
}

TEST(ShippedSchema, DescribesEveryPropertyInStandardQualifiers) {
    const auto check = [](const std::vector<mof::Qualifier>& qualifiers, std::size_t letters) {
        EXPECT_GT(mof::text(qualifiers, "Description").size(), letters);
        for (const mof::Qualifier& qualifier : qualifiers)
            EXPECT_EQ(standardQualifiers.count(qualifier.name), 1U) << qualifier.name;
    };
    for (const std::string& name : shipped().classNames()) {
        SCOPED_TRACE(name);
        const mof::Class& declared = *shipped().find(name);
        check(declared.qualifiers, 40);
        for (const mof::Feature& property : declared.properties) {
            SCOPED_TRACE(property.name);
            check(property.qualifiers, 15);
            const std::string overridden = mof::text(property.qualifiers, "Override");
            EXPECT_TRUE(overridden.empty() || overridden == property.name) << overridden;
        }
    }
}

/// The rows of the tables in docs/properties.md about published properties, by "CLASS.PROPERTY".
std::map<std::string, std::string> documentedRows() {
    std::map<std::string, std::string> rows;
    std::ifstream document(KORVA_SOURCE_DIR "/docs/properties.md");
    std::string className;
    for (std::string line; std::getline(document, line);) {
        if (line.compare(0, 3, "## ") == 0) className = line.substr(3);
        const bool published = line.find("| always |") == std::string::npos;
        if (line.compare(0, 3, "| `") == 0 && className.compare(0, 6, "KORVA_") == 0 && published)
            rows[className + "." + line.substr(3, line.find('`', 3) - 3)] = line;
    }
    return rows;
}

/// What stands between backticks.
std::vector<std::string> codeIn(const std::string& text) {
    std::vector<std::string> parts;
    std::istringstream pieces(text);
    bool code = false;
    for (std::string piece; std::getline(pieces, piece, '`'); code = !code)
        if (code) parts.push_back(piece);
    return parts;
}

/// "File.Linux|/proc/meminfo|MemTotal" cut at its bars.
std::vector<std::string> partsOf(const std::string& source) {
    std::vector<std::string> parts;
    std::istringstream pieces(source);
    for (std::string piece; std::getline(pieces, piece, '|');) parts.push_back(piece);
    return parts;
}

/// The row of a property, with those of the properties that it refers to.
std::string rowOf(const std::string& className, const std::string& property,
                  const std::map<std::string, std::string>& rows) {
    std::string text = rows.at(className + "." + property);
    for (const std::string& part : codeIn(text)) {
        const auto other = rows.find(className + "." + part);
        if (part != property && other != rows.end()) text += other->second;
    }
    return text;
}

void expectSameFiles(const std::vector<std::string>& sources, const std::string& row) {
    std::string files;
    for (const std::string& source : sources) {
        const std::vector<std::string> parts = partsOf(source);
        if (parts.at(0) != "File.Linux") continue;
        files += parts.at(1) + "\n";
        const std::string name = std::filesystem::path(parts.at(1)).filename();
        EXPECT_NE(row.find(name), std::string::npos) << source;
        if (parts.size() > 2) {
            EXPECT_NE(row.find(parts[2]), std::string::npos) << source;
        }
    }
    for (const std::string& part : codeIn(row)) {
        if (part.front() == '/') {
            EXPECT_NE(files.find(part), std::string::npos) << part;
        }
    }
}

TEST(ShippedSchema, TellsWhereTheValuesOfAllPublishedPropertiesComeFromAsTheDocumentDoes) {
    const std::map<std::string, std::string> rows = documentedRows();
    std::size_t documented = 0;
    for (const std::string& className : shipped().classNames()) {
        for (const mof::Feature& property : shipped().find(className)->properties) {
            SCOPED_TRACE(className + "." + property.name);
            const std::vector<std::string> sources =
                mof::texts(property.qualifiers, "MappingStrings");
            const bool isEnd = property.type == mof::Type::Reference;
            const bool isDocumented = rows.count(className + "." + property.name) > 0;
            EXPECT_EQ(!sources.empty(), isEnd || isDocumented);
            if (!isDocumented) continue;
            ++documented;
            expectSameFiles(sources, rowOf(className, property.name, rows));
        }
    }
    EXPECT_EQ(documented, rows.size());
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

}  // namespace
