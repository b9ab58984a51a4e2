// What a provider returns for a path is compared with the path: many look at some of the keys only.
#include <algorithm>
#include <unordered_set>

#include "base/Ascii.h"
#include "host/server/CimError.h"
#include "host/server/Operations.h"

namespace cmpihost::server {

namespace {

/// The keys by which systems are named, whose providers compare them as names of hosts, and those
/// that hold names of classes.
bool isCaseless(const std::string& key) {
    return namesClass(key) || base::equalsIgnoreCase(key, "CSName") ||
           base::equalsIgnoreCase(key, "Name");
}

bool sameKeys(const ObjectPathValue& asked, const ObjectPathValue& given);

/// A path without a namespace is in the other one's.
bool sameInstance(const ObjectPathValue& asked, const ObjectPathValue& given) {
    const bool elsewhere = !asked.nameSpace.empty() && !given.nameSpace.empty() &&
                           !base::equalsIgnoreCase(asked.nameSpace, given.nameSpace);
    return !elsewhere && base::equalsIgnoreCase(asked.className, given.className) &&
           asked.keys.size() == given.keys.size() && sameKeys(asked, given);
}

bool sameKey(const std::string& name, const Value& asked, const Value& given) {
    if (asked.isNull() || given.isNull()) return false;
    const bool references = asked.type() == CMPI_ref;
    if (references != (given.type() == CMPI_ref)) return false;
    if (references) return sameInstance(asked.reference(), given.reference());
    // A number of another width is the same number, and so is its text.
    const std::string left = asked.toText();
    const std::string right = given.toText();
    return isCaseless(name) ? base::equalsIgnoreCase(left, right) : left == right;
}

/// Whether all keys that are asked for are those of the given path.
bool sameKeys(const ObjectPathValue& asked, const ObjectPathValue& given) {
    return std::all_of(asked.keys.begin(), asked.keys.end(), [&](const KeyBinding& key) {
        const Value* const other = given.key(key.name);
        return other != nullptr && sameKey(key.name, key.value, *other);
    });
}

}  // namespace

InstanceValue gottenInstance(ObjectManager& manager, const OperationRequest& request) {
    OperationResult result = manager.ask(request);
    for (InstanceValue& instance : result.instances) {
        if (!sameKeys(request.path, instance.path)) continue;
        std::vector<InstanceValue> one = {std::move(instance)};
        applyPropertyList(one, request.properties);
        return std::move(one.front());
    }
    throw CimError(cimNotFound, toString(request.path) + ": there is no such instance");
}

InstanceValue gottenInstance(ObjectManager& manager, const ObjectPathValue& path,
                             const std::optional<std::vector<std::string>>& properties) {
    OperationRequest request;
    request.operation = Operation::GetInstance;
    request.path = path;
    request.properties = properties;
    return gottenInstance(manager, request);
}

void applyPropertyList(std::vector<InstanceValue>& instances,
                       const std::optional<std::vector<std::string>>& properties) {
    if (!properties) return;
    // A client may send many names: instances, properties and names must not multiply.
    std::unordered_set<std::string> names;
    for (const std::string& name : *properties) names.insert(base::toLower(name));
    const auto isLeftOut = [&](const PropertyValue& property) {
        return names.count(base::toLower(property.name)) == 0;
    };
    for (InstanceValue& instance : instances) {
        auto& held = instance.properties;
        held.erase(std::remove_if(held.begin(), held.end(), isLeftOut), held.end());
    }
}

}  // namespace cmpihost::server
