#include "host/cli/Notes.h"

#include <algorithm>
#include <optional>
#include <vector>

#include "host/cli/StatusText.h"
#include "host/cli/TerminalText.h"

namespace cmpihost {

namespace {

/// GetInstance is to return one instance.
std::string noteOnCount(const OperationResult& result) {
    const std::size_t count = result.instances.size();
    if (count == 1) {
        return {};
    }
    return count == 0 ? "note: no instance was returned; an object manager answers " +
                            statusText(CMPI_RC_ERR_NOT_FOUND) + "\n"
                      : "note: " + std::to_string(count) +
                            " instances were returned; an object manager takes the first\n";
}

/// The classes whose properties the answer can hold.
std::vector<std::string> classesOf(const OperationRequest& request, const OperationResult& result) {
    std::vector<std::string> classes;
    if (request.operation == Operation::EnumerateInstances ||
        request.operation == Operation::GetInstance) {
        classes.push_back(request.path.className);
    }
    for (const InstanceValue& instance : result.instances) {
        const std::string& name = instance.path.className;
        const auto isSame = [&](const std::string& other) { return equalNames(name, other); };
        if (std::none_of(classes.begin(), classes.end(), isSame)) {
            classes.push_back(name);
        }
    }
    return classes;
}

/// A class that the schema does not know may declare anything.
bool declares(const Schema& schema, const std::string& className, const std::string& property) {
    return schema.find(className) == nullptr || schema.findProperty(className, property) != nullptr;
}

std::string notesOnNames(const OperationRequest& request, const OperationResult& result,
                         const Schema& schema) {
    const std::vector<std::string> classes = classesOf(request, result);
    std::string notes;
    for (const std::string& name : request.properties.value_or(std::vector<std::string>())) {
        const auto declaresIt = [&](const std::string& className) {
            return declares(schema, className, name);
        };
        if (!classes.empty() && std::none_of(classes.begin(), classes.end(), declaresIt)) {
            notes += "note: the class " + schema.find(classes.front())->name +
                     " declares no property '" + terminalText(name) + "'\n";
        }
    }
    return notes;
}

bool startsFromAnInstance(Operation operation) {
    return operation == Operation::Associators || operation == Operation::AssociatorNames ||
           operation == Operation::References || operation == Operation::ReferenceNames;
}

/// The classes of the CIM schema are ancestors that no file needs to declare.
bool mayBeClass(const Schema& schema, const std::string& name) {
    return schema.find(name) != nullptr || equalNames(name.substr(0, 4), "CIM_");
}

bool isRole(const Schema& schema, const std::string& name) {
    const std::vector<std::string> classes = schema.classNames();
    return std::any_of(classes.begin(), classes.end(), [&](const std::string& className) {
        const mof::Feature* property = schema.findProperty(className, name);
        return schema.isAssociation(className) && property != nullptr &&
               property->type == mof::Type::Reference;
    });
}

/// A line that begins with `start` for each name of an association request that is most likely
/// misspelt.
std::string linesOnUnknownNames(const std::string& start, const OperationRequest& request,
                                const Schema& schema) {
    std::string lines;
    const auto tell = [&](const std::string& what, const std::string& name) {
        lines += start + what + " '" + terminalText(name) + "'\n";
    };
    const std::string& source = request.path.className;
    for (const auto& name : {std::optional(source), request.assocClass, request.resultClass}) {
        if (name && !mayBeClass(schema, *name)) {
            tell("the schema has no class", *name);
        }
    }
    for (const auto& name : {request.role, request.resultRole}) {
        if (name && !isRole(schema, *name)) {
            tell("no association of the schema has a role", *name);
        }
    }
    for (const KeyBinding& key : request.path.keys) {
        if (schema.find(source) != nullptr && !schema.isKey(source, key.name)) {
            tell("the class " + schema.find(source)->name + " declares no key", key.name);
        }
    }
    return lines;
}

bool isEmpty(const OperationResult& result) {
    return result.paths.empty() && result.instances.empty();
}

bool yieldsInstances(Operation operation) {
    return operation == Operation::EnumerateInstances || operation == Operation::GetInstance ||
           operation == Operation::Associators || operation == Operation::References;
}

}  // namespace

std::string notesOn(const OperationRequest& request, const OperationResult& result,
                    const Schema& schema) {
    std::string notes;
    if (request.operation == Operation::GetInstance) {
        notes = noteOnCount(result);
    }
    if (startsFromAnInstance(request.operation) && isEmpty(result)) {
        notes += linesOnUnknownNames("note: ", request, schema);
    }
    if (yieldsInstances(request.operation)) {
        notes += notesOnNames(request, result, schema);
    }
    return notes;
}

std::string hintFor(const OperationRequest& request, const OperationResult& failure,
                    const Schema& schema) {
    const bool associators = request.operation == Operation::Associators ||
                             request.operation == Operation::AssociatorNames;
    if (!associators || failure.rc != CMPI_RC_ERR_INVALID_CLASS) {
        return {};
    }
    const std::string unknown = linesOnUnknownNames("hint: ", request, schema);
    if (request.assocClass) {
        return unknown;
    }
    std::string names;
    for (const std::string& name : schema.classNames()) {
        if (schema.isAssociation(name)) {
            names += (names.empty() ? "" : ", ") + name;
        }
    }
    return unknown + "hint: name the association with --assoc-class" +
           (names.empty() ? "" : ", one of " + names) + "\n";
}

}  // namespace cmpihost
