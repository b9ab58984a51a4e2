// Values are read as MOF writes them and take the type that the class declares, because a provider
// is entitled to get from the host what an object manager would hand it.
#include "host/cli/RequestBuilder.h"

#include <algorithm>
#include <unordered_set>

#include "base/Ascii.h"
#include "base/Utf8.h"
#include "host/broker/DateTimeText.h"
#include "host/broker/Router.h"
#include "host/cli/PathParser.h"
#include "host/cli/Suggestion.h"
#include "host/mof/MofParser.h"
#include "host/mof/ResolvedClass.h"

namespace cmpihost {

namespace {

/// Names that CIM compares without case, in lower case.
using NameSet = std::unordered_set<std::string>;

/// number fits the type: an unsigned one takes none but "-0" of the negative numbers.
template <class Number>
Value numberOf(Number number, CMPIType type) {
    if (type == CMPI_real32 || type == CMPI_real64)
        return Value::fromReal(static_cast<double>(number), type);
    if ((type & CMPI_SINT) == CMPI_SINT)
        return Value::fromSigned(static_cast<std::int64_t>(number), type);
    return Value::fromUnsigned(static_cast<std::uint64_t>(number), type);
}

/// scalar fits the type of the property.
Value typed(const mof::Scalar& scalar, CMPIType type, const ClassCatalogue* catalogue) {
    if (const auto* boolean = std::get_if<bool>(&scalar)) return Value::fromBoolean(*boolean);
    if (const auto* number = std::get_if<std::uint64_t>(&scalar)) return numberOf(*number, type);
    if (const auto* number = std::get_if<std::int64_t>(&scalar)) return numberOf(*number, type);
    if (const auto* real = std::get_if<double>(&scalar)) return Value::fromReal(*real, type);
    if (const auto* character = std::get_if<mof::Character>(&scalar))
        return Value::fromUnsigned(character->code, CMPI_char16);
    if (const auto* text = std::get_if<std::string>(&scalar)) {
        return type == CMPI_ref ? Value::fromReference(parsePath(*text, catalogue))
                                : Value::fromText(*text, type);
    }
    return Value::null(type);
}

bool isWrittenBare(const mof::Feature& property) {
    return property.type == mof::Type::String || property.type == mof::Type::DateTime ||
           property.type == mof::Type::Reference;
}

/// MOF takes any text for a datetime.
bool isDateTimeOrNull(const mof::Scalar& scalar) {
    const auto* text = std::get_if<std::string>(&scalar);
    return text == nullptr || parseDateTime(*text).has_value();
}

/// A single text without quotes, as one gives it to a scalar: "{" begins a list instead.
mof::Initializer constantOrText(const std::string& text, const mof::Feature& property) {
    const bool list = property.array && text.substr(0, 1) == "{";
    const bool absent =
        property.type == mof::Type::DateTime && base::equalsIgnoreCase(text, "NULL");
    const bool bare = isWrittenBare(property) && !list && !absent;
    return bare ? mof::Initializer{false, {text}} : mof::parseInitializer(text, property.name);
}

/// The value that a user gives to a property as text, in the type that the class declares. Texts
/// and datetimes are taken as they stand, a reference is a path, every other value and the list of
/// an array (in braces) is a constant as MOF writes it, NULL included. A single constant given to
/// an array is a list of one. The parameter of a method takes values in the same way; `kind` says
/// which of the two it is.
Value assignedValue(const std::string& text, const mof::Feature& property,
                    const ClassCatalogue* catalogue, const std::string& kind) {
    const auto refuse = [&](const std::string& why) {
        throw UsageError("'" + base::escapeForTerminal(text) + "' is " + why + " for the " + kind +
                         " '" + property.name + "'");
    };
    mof::Initializer value;
    try {
        value = constantOrText(text, property);
    } catch (const mof::MofError& error) {
        throw UsageError("the value of '" + property.name +
                         "': " + base::escapeForTerminal(error.complaint()));
    }
    if (value.array && !property.array) refuse("a list, no single value,");
    const CMPIType type = cmpiType(property);
    const auto elementType = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    std::vector<Value> elements;
    for (const mof::Scalar& item : value.items) {
        const bool wrongDate = property.type == mof::Type::DateTime && !isDateTimeOrNull(item);
        if (wrongDate || !mof::fits(item, property.type)) {
            refuse(std::string("no value of type ") + mof::nameOf(property.type));
        }
        elements.push_back(typed(item, elementType, catalogue));
    }
    // NULL without braces is an array that is null, in braces it is an array with a null in it.
    const bool nullArray = property.array && !value.array && elements.front().isNull();
    if (nullArray) return Value::null(type);
    return property.array ? Value::fromArray(elementType, std::move(elements)) : elements.front();
}

struct Assignment {
    std::string name;
    std::string text;
};

Assignment split(const std::string& assignment) {
    const std::size_t sign = assignment.find('=');
    if (sign == 0 || sign == std::string::npos) {
        throw UsageError("expected NAME=VALUE, found '" + base::escapeForTerminal(assignment) +
                         "'");
    }
    return {assignment.substr(0, sign), assignment.substr(sign + 1)};
}

PropertyValue property(const Assignment& assignment, const std::string& className,
                       const Schema& schema, const ClassCatalogue& catalogue) {
    // Whether there is such a class is for the provider to say.
    if (schema.find(className) == nullptr) return {assignment.name, Value(assignment.text)};
    const mof::Feature* declared = schema.findProperty(className, assignment.name);
    if (declared == nullptr) {
        std::vector<std::string> names;
        for (const mof::Feature* known : schema.properties(className)) names.push_back(known->name);
        throw UsageError("the class '" + className + "' has no property '" +
                         base::escapeForTerminal(assignment.name) + "'" +
                         didYouMean(assignment.name, names));
    }
    return {declared->name, assignedValue(assignment.text, *declared, &catalogue, "property")};
}

/// "it has A, B" behind a complaint about a name; the nearest ones where some are near.
std::string instead(const std::string& name, const std::vector<std::string>& known) {
    std::string text = didYouMean(name, known);
    if (!text.empty()) return text;
    for (const std::string& each : known) text += (text.empty() ? "; it has " : ", ") + each;
    return text.empty() ? "; it has none" : text;
}

/// The method as its class declares it, absent when the class may inherit it from one that the
/// schema does not have.
std::optional<ResolvedMethod> findMethod(const std::string& className, const std::string& name,
                                         const Schema& schema) {
    const auto resolved = resolvedClass(schema, className);
    if (!resolved) return std::nullopt;
    std::vector<std::string> names;
    for (const ResolvedMethod& method : resolved->methods) {
        names.push_back(method.result.declared->name);
        if (base::equalsIgnoreCase(names.back(), name)) return method;
    }
    const auto& above = resolved->superclasses;
    const mof::Class& last = above.empty() ? *resolved->declared : *above.back();
    if (!last.superclass.empty()) return std::nullopt;
    throw UsageError("the class '" + resolved->declared->name + "' has no method '" +
                     base::escapeForTerminal(name) + "'" + instead(name, names));
}

NamedValue argument(const Assignment& assignment, const ResolvedMethod& method,
                    const ClassCatalogue& catalogue) {
    std::vector<std::string> names;
    for (const ResolvedFeature& parameter : method.parameters) {
        const mof::Feature& declared = *parameter.declared;
        names.push_back(declared.name);
        if (base::equalsIgnoreCase(declared.name, assignment.name))
            return {declared.name,
                    assignedValue(assignment.text, declared, &catalogue, "parameter")};
    }
    throw UsageError("the method '" + method.result.declared->name + "' has no parameter '" +
                     base::escapeForTerminal(assignment.name) + "'" +
                     instead(assignment.name, names));
}

/// Fills the method and its arguments in; whether a class that the schema does not wholly have has
/// such a method is for the provider to say.
void addInvocation(OperationRequest& request, const CommandLine& commandLine, const Schema& schema,
                   const ClassCatalogue& catalogue) {
    const auto method = findMethod(request.path.className, commandLine.method, schema);
    request.method = method ? method->result.declared->name : commandLine.method;
    NameSet seen;
    for (const std::string& text : commandLine.assignments) {
        const Assignment assignment = split(text);
        if (!seen.insert(base::toLower(assignment.name)).second) {
            throw UsageError("the parameter '" + base::escapeForTerminal(assignment.name) +
                             "' stands twice");
        }
        request.arguments.push_back(method ? argument(assignment, *method, catalogue)
                                           : NamedValue{assignment.name, Value(assignment.text)});
    }
}

/// Keys of the path that the assignments do not set are properties of the instance too.
InstanceValue instance(const CommandLine& commandLine, const ObjectPathValue& path,
                       const Schema& schema, const ClassCatalogue& catalogue) {
    InstanceValue result{path, {}};
    NameSet seen;
    for (const std::string& text : commandLine.assignments) {
        PropertyValue value = property(split(text), path.className, schema, catalogue);
        if (!seen.insert(base::toLower(value.name)).second) {
            throw UsageError("the property '" + base::escapeForTerminal(value.name) +
                             "' stands twice");
        }
        // A key that the path gives already stays: the path says which instance is meant.
        const bool newKey = schema.isKey(path.className, value.name) &&
                            result.path.key(value.name) == nullptr && !value.value.isNull();
        if (newKey) result.path.keys.push_back({value.name, value.value});
        result.properties.push_back(std::move(value));
    }
    // Object managers hand providers an instance whose key properties are set.
    for (const KeyBinding& key : path.keys) {
        if (seen.insert(base::toLower(key.name)).second) {
            result.properties.push_back({key.name, key.value});
        }
    }
    return result;
}

/// The property list of ModifyInstance: what is not in it must not be touched. The keys that only
/// the path gives stand behind the assigned properties.
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
    if (request.operation == Operation::InvokeMethod) {
        addInvocation(request, commandLine, schema, catalogue);
        return request;
    }
    // The provider need not look for what is not printed.
    if (commandLine.value && !request.properties) request.properties = {*commandLine.value};
    const bool modifies = request.operation == Operation::ModifyInstance;
    if (modifies || request.operation == Operation::CreateInstance) {
        request.instance = instance(commandLine, request.path, schema, catalogue);
        request.path = request.instance.path;
    }
    if (modifies) request.properties = assignedNames(request.instance, commandLine);
    return request;
}

}  // namespace cmpihost
