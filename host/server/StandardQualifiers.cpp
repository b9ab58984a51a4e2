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
    bool translatable;
    /// With a blank between two.
    const char* scopes;
};

constexpr const char* features = "property method parameter";
constexpr const char* values = "property reference method parameter";
constexpr const char* classes = "class association indication";

constexpr StandardQualifier standardQualifiers[] = {
    {"Abstract", Type::Boolean, false, false, classes},
    {"Aggregate", Type::Boolean, false, false, "reference"},
    {"Aggregation", Type::Boolean, false, false, "association"},
    {"ArrayType", Type::String, false, false, "property parameter"},
    {"Association", Type::Boolean, false, false, "association"},
    {"Counter", Type::Boolean, false, false, features},
    {"Deprecated", Type::String, true, false, "any"},
    {"Description", Type::String, false, true, "any"},
    {"DisplayName", Type::String, false, true, "any"},
    {"Experimental", Type::Boolean, false, false, "any"},
    {"Gauge", Type::Boolean, false, false, features},
    {"In", Type::Boolean, false, false, "parameter"},
    {"Key", Type::Boolean, false, false, "property reference"},
    {"MappingStrings", Type::String, true, false, "any"},
    {"Max", Type::UInt32, false, false, "reference"},
    {"MaxLen", Type::UInt32, false, false, features},
    {"Min", Type::UInt32, false, false, "reference"},
    {"ModelCorrespondence", Type::String, true, false, "any"},
    {"Out", Type::Boolean, false, false, "parameter"},
    {"Override", Type::String, false, false, "property reference method"},
    {"Propagated", Type::String, false, false, "property"},
    {"Read", Type::Boolean, false, false, "property"},
    {"Required", Type::Boolean, false, false, values},
    {"Units", Type::String, false, true, features},
    {"ValueMap", Type::String, true, false, features},
    {"Values", Type::String, true, true, features},
    {"Version", Type::String, false, true, classes},
    {"Weak", Type::Boolean, false, false, "reference"},
    {"Write", Type::Boolean, false, false, "property"},
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
    result.flavor = {inheritance.toSubclass, inheritance.overridable, row.translatable};
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
