// A schema may begin in the middle of a model: that a class has a superclass which nobody declares
// is common, so that "unrelated" and "not known" are different answers.
#include "host/broker/ClassCatalogue.h"

#include "base/Ascii.h"

#include <optional>

namespace cmpihost {

namespace {

/// Where the classes stand that the shipped ones descend from: requests name them, and only a whole
/// CIM schema declares them.
struct KnownClass {
    std::string_view name;
    /// Empty for a root class.
    std::string_view superclass;
};
constexpr KnownClass knownClasses[] = {
    {"CIM_OperatingSystem", "CIM_EnabledLogicalElement"},
    {"CIM_ComputerSystem", "CIM_System"},
    {"CIM_System", "CIM_EnabledLogicalElement"},
    {"CIM_EnabledLogicalElement", "CIM_LogicalElement"},
    {"CIM_LogicalElement", "CIM_ManagedSystemElement"},
    {"CIM_ManagedSystemElement", "CIM_ManagedElement"},
    {"CIM_OperatingSystemCapabilities", "CIM_EnabledLogicalElementCapabilities"},
    {"CIM_EnabledLogicalElementCapabilities", "CIM_Capabilities"},
    {"CIM_Capabilities", "CIM_ManagedElement"},
    {"CIM_ManagedElement", ""},
    {"CIM_InstalledOS", "CIM_SystemComponent"},
    {"CIM_SystemComponent", "CIM_Component"},
    {"CIM_Component", ""},
    {"CIM_RunningOS", "CIM_Dependency"},
    {"CIM_Dependency", ""},
    {"CIM_ElementCapabilities", ""}};

/// The superclass as the catalogue declares it, else as it is known; none: neither has the class.
std::optional<std::string_view> superclassOf(const ClassCatalogue& catalogue,
                                             std::string_view className) {
    if (const ClassDeclaration* const declared = catalogue.find(className)) {
        return declared->superclass;
    }
    for (const KnownClass& known : knownClasses) {
        if (base::equalsIgnoreCase(known.name, className)) return known.superclass;
    }
    return std::nullopt;
}

}  // namespace

const PropertyDeclaration* ClassDeclaration::property(std::string_view propertyName) const {
    for (const PropertyDeclaration& declared : properties) {
        if (base::equalsIgnoreCase(declared.name, propertyName)) return &declared;
    }
    return nullptr;
}

ClassRelation classRelation(const ClassCatalogue* catalogue, std::string_view className,
                            std::string_view ancestor) {
    if (base::equalsIgnoreCase(className, ancestor)) return ClassRelation::Same;
    if (catalogue == nullptr) return ClassRelation::Unknown;

    std::optional<std::string_view> superclass = superclassOf(*catalogue, className);
    while (superclass) {
        if (superclass->empty()) return ClassRelation::Unrelated;
        if (base::equalsIgnoreCase(*superclass, ancestor)) return ClassRelation::Subclass;
        superclass = superclassOf(*catalogue, *superclass);
    }
    return ClassRelation::Unknown;
}

}  // namespace cmpihost
