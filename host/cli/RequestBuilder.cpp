#include "host/cli/RequestBuilder.h"

#include <algorithm>

#include "host/cli/AssignedValue.h"
#include "host/cli/PathText.h"
#include "host/cli/TerminalText.h"
#include "host/cli/UsageError.h"
#include "host/mof/Names.h"

namespace cmpihost {

namespace {

struct Assignment {
    std::string name;
    std::string text;
};

Assignment split(const std::string& assignment) {
    const std::size_t sign = assignment.find('=');
    if (sign == 0 || sign == std::string::npos) {
        throw UsageError("expected NAME=VALUE, found '" + terminalText(assignment) + "'");
    }
    return {assignment.substr(0, sign), assignment.substr(sign + 1)};
}

PropertyValue property(const Assignment& assignment, const std::string& className,
                       const Schema& schema, const ClassCatalogue& catalogue) {
    if (schema.find(className) == nullptr) {
        return {assignment.name, Value(assignment.text)};
    }
    const mof::Feature* declared = schema.findProperty(className, assignment.name);
    if (declared == nullptr) {
        throw UsageError("the class '" + className + "' has no property '" +
                         terminalText(assignment.name) + "'");
    }
    return {declared->name, assignedValue(assignment.text, *declared, &catalogue)};
}

/// Keys of the path that the assignments do not set are properties of the instance too.
InstanceValue instance(const CommandLine& commandLine, const ObjectPathValue& path,
                       const Schema& schema, const ClassCatalogue& catalogue) {
    InstanceValue result{path, {}};
    NameSet seen;
    for (const std::string& text : commandLine.assignments) {
        PropertyValue value = property(split(text), path.className, schema, catalogue);
        if (!seen.add(value.name)) {
            throw UsageError("the property '" + terminalText(value.name) + "' stands twice");
        }
        const bool newKey = schema.isKey(path.className, value.name) &&
                            result.path.key(value.name) == nullptr && !value.value.isNull();
        if (newKey) {
            result.path.keys.push_back({value.name, value.value});
        }
        result.properties.push_back(std::move(value));
    }
    for (const KeyBinding& key : path.keys) {
        if (seen.add(key.name)) {
            result.properties.push_back({key.name, key.value});
        }
    }
    return result;
}

/// The class that a query selects from: the word after FROM. Empty when there is none.
std::string selectedClass(const std::string& query) {
    constexpr const char* blanks = " \t\r\n;";
    bool afterFrom = false;
    for (std::size_t start = query.find_first_not_of(blanks); start != std::string::npos;) {
        const std::size_t end = query.find_first_of(blanks, start);
        const std::string word = query.substr(start, end - start);
        if (afterFrom) {
            return word;
        }
        afterFrom = equalNames(word, "FROM");
        start = query.find_first_not_of(blanks, end);
    }
    return {};
}

std::vector<std::string> assignedNames(const InstanceValue& instance,
                                       const CommandLine& commandLine) {
    std::vector<std::string> names;
    for (std::size_t index = 0; index < commandLine.assignments.size(); ++index) {
        names.push_back(instance.properties[index].name);
    }
    return names;
}

}  // namespace

OperationRequest buildRequest(const CommandLine& commandLine, const Schema& schema,
                              const ClassCatalogue& catalogue) {
    OperationRequest request;
    request.operation = commandLine.operation;
    request.properties = commandLine.properties;
    request.assocClass = commandLine.assocClass;
    request.resultClass = commandLine.resultClass;
    request.role = commandLine.role;
    request.resultRole = commandLine.resultRole;
    if (request.operation == Operation::ExecQuery) {
        request.query = commandLine.query;
        request.queryLanguage = commandLine.queryLanguage;
        request.path = {parseNamespace(commandLine.nameSpace), selectedClass(commandLine.query)};
        return request;
    }
    request.path = parsePath(commandLine.path, &catalogue);
    const bool modifies = request.operation == Operation::ModifyInstance;
    if (modifies || request.operation == Operation::CreateInstance) {
        request.instance = instance(commandLine, request.path, schema, catalogue);
        request.path = request.instance.path;
    }
    if (modifies) {
        request.properties = assignedNames(request.instance, commandLine);
    }
    return request;
}

InstanceValue withoutUnlisted(InstanceValue instance, const std::vector<std::string>& list,
                              const Schema& schema) {
    NameSet kept;
    for (const std::string& name : list) {
        kept.add(name);
    }
    for (const KeyBinding& key : instance.path.keys) {
        kept.add(key.name);
    }
    const auto unlisted = [&](const PropertyValue& property) {
        return !kept.contains(property.name) &&
               !schema.isKey(instance.path.className, property.name);
    };
    auto& properties = instance.properties;
    properties.erase(std::remove_if(properties.begin(), properties.end(), unlisted),
                     properties.end());
    return instance;
}

}  // namespace cmpihost
