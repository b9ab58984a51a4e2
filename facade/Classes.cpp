#include "Classes.h"

#include <algorithm>

#include "Names.h"

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

constexpr Key operatingSystemKeys[] = {{"CSCreationClassName", false},
                                       {"CSName", false},
                                       {"CreationClassName", false},
                                       {"Name", false}};
constexpr Key computerSystemKeys[] = {{"CreationClassName", false}, {"Name", false}};
constexpr Key capabilitiesKeys[] = {{"InstanceID", false}};
constexpr Key installedKeys[] = {{"GroupComponent", true}, {"PartComponent", true}};
constexpr Key runningKeys[] = {{"Antecedent", true}, {"Dependent", true}};
constexpr Key elementCapabilitiesKeys[] = {{"ManagedElement", true}, {"Capabilities", true}};

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

constexpr Association associationTable[] = {
    {classes[3], {{"GroupComponent", computerSystem}, {"PartComponent", operatingSystem}}},
    {classes[4], {{"Antecedent", operatingSystem}, {"Dependent", computerSystem}}},
    {classes[5], {{"ManagedElement", operatingSystem}, {"Capabilities", capabilities}}},
};

}  // namespace

bool Class::isA(std::string_view other) const {
    return equalNames(name, other) ||
           std::any_of(ancestors.begin(), ancestors.end(),
                       [other](const char* ancestor) { return equalNames(ancestor, other); });
}

const Key* Class::key(std::string_view wanted) const {
    const Key* const found = std::find_if(keys.begin(), keys.end(), [wanted](const Key& each) {
        return equalNames(each.name, wanted);
    });
    return found == keys.end() ? nullptr : found;
}

const Class* findClass(std::string_view name) {
    for (const Class& each : classes)
        if (equalNames(each.name, name)) return &each;
    return nullptr;
}

Rows<Association> associations() {
    return associationTable;
}

}  // namespace VA::OSStatusFacade
