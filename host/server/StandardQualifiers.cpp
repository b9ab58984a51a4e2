// The shipped classes bring no declarations of their qualifiers along, as an object manager that
// compiles MOF would demand.
#include "host/server/StandardQualifiers.h"

#include <algorithm>
#include <sstream>

#include "base/Ascii.h"

namespace cmpihost::server {

namespace {

using mof::Type;

struct StandardQualifier {
    const char* name;
    Type type;
    bool array;
    /// With a blank between two.
    const char* scopes;
};

constexpr const char* features = "property method parameter";
constexpr const char* values = "property reference method parameter";
constexpr const char* classes = "class association indication";

constexpr StandardQualifier standardQualifiers[] = {
    {"Abstract", Type::Boolean, false, classes},
    {"Aggregate", Type::Boolean, false, "reference"},
    {"Aggregation", Type::Boolean, false, "association"},
    {"ArrayType", Type::String, false, "property parameter"},
    {"Association", Type::Boolean, false, "association"},
    {"Counter", Type::Boolean, false, features},
    {"Deprecated", Type::String, true, "any"},
    {"Description", Type::String, false, "any"},
    {"DisplayName", Type::String, false, "any"},
    {"Experimental", Type::Boolean, false, "any"},
    {"Gauge", Type::Boolean, false, features},
    {"In", Type::Boolean, false, "parameter"},
    {"Key", Type::Boolean, false, "property reference"},
    {"MappingStrings", Type::String, true, "any"},
    {"Max", Type::UInt32, false, "reference"},
    {"MaxLen", Type::UInt32, false, features},
    {"Min", Type::UInt32, false, "reference"},
    {"ModelCorrespondence", Type::String, true, "any"},
    {"Out", Type::Boolean, false, "parameter"},
    {"Override", Type::String, false, "property reference method"},
    {"Propagated", Type::String, false, "property"},
    {"Read", Type::Boolean, false, "property"},
    {"Required", Type::Boolean, false, values},
    {"Units", Type::String, false, features},
    {"ValueMap", Type::String, true, features},
    {"Values", Type::String, true, features},
    {"Version", Type::String, false, classes},
    {"Weak", Type::Boolean, false, "reference"},
    {"Write", Type::Boolean, false, "property"},
};

mof::QualifierType declarationOf(const StandardQualifier& row, const QualifierTypes& types) {
    mof::QualifierType result;
    result.name = row.name;
    result.type = row.type;
    result.array = row.array;
    // Of the booleans only Read is true where nothing is said.
    if (row.type == Type::Boolean)
        result.defaultValue = mof::Initializer{false, {result.name == "Read"}};
    std::istringstream scopes(row.scopes);
    for (std::string scope; scopes >> scope;) result.scopes.push_back(scope);
    mof::Qualifier bare;
    bare.name = row.name;
    const Inheritance inheritance = types.inheritanceOf(bare);
    result.flavor = {inheritance.toSubclass, inheritance.overridable, types.isTranslatable(bare)};
    return result;
}

}  // namespace

std::vector<mof::QualifierType> qualifierTypes(const Schema& schema) {
    const QualifierTypes& types = schema.qualifierTypes();
    std::vector<mof::QualifierType> result;
    for (const mof::QualifierType* declared : types.all()) result.push_back(*declared);
    for (const StandardQualifier& row : standardQualifiers)
        if (types.find(row.name) == nullptr) result.push_back(declarationOf(row, types));
    std::sort(result.begin(), result.end(), [](const auto& left, const auto& right) {
        return base::toLower(left.name) < base::toLower(right.name);
    });
    return result;
}

}  // namespace cmpihost::server
