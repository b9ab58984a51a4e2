// A whole CIM schema has more than a thousand classes, of which a run of the host meets a few.
#include <iterator>

#include "base/Ascii.h"
#include "host/mof/Schema.h"

namespace cmpihost {

namespace {

/// In the order of mof::Type.
constexpr CMPIType elementTypes[] = {CMPI_boolean, CMPI_string, CMPI_char16, CMPI_dateTime,
                                     CMPI_uint8,   CMPI_sint8,  CMPI_uint16, CMPI_sint16,
                                     CMPI_uint32,  CMPI_sint32, CMPI_uint64, CMPI_sint64,
                                     CMPI_real32,  CMPI_real64, CMPI_ref};
static_assert(std::size(elementTypes) == static_cast<std::size_t>(mof::Type::Reference) + 1);

/// Where the classes of the CIM schema stand that the shipped ones descend from: requests name
/// them, and only a whole CIM schema declares them.
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

ClassDeclaration declarationOf(const Schema& schema, const mof::Class& source) {
    ClassDeclaration result;
    result.name = source.name;
    result.superclass = source.superclass;
    result.association = schema.isAssociation(source.name);
    for (const mof::Feature* property : schema.properties(source.name)) {
        result.properties.push_back({property->name, cmpiType(*property),
                                     schema.isKey(source.name, property->name),
                                     property->referenceClass});
    }
    return result;
}

}  // namespace

CMPIType cmpiType(const mof::Feature& property) {
    const CMPIType type = elementTypes[static_cast<std::size_t>(property.type)];
    return property.array ? static_cast<CMPIType>(type | CMPI_ARRAY) : type;
}

const ClassDeclaration* SchemaCatalogue::find(std::string_view className) const {
    const mof::Class* const declared = schema_.find(className);
    if (declared == nullptr) return nullptr;
    const std::lock_guard<std::mutex> lock(mutex_);
    auto found = declarations_.find(declared);
    if (found == declarations_.end())
        found = declarations_.emplace(declared, declarationOf(schema_, *declared)).first;
    return &found->second;
}

std::optional<std::string_view> SchemaCatalogue::superclassOf(std::string_view className) const {
    if (const mof::Class* const declared = schema_.find(className)) return declared->superclass;
    for (const KnownClass& known : knownClasses) {
        if (base::equalsIgnoreCase(known.name, className)) return known.superclass;
    }
    return std::nullopt;
}

}  // namespace cmpihost
