// What the schema says of the classes, as a table: an object manager need not give a provider the
// ancestors, and asking one for each request would be slow.
#include "Classes.h"

#include <algorithm>

#include "CimError.h"
#include "base/Ascii.h"

namespace VA::OSStatusFacade {

namespace {

constexpr const char* operatingSystemAncestors[] = {
    "CIM_OperatingSystem", "CIM_EnabledLogicalElement", "CIM_LogicalElement",
    "CIM_ManagedSystemElement", "CIM_ManagedElement"};
constexpr const char* computerSystemAncestors[] = {
    "CIM_ComputerSystem",        "CIM_System",
    "CIM_EnabledLogicalElement", "CIM_LogicalElement",
    "CIM_ManagedSystemElement",  "CIM_ManagedElement"};
constexpr const char* capabilitiesAncestors[] = {"CIM_OperatingSystemCapabilities",
                                                 "CIM_EnabledLogicalElementCapabilities",
                                                 "CIM_Capabilities", "CIM_ManagedElement"};
constexpr const char* installedAncestors[] = {"CIM_InstalledOS", "CIM_SystemComponent",
                                              "CIM_Component"};
constexpr const char* runningAncestors[] = {"CIM_RunningOS", "CIM_Dependency"};
constexpr const char* elementCapabilitiesAncestors[] = {"CIM_ElementCapabilities"};

constexpr ClassKey operatingSystemKeys[] = {{"CSCreationClassName", false},
                                            {"CSName", false},
                                            {"CreationClassName", false},
                                            {"Name", false}};
constexpr ClassKey computerSystemKeys[] = {{"CreationClassName", false}, {"Name", false}};
constexpr ClassKey capabilitiesKeys[] = {{"InstanceID", false}};
constexpr ClassKey installedKeys[] = {{"GroupComponent", true}, {"PartComponent", true}};
constexpr ClassKey runningKeys[] = {{"Antecedent", true}, {"Dependent", true}};
constexpr ClassKey elementCapabilitiesKeys[] = {{"ManagedElement", true}, {"Capabilities", true}};

constexpr Class classes[] = {
    {"KORVA_OperatingSystem", operatingSystemAncestors, operatingSystemKeys, true},
    {"KORVA_ComputerSystem", computerSystemAncestors, computerSystemKeys, false},
    {"KORVA_OperatingSystemCapabilities", capabilitiesAncestors, capabilitiesKeys, true},
    {"KORVA_InstalledOS", installedAncestors, installedKeys, true},
    {"KORVA_RunningOS", runningAncestors, runningKeys, true},
    {"KORVA_OSElementCapabilities", elementCapabilitiesAncestors, elementCapabilitiesKeys, true},
};
constexpr const Class& operatingSystem = classes[0];
constexpr const Class& computerSystem = classes[1];
constexpr const Class& capabilities = classes[2];
constexpr const Class& installedOS = classes[3];
constexpr const Class& runningOS = classes[4];
constexpr const Class& elementCapabilities = classes[5];

constexpr Association associationTable[] = {
    {installedOS, {{"GroupComponent", computerSystem}, {"PartComponent", operatingSystem}}},
    {runningOS, {{"Antecedent", operatingSystem}, {"Dependent", computerSystem}}},
    {elementCapabilities, {{"ManagedElement", operatingSystem}, {"Capabilities", capabilities}}},
};

}  // namespace

bool Class::isA(std::string_view other) const {
    return base::equalsIgnoreCase(name, other) ||
           std::any_of(ancestors.begin(), ancestors.end(), [other](const char* ancestor) {
               return base::equalsIgnoreCase(ancestor, other);
           });
}

const ClassKey* Class::key(std::string_view wanted) const {
    const ClassKey* const found = std::find_if(
        keys.begin(), keys.end(),
        [wanted](const ClassKey& each) { return base::equalsIgnoreCase(each.name, wanted); });
    return found == keys.end() ? nullptr : found;
}

const Class* findClass(std::string_view name) {
    for (const Class& each : classes) {
        if (base::equalsIgnoreCase(each.name, name)) return &each;
    }
    return nullptr;
}

base::Span<const Association> associations() {
    return associationTable;
}

namespace {

// What associations refer to has no references itself; that also limits the depth.
std::string referenceProblem(const CMPIObjectPath* reference) {
    const std::vector<KeyBinding> bindings = keysOf(reference);
    for (const KeyBinding& key : bindings) {
        if (key.reference() != nullptr) return "key " + printable(key.name) + " is a reference";
    }
    const Class* const known = findClass(classNameOf(reference));
    return known == nullptr ? "" : keyProblem(*known, bindings);
}

std::string valueProblem(const ClassKey& key, const KeyBinding& binding) {
    if (!key.isReference) {
        return binding.text() ? "" : std::string("key ") + key.name + " is no text";
    }
    if (binding.reference() == nullptr) return std::string("key ") + key.name + " is no reference";
    const std::string problem = referenceProblem(binding.reference());
    return problem.empty() ? "" : std::string(key.name) + ": " + problem;
}

}  // namespace

std::string keyProblem(const Class& cimClass, const std::vector<KeyBinding>& bindings) {
    const std::string of = std::string(" of ") + cimClass.name;
    for (const KeyBinding& binding : bindings) {
        if (cimClass.key(binding.name) == nullptr) {
            return std::string(cimClass.name) + " has no key " + printable(binding.name);
        }
    }
    for (const ClassKey& key : cimClass.keys) {
        const auto named = [&key](const KeyBinding& each) {
            return base::equalsIgnoreCase(each.name, key.name);
        };
        const auto found = std::find_if(bindings.begin(), bindings.end(), named);
        if (found == bindings.end()) return std::string("key ") + key.name + of + " is missing";
        if (std::count_if(bindings.begin(), bindings.end(), named) > 1) {
            return std::string("key ") + key.name + of + " is there twice";
        }
        std::string problem = valueProblem(key, *found);
        if (!problem.empty()) return problem;
    }
    return {};
}

}  // namespace VA::OSStatusFacade
