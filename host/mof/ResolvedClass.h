#ifndef HOST_MOF_RESOLVED_CLASS_H
#define HOST_MOF_RESOLVED_CLASS_H

#include <optional>
#include <string_view>
#include <vector>

#include "host/mof/Schema.h"

/// A class with all that it has by itself and from its superclasses, as GetClass answers it. All
/// pointers are into the schema and live as long as it does; any thread may use them.
namespace cmpihost {

/// A qualifier that holds for a class or a member of it.
struct ResolvedQualifier {
    const mof::Qualifier* declared = nullptr;
    /// Whose declaration it is.
    const mof::Class* from = nullptr;
    Inheritance inheritance;
};

/// A property, a reference, a parameter or what a method returns.
struct ResolvedFeature {
    /// The nearest declaration, and whose it is.
    const mof::Feature* declared = nullptr;
    const mof::Class* from = nullptr;
    /// The uppermost class of the schema that declares it: the class of origin.
    const mof::Class* origin = nullptr;
    std::vector<ResolvedQualifier> qualifiers;
    /// That of the nearest declaration which has one, null for none.
    const mof::Initializer* defaultValue = nullptr;
};

struct ResolvedMethod {
    ResolvedFeature result;
    /// In the order of the nearest declaration; each inherits the qualifiers of the parameter of
    /// its name.
    std::vector<ResolvedFeature> parameters;
};

struct ResolvedClass {
    const mof::Class* declared = nullptr;
    /// Those that the schema has, the nearest first.
    std::vector<const mof::Class*> superclasses;
    std::vector<ResolvedQualifier> qualifiers;
    /// The class's own in the order of their declaration, then those that only a superclass has.
    std::vector<ResolvedFeature> properties;
    std::vector<ResolvedMethod> methods;
};

/// The class of that name (without case); absent when the schema does not have it.
std::optional<ResolvedClass> resolvedClass(const Schema& schema, std::string_view className);

/// The qualifier of that name (without case), or null.
const mof::Qualifier* findQualifier(const std::vector<ResolvedQualifier>& qualifiers,
                                    std::string_view name);

}  // namespace cmpihost

#endif
