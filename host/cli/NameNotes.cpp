// What the schema knows better than the provider: a misspelt name, which the provider itself
// answers with nothing at all.
#include "host/cli/NameNotes.h"

#include <algorithm>
#include <optional>
#include <vector>

#include "base/Ascii.h"
#include "base/Utf8.h"
#include "host/cli/Diagnostics.h"
#include "host/cli/Explanation.h"
#include "host/cli/Suggestion.h"
#include "host/mof/ResolvedClass.h"

namespace cmpihost {

namespace {

std::string quoted(const std::string& name) {
    return "'" + base::escapeForTerminal(name) + "'";
}

/// The classes whose properties the answer can hold.
std::vector<std::string> classesOf(const OperationRequest& request, const OperationResult& result,
                                   const Schema& schema) {
    std::vector<std::string> classes;
    const bool asksOne = request.operation == Operation::EnumerateInstances ||
                         request.operation == Operation::GetInstance;
    // Instances tell more than a class that the schema knows by its name at most.
    if (asksOne && (schema.find(request.path.className) != nullptr || result.instances.empty())) {
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

std::vector<std::string> propertyNames(const Schema& schema, const std::string& className) {
    std::vector<std::string> names;
    for (const mof::Feature* property : schema.properties(className))
        names.push_back(property->name);
    return names;
}

std::string notesOnProperties(const OperationRequest& request, const OperationResult& result,
                              const Schema& schema) {
    const std::vector<std::string> classes = classesOf(request, result, schema);
    std::string notes;
    for (const std::string& name : request.properties.value_or(std::vector<std::string>())) {
        const auto declaresIt = [&](const std::string& className) {
            return declares(schema, className, name);
        };
        if (!classes.empty() && std::none_of(classes.begin(), classes.end(), declaresIt)) {
            // Never null: a class that the schema does not know counts as declaring everything.
            const std::string& declared = schema.find(classes.front())->name;
            notes += noteLine("the class " + declared + " declares no property " + quoted(name) +
                              didYouMean(name, propertyNames(schema, declared)));
        }
    }
    return notes;
}

/// Those that the schema declares and those that it knows as superclasses by their names alone.
std::vector<std::string> knownClasses(const Schema& schema) {
    std::vector<std::string> names = schema.classNames();
    for (const std::string& name : schema.classNames()) {
        const std::string& superclass = schema.find(name)->superclass;
        if (!superclass.empty()) names.push_back(superclass);
    }
    return names;
}

/// Empty when the schema has the class, or it may be one of the CIM schema, an ancestor that no
/// file needs to declare.
std::string noteOnClass(const std::string& name, const Schema& schema) {
    const std::vector<std::string> known = knownClasses(schema);
    const auto isIt = [&](const std::string& other) { return base::equalsIgnoreCase(name, other); };
    if (std::any_of(known.begin(), known.end(), isIt)) return {};
    const std::string meant = didYouMean(name, known);
    const bool mayBeAncestor = meant.empty() && base::equalsIgnoreCase(name.substr(0, 4), "CIM_");
    return mayBeAncestor ? "" : noteLine("the schema has no class " + quoted(name) + meant);
}

/// The roles that associations of the schema have.
std::vector<std::string> roles(const Schema& schema) {
    std::vector<std::string> names;
    for (const std::string& className : schema.classNames()) {
        if (!schema.isAssociation(className)) continue;
        for (const mof::Feature* property : schema.properties(className))
            if (property->type == mof::Type::Reference) names.push_back(property->name);
    }
    return names;
}

/// Of any association: which one is meant may be what the user got wrong.
std::string noteOnRole(const std::string& name, const Schema& schema) {
    const std::vector<std::string> known = roles(schema);
    const auto isIt = [&](const std::string& other) { return base::equalsIgnoreCase(name, other); };
    if (std::any_of(known.begin(), known.end(), isIt)) return {};
    return noteLine("no association of the schema has a role " + quoted(name) +
                    didYouMean(name, known));
}

std::vector<std::string> keyNames(const Schema& schema, const std::string& className) {
    std::vector<std::string> names = propertyNames(schema, className);
    const auto isNoKey = [&](const std::string& name) { return !schema.isKey(className, name); };
    names.erase(std::remove_if(names.begin(), names.end(), isNoKey), names.end());
    return names;
}

/// A class may inherit methods that the schema does not have: silent unless one is near.
std::string noteOnMethod(const OperationRequest& request, const Schema& schema) {
    const auto resolved = resolvedClass(schema, request.path.className);
    if (request.operation != Operation::InvokeMethod || !resolved) return {};
    std::vector<std::string> names;
    for (const ResolvedMethod& method : resolved->methods) {
        names.push_back(method.result.declared->name);
        if (base::equalsIgnoreCase(names.back(), request.method)) return {};
    }
    const std::string meant = didYouMean(request.method, names);
    return meant.empty() ? meant
                         : noteLine("the class " + resolved->declared->name +
                                    " declares no method " + quoted(request.method) + meant);
}

std::string noteOnLanguage(const OperationRequest& request) {
    const std::vector<std::string> usual = {"WQL", "CQL", "DMTF:CQL"};
    const std::string& name = request.queryLanguage;
    const auto isIt = [&](const std::string& other) { return base::equalsIgnoreCase(name, other); };
    const bool silent =
        request.operation != Operation::ExecQuery || std::any_of(usual.begin(), usual.end(), isIt);
    return silent ? ""
                  : noteLine("the usual query languages are WQL, CQL and DMTF:CQL, not " +
                             quoted(name));
}

/// A line for each name of a request that is most likely misspelt.
std::string notesOnUnknownNames(const OperationRequest& request, const Schema& schema) {
    const std::string& asked = request.path.className;
    std::string notes;
    for (const auto& name : {std::optional(asked), request.assocClass, request.resultClass})
        if (name && !name->empty()) notes += noteOnClass(*name, schema);
    for (const auto& name : {request.role, request.resultRole})
        if (name) notes += noteOnRole(*name, schema);
    notes += noteOnMethod(request, schema) + noteOnLanguage(request);
    const mof::Class* declared = schema.find(asked);
    for (const KeyBinding& key : request.path.keys) {
        if (declared == nullptr || schema.isKey(asked, key.name)) continue;
        notes += noteLine("the class " + declared->name + " declares no key " + quoted(key.name) +
                          didYouMean(key.name, keyNames(schema, asked)));
    }
    return notes;
}

/// An associators request of the provider itself needs the name of the association.
std::string noteOnAssociation(const OperationRequest& request, const OperationResult& result,
                              const Schema& schema) {
    const bool associators = request.operation == Operation::Associators ||
                             request.operation == Operation::AssociatorNames;
    if (!associators || request.assocClass || result.rc != CMPI_RC_ERR_INVALID_CLASS) return {};
    std::string names;
    for (const std::string& name : schema.classNames()) {
        if (schema.isAssociation(name)) names += (names.empty() ? "" : ", ") + name;
    }
    return noteLine("name the association with --assoc-class" +
                    (names.empty() ? "" : ", one of " + names));
}

bool yieldsInstances(Operation operation) {
    return operation == Operation::EnumerateInstances || operation == Operation::GetInstance ||
           operation == Operation::Associators || operation == Operation::References;
}

}  // namespace

std::string notesOnNames(const OperationRequest& request, const OperationResult& result,
                         const Schema& schema) {
    const bool failed = result.rc != CMPI_RC_OK;
    std::string notes;
    if (failed || isEmptyAnswer(request, result)) notes = notesOnUnknownNames(request, schema);
    if (!failed && yieldsInstances(request.operation))
        notes += notesOnProperties(request, result, schema);
    return notes + noteOnAssociation(request, result, schema);
}

}  // namespace cmpihost
