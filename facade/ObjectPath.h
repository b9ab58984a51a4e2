#ifndef FACADE_OBJECT_PATH_H
#define FACADE_OBJECT_PATH_H

#include <cmpi/cmpidt.h>

#include <optional>
#include <string>
#include <string_view>
#include <tuple>
#include <utility>
#include <vector>

namespace VA::OSStatusFacade {

// Reading object paths of any broker. Null paths are accepted: they have no class and no keys. What
// the object manager has but fails to give ends the request: these functions throw CimError then.

/// The characters of a broker's string, empty when there are none.
std::string charactersOf(const CMPIString* string);

std::string classNameOf(const CMPIObjectPath* path);
std::string nameSpaceOf(const CMPIObjectPath* path);

/// A key binding as a path has it. A key whose value is null counts as missing and is left out.
struct KeyBinding {
    std::string name;
    CMPIData data;

    /// The path that a reference refers to, else null.
    const CMPIObjectPath* reference() const;

    /// A text as it is, an integer of any type in decimal, a boolean as "true" or "false". None for
    /// any other type: no key of the classes here has one.
    std::optional<std::string> text() const;
};

std::vector<KeyBinding> keysOf(const CMPIObjectPath* path);

/// The path of an instance, never null.
const CMPIObjectPath* pathOf(const CMPIInstance* instance);

/// The path that an association's path refers to under `role`; null if there is none.
const CMPIObjectPath* referenceOf(const CMPIObjectPath* path, const char* role);

/// What a path stands for: two paths name the same instance exactly if these are equal. Names
/// compare without case, values with case, but for those of CSName and Name, which the provider
/// matches without. The order of keys and the host play no part.
struct CanonicalPath {
    std::string classPath;                                  ///< namespace and class
    std::vector<std::pair<std::string, std::string>> keys;  ///< names and values, by name

    friend bool operator==(const CanonicalPath& left, const CanonicalPath& right) {
        return left.classPath == right.classPath && left.keys == right.keys;
    }
    friend bool operator<(const CanonicalPath& left, const CanonicalPath& right) {
        return std::tie(left.classPath, left.keys) < std::tie(right.classPath, right.keys);
    }
};

/// `nameSpace` is that of the request: it counts where a path has none.
CanonicalPath canonicalPathOf(const CMPIObjectPath* path, std::string_view nameSpace);

}  // namespace VA::OSStatusFacade

#endif
