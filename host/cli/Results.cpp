// Providers may deliver more than was asked for; what is printed is what a client would get.
#include "host/cli/Results.h"

#include <algorithm>
#include <unordered_set>
#include <utility>

#include "base/Ascii.h"

namespace cmpihost {

namespace {

/// Not even an empty list in JSON: there is no result to be empty.
bool yieldsNothing(Operation operation) {
    return operation == Operation::ModifyInstance || operation == Operation::DeleteInstance;
}

}  // namespace

InstanceValue withoutUnlisted(InstanceValue instance, const std::vector<std::string>& list,
                              const Schema& schema) {
    std::unordered_set<std::string> kept;
    for (const std::string& name : list) kept.insert(base::toLower(name));
    for (const KeyBinding& key : instance.path.keys) kept.insert(base::toLower(key.name));
    const auto unlisted = [&](const PropertyValue& property) {
        return kept.count(base::toLower(property.name)) == 0 &&
               !schema.isKey(instance.path.className, property.name);
    };
    auto& properties = instance.properties;
    properties.erase(std::remove_if(properties.begin(), properties.end(), unlisted),
                     properties.end());
    return instance;
}

void printResult(const OperationRequest& request, OperationResult result, const Schema& schema,
                 Printer& printer) {
    if (yieldsNothing(request.operation)) return;
    if (yieldsPaths(request.operation)) {
        printer.print(result.paths);
        return;
    }
    if (request.properties) {
        for (InstanceValue& instance : result.instances) {
            instance = withoutUnlisted(std::move(instance), *request.properties, schema);
        }
    }
    printer.print(result.instances);
}

}  // namespace cmpihost
