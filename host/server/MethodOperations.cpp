// Methods that the schema does not declare are called all the same where it lacks their class or
// one that this descends from: the provider knows them, and the types are those that the client
// tells.
#include <algorithm>
#include <iterator>

#include "base/Ascii.h"
#include "host/server/CimError.h"
#include "host/server/Operations.h"
#include "host/server/RequestValue.h"

namespace cmpihost::server {

namespace {

/// What a METHODCALL is answered from.
struct MethodCall {
    ObjectManager& manager;
    const std::string& nameSpace;
    const Message& message;
    /// Null where the schema does not tell of it.
    const mof::Method* declared;

    const ClassCatalogue& catalogue() const { return manager.catalogue(nameSpace); }
};

/// Methods that operating systems inherit from classes of the standard, which few schemas declare.
constexpr std::string_view inheritedMethods[] = {"Reboot", "Shutdown", "RequestStateChange"};

bool isInherited(const ObjectManager& manager, const std::string& nameSpace,
                 const std::string& className, const std::string& method) {
    return manager.isA(nameSpace, className, "CIM_OperatingSystem") &&
           std::any_of(std::begin(inheritedMethods), std::end(inheritedMethods),
                       [&](auto each) { return base::equalsIgnoreCase(each, method); });
}

/// Whether the schema declares the class and all that it descends from.
bool isWhollyDeclared(const Schema& schema, const std::string& className) {
    const mof::Class* each = schema.find(className);
    while (each != nullptr && !each->superclass.empty()) each = schema.find(each->superclass);
    return each != nullptr;
}

/// Null where the schema does not tell whether the class has the method: its provider knows. Throws
/// CimError for a class without the method, and where nobody serves it.
const mof::Method* declaredMethod(const ObjectManager& manager, const std::string& nameSpace,
                                  const std::string& className, const std::string& name) {
    const Schema& schema = manager.schema(nameSpace);
    const mof::Method* const found = schema.findMethod(className, name);
    const bool registered =
        manager.registrations().find(className, nameSpace, Interface::Method) != nullptr;
    const bool canHave = found != nullptr || (registered && !isWhollyDeclared(schema, className)) ||
                         isInherited(manager, nameSpace, className, name);
    if (!canHave) throw CimError(cimMethodNotFound, className + " has no method " + name);
    if (!registered)
        throw CimError(cimMethodNotAvailable,
                       "nobody serves the method " + name + " of " + className);
    return found;
}

/// The type of a parameter; throws CimError for one that the method does not have.
CMPIType typeOf(const MethodCall& call, const MessageParameter& parameter) {
    const bool array = parameter.value && (parameter.value->name == "VALUE.ARRAY" ||
                                           parameter.value->name == "VALUE.REFARRAY");
    if (call.declared == nullptr) {
        const auto told = typeNamed(parameter.type.empty() ? "string" : parameter.type);
        if (!told) throw CimError(cimInvalidParameter, parameter.type + ": there is no such type");
        return array ? static_cast<CMPIType>(*told | CMPI_ARRAY) : *told;
    }
    for (const mof::Feature& each : call.declared->parameters) {
        if (base::equalsIgnoreCase(each.name, parameter.name)) return cmpiType(each);
    }
    throw CimError(cimInvalidParameter,
                   call.message.method + " has no parameter " + parameter.name);
}

Value valueOf(const MethodCall& call, const MessageParameter& parameter, CMPIType type) {
    if (!parameter.value) return Value::null(type);
    const XmlElement& element = *parameter.value;
    if (element.name.rfind("VALUE", 0) == 0 && element.name != "VALUE.NAMEDINSTANCE")
        return readValue(element, type, call.catalogue(), call.nameSpace);
    if (element.name == "INSTANCENAME" && type == CMPI_ref)
        return Value::fromReference(typedPath(readPath(element), call.catalogue(), call.nameSpace));
    throw CimError(cimInvalidParameter, "the parameter " + parameter.name + " holds a " +
                                            element.name + ", which is no value of its type");
}

/// The parameters that go in, by the names that the method has for them.
std::vector<NamedValue> argumentsOf(const MethodCall& call) {
    std::vector<NamedValue> arguments;
    for (const MessageParameter& each : call.message.parameters) {
        const bool twice = std::any_of(
            arguments.begin(), arguments.end(),
            [&](const NamedValue& other) { return base::equalsIgnoreCase(other.name, each.name); });
        if (twice)
            throw CimError(cimInvalidParameter, "the parameter " + each.name + " is there twice");
        const CMPIType type = typeOf(call, each);
        arguments.push_back({each.name, valueOf(call, each, type)});
        if (call.declared == nullptr) continue;
        for (const mof::Feature& known : call.declared->parameters) {
            if (base::equalsIgnoreCase(known.name, each.name)) arguments.back().name = known.name;
        }
    }
    return arguments;
}

}  // namespace

void invokeMethod(ObjectManager& manager, const std::string& nameSpace, const Message& message,
                  const std::optional<std::string>& user, std::string& xml) {
    RequestPath object = message.object;
    object.className = manager.knownClass(nameSpace, object.className);
    object.nameSpace = nameSpace;
    const MethodCall call = {manager, nameSpace, message,
                             declaredMethod(manager, nameSpace, object.className, message.method)};

    OperationRequest request;
    request.operation = Operation::InvokeMethod;
    request.context.principal = user;
    request.method = call.declared == nullptr ? message.method : call.declared->result.name;
    request.path.nameSpace = nameSpace;
    request.path.className = object.className;
    if (object.instance) request.path = typedPath(object, call.catalogue(), nameSpace);
    request.arguments = argumentsOf(call);

    const OperationResult result = manager.ask(request);
    const Site site = {manager.hostName(), nameSpace};
    if (result.value) writeReturnValue(xml, *result.value, site);
    for (const NamedValue& each : result.arguments)
        writeParameter(xml, each.name, each.value, site);
}

}  // namespace cmpihost::server
