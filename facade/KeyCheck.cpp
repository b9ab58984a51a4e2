#include "KeyCheck.h"

#include <algorithm>

#include "Names.h"

namespace VA::OSStatusFacade {

namespace {

// What associations refer to has no references itself; that also limits the depth.
std::string referenceProblem(const CMPIObjectPath* reference) {
    const std::vector<KeyBinding> bindings = keysOf(reference);
    for (const KeyBinding& key : bindings)
        if (key.reference() != nullptr) return "key " + printable(key.name) + " is a reference";
    const Class* const known = findClass(classNameOf(reference));
    return known == nullptr ? "" : keyProblem(*known, bindings);
}

std::string valueProblem(const Key& key, const KeyBinding& binding) {
    if (!key.isReference)
        return binding.text() ? "" : std::string("key ") + key.name + " is no text";
    if (binding.reference() == nullptr) return std::string("key ") + key.name + " is no reference";
    const std::string problem = referenceProblem(binding.reference());
    return problem.empty() ? "" : std::string(key.name) + ": " + problem;
}

}  // namespace

std::string keyProblem(const Class& itsClass, const std::vector<KeyBinding>& bindings) {
    const std::string of = std::string(" of ") + itsClass.name;
    for (const KeyBinding& binding : bindings)
        if (itsClass.key(binding.name) == nullptr)
            return std::string(itsClass.name) + " has no key " + printable(binding.name);
    for (const Key& key : itsClass.keys) {
        const auto named = [&key](const KeyBinding& each) {
            return equalNames(each.name, key.name);
        };
        const auto found = std::find_if(bindings.begin(), bindings.end(), named);
        if (found == bindings.end()) return std::string("key ") + key.name + of + " is missing";
        if (std::count_if(bindings.begin(), bindings.end(), named) > 1)
            return std::string("key ") + key.name + of + " is there twice";
        const std::string problem = valueProblem(key, *found);
        if (!problem.empty()) return problem;
    }
    return {};
}

}  // namespace VA::OSStatusFacade
