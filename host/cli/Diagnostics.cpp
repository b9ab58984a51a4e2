// What goes to the standard error beside results. Statuses bear the names of the CIM standard, and
// what the schema knows better than the provider (a misspelt name) becomes a note or a hint: the
// provider itself answers with nothing at all.
#include "host/cli/Diagnostics.h"

#include <algorithm>
#include <optional>
#include <vector>

#include "base/Ascii.h"
#include "base/Utf8.h"

namespace cmpihost {

namespace {

struct StatusRow {
    CMPIrc rc;
    const char* name;
};

constexpr StatusRow statuses[] = {
    {CMPI_RC_OK, "CIM_ERR_SUCCESS"},
    {CMPI_RC_ERR_FAILED, "CIM_ERR_FAILED"},
    {CMPI_RC_ERR_ACCESS_DENIED, "CIM_ERR_ACCESS_DENIED"},
    {CMPI_RC_ERR_INVALID_NAMESPACE, "CIM_ERR_INVALID_NAMESPACE"},
    {CMPI_RC_ERR_INVALID_PARAMETER, "CIM_ERR_INVALID_PARAMETER"},
    {CMPI_RC_ERR_INVALID_CLASS, "CIM_ERR_INVALID_CLASS"},
    {CMPI_RC_ERR_NOT_FOUND, "CIM_ERR_NOT_FOUND"},
    {CMPI_RC_ERR_NOT_SUPPORTED, "CIM_ERR_NOT_SUPPORTED"},
    {CMPI_RC_ERR_CLASS_HAS_CHILDREN, "CIM_ERR_CLASS_HAS_CHILDREN"},
    {CMPI_RC_ERR_CLASS_HAS_INSTANCES, "CIM_ERR_CLASS_HAS_INSTANCES"},
    {CMPI_RC_ERR_INVALID_SUPERCLASS, "CIM_ERR_INVALID_SUPERCLASS"},
    {CMPI_RC_ERR_ALREADY_EXISTS, "CIM_ERR_ALREADY_EXISTS"},
    {CMPI_RC_ERR_NO_SUCH_PROPERTY, "CIM_ERR_NO_SUCH_PROPERTY"},
    {CMPI_RC_ERR_TYPE_MISMATCH, "CIM_ERR_TYPE_MISMATCH"},
    {CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED, "CIM_ERR_QUERY_LANGUAGE_NOT_SUPPORTED"},
    {CMPI_RC_ERR_INVALID_QUERY, "CIM_ERR_INVALID_QUERY"},
    {CMPI_RC_ERR_METHOD_NOT_AVAILABLE, "CIM_ERR_METHOD_NOT_AVAILABLE"},
    {CMPI_RC_ERR_METHOD_NOT_FOUND, "CIM_ERR_METHOD_NOT_FOUND"},
    {CMPI_RC_DO_NOT_UNLOAD, "CMPI_RC_DO_NOT_UNLOAD"},
    {CMPI_RC_NEVER_UNLOAD, "CMPI_RC_NEVER_UNLOAD"},
    {CMPI_RC_ERR_INVALID_HANDLE, "CMPI_RC_ERR_INVALID_HANDLE"},
    {CMPI_RC_ERR_INVALID_DATA_TYPE, "CMPI_RC_ERR_INVALID_DATA_TYPE"},
    {CMPI_RC_ERROR_SYSTEM, "CMPI_RC_ERROR_SYSTEM"},
    {CMPI_RC_ERROR, "CMPI_RC_ERROR"},
};

/// GetInstance is to return one instance.
std::string noteOnCount(const OperationResult& result) {
    const std::size_t count = result.instances.size();
    if (count == 1) return {};
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
        const auto isSame = [&](const std::string& other) {
            return base::equalsIgnoreCase(name, other);
        };
        if (std::none_of(classes.begin(), classes.end(), isSame)) classes.push_back(name);
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
            // Never null: a class that the schema does not know counts as declaring everything.
            notes += "note: the class " + schema.find(classes.front())->name +
                     " declares no property '" + base::escapeForTerminal(name) + "'\n";
        }
    }
    return notes;
}

/// The classes of the CIM schema are ancestors that no file needs to declare.
bool mayBeClass(const Schema& schema, const std::string& name) {
    return schema.find(name) != nullptr || base::equalsIgnoreCase(name.substr(0, 4), "CIM_");
}

/// Whether any association has the role: which one is meant may be what the user got wrong.
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
    const auto addLine = [&](const std::string& what, const std::string& name) {
        lines += start + what + " '" + base::escapeForTerminal(name) + "'\n";
    };
    const std::string& source = request.path.className;
    for (const auto& name : {std::optional(source), request.assocClass, request.resultClass}) {
        if (name && !mayBeClass(schema, *name)) addLine("the schema has no class", *name);
    }
    for (const auto& name : {request.role, request.resultRole}) {
        if (name && !isRole(schema, *name))
            addLine("no association of the schema has a role", *name);
    }
    for (const KeyBinding& key : request.path.keys) {
        if (schema.find(source) != nullptr && !schema.isKey(source, key.name)) {
            addLine("the class " + schema.find(source)->name + " declares no key", key.name);
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

std::string statusText(CMPIrc rc) {
    const std::string number = std::to_string(static_cast<unsigned>(rc));
    for (const StatusRow& row : statuses) {
        if (row.rc == rc) return std::string(row.name) + " (" + number + ")";
    }
    return "CMPI status " + number;
}

std::string failureText(const OperationResult& result) {
    const std::string message = base::escapeForTerminal(result.message.value_or(std::string()));
    return statusText(result.rc) + (message.empty() ? "" : ": " + message);
}

std::string notesOn(const OperationRequest& request, const OperationResult& result,
                    const Schema& schema) {
    std::string notes;
    if (request.operation == Operation::GetInstance) notes = noteOnCount(result);
    if (isAssociationOperation(request.operation) && isEmpty(result)) {
        notes += linesOnUnknownNames("note: ", request, schema);
    }
    if (yieldsInstances(request.operation)) notes += notesOnNames(request, result, schema);
    return notes;
}

std::string hintFor(const OperationRequest& request, const OperationResult& failure,
                    const Schema& schema) {
    const bool associators = request.operation == Operation::Associators ||
                             request.operation == Operation::AssociatorNames;
    if (!associators || failure.rc != CMPI_RC_ERR_INVALID_CLASS) return {};
    std::string unknown = linesOnUnknownNames("hint: ", request, schema);
    // The name is right as far as the schema knows, so there is nothing to advise.
    if (request.assocClass) return unknown;
    std::string names;
    for (const std::string& name : schema.classNames()) {
        if (schema.isAssociation(name)) names += (names.empty() ? "" : ", ") + name;
    }
    return unknown + "hint: name the association with --assoc-class" +
           (names.empty() ? "" : ", one of " + names) + "\n";
}

}  // namespace cmpihost
