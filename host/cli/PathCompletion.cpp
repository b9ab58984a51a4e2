// A path that lacks keys is completed by asking for the names of all instances, as a user would do
// by hand; a path that is merely wrong goes to the provider as it is, which knows best what to
// answer.
#include "host/cli/PathCompletion.h"

#include <algorithm>

#include "base/Ascii.h"
#include "base/Utf8.h"
#include "host/cli/PathParser.h"

namespace cmpihost {

namespace {

/// How many paths a complaint lists.
constexpr std::size_t mostListed = 10;

/// What is modified or deleted by a path must be named in full.
bool mayBeCompleted(Operation operation) {
    return operation == Operation::GetInstance || isAssociationOperation(operation);
}

/// Names of systems compare without case, as the provider compares them; other texts do not.
bool sameText(const std::string& key, const std::string& given, const std::string& other) {
    const bool withoutCase =
        base::equalsIgnoreCase(key, "CSName") || base::equalsIgnoreCase(key, "Name");
    return withoutCase ? base::equalsIgnoreCase(given, other) : given == other;
}

/// A number in a path has a type of its own, whatever the class declares.
bool sameValue(const KeyBinding& given, const Value& other) {
    return given.value == other || (given.value.isText() == other.isText() &&
                                    sameText(given.name, given.value.toText(), other.toText()));
}

bool hasKeys(const ObjectPathValue& name, const std::vector<KeyBinding>& given) {
    return std::all_of(given.begin(), given.end(), [&](const KeyBinding& key) {
        const Value* value = name.key(key.name);
        return value != nullptr && sameValue(key, *value);
    });
}

std::string list(const std::vector<ObjectPathValue>& paths) {
    std::string text;
    for (std::size_t index = 0; index < std::min(paths.size(), mostListed); ++index) {
        text += "\n  " + base::escapeForTerminal(toString(paths[index]));
    }
    if (paths.size() > mostListed)
        text += "\n  and " + std::to_string(paths.size() - mostListed) + " more";
    return text;
}

std::string complaint(const std::string& className, const std::vector<ObjectPathValue>& names,
                      const std::vector<ObjectPathValue>& matching) {
    const std::string start = "the path lacks keys, and ";
    if (names.empty()) return start + "there is no instance of " + className;
    if (matching.empty()) {
        return start + "no instance of " + className +
               " has those that it gives; the instances are:" + list(names);
    }
    return start + std::to_string(matching.size()) + " instances of " + className +
           " have those that it gives:" + list(matching);
}

}  // namespace

bool lacksKeys(const OperationRequest& request, const ClassCatalogue& catalogue) {
    if (!mayBeCompleted(request.operation)) return false;
    const std::string& className = request.path.className;
    const ClassDeclaration* declaration = catalogue.find(className);
    if (declaration == nullptr) {
        // The classes of the CIM schema are ancestors that no file needs to declare.
        return request.path.keys.empty() && base::equalsIgnoreCase(className.substr(0, 4), "CIM_");
    }
    const auto isLacking = [&](const PropertyDeclaration& property) {
        return property.key && request.path.key(property.name) == nullptr;
    };
    const auto isDeclared = [&](const KeyBinding& given) {
        const PropertyDeclaration* property = declaration->property(given.name);
        return property != nullptr && property->key;
    };
    const auto& properties = declaration->properties;
    const auto& given = request.path.keys;
    return std::any_of(properties.begin(), properties.end(), isLacking) &&
           std::all_of(given.begin(), given.end(), isDeclared);
}

OperationRequest namesRequest(const ObjectPathValue& path) {
    OperationRequest request;
    request.operation = Operation::EnumerateInstanceNames;
    request.path.nameSpace = path.nameSpace;
    request.path.className = path.className;
    return request;
}

ObjectPathValue completedPath(const ObjectPathValue& path,
                              const std::vector<ObjectPathValue>& names) {
    std::vector<ObjectPathValue> matching;
    std::copy_if(names.begin(), names.end(), std::back_inserter(matching),
                 [&](const ObjectPathValue& name) { return hasKeys(name, path.keys); });
    if (matching.empty()) throw NoSuchInstance(complaint(path.className, names, matching));
    if (matching.size() > 1) throw UsageError(complaint(path.className, names, matching));
    // A name that a provider gives may lack the namespace.
    ObjectPathValue result = std::move(matching.front());
    result.nameSpace = path.nameSpace;
    for (KeyBinding& key : result.keys) {
        if (const Value* given = path.key(key.name)) key.value = *given;
    }
    return result;
}

}  // namespace cmpihost
