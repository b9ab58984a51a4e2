#ifndef HOST_BROKER_OPERATION_H
#define HOST_BROKER_OPERATION_H

#include "host/broker/Value.h"

#include <optional>
#include <string>
#include <vector>

/// A CIM operation as a value: what a client asks of a provider and what comes back.
namespace cmpihost {

enum class Operation {
    EnumerateInstances,
    EnumerateInstanceNames,
    GetInstance,
    CreateInstance,
    ModifyInstance,
    DeleteInstance,
    ExecQuery,
    Associators,
    AssociatorNames,
    References,
    ReferenceNames,
    InvokeMethod,
    GetProperty,
    SetProperty
};

/// "EnumerateInstances" and so on.
constexpr const char* operationName(Operation operation) noexcept {
    constexpr const char* names[] = {"EnumerateInstances", "EnumerateInstanceNames",
                                     "GetInstance",        "CreateInstance",
                                     "ModifyInstance",     "DeleteInstance",
                                     "ExecQuery",          "Associators",
                                     "AssociatorNames",    "References",
                                     "ReferenceNames",     "InvokeMethod",
                                     "GetProperty",        "SetProperty"};
    return names[static_cast<unsigned>(operation)];
}

/// The management interfaces of CMPI that the host drives; each answers operations of its own.
enum class Interface { Instance, Association, Method, Property };
constexpr Interface allInterfaces[] = {Interface::Instance, Interface::Association,
                                       Interface::Method, Interface::Property};

/// "Instance" and so on, as it stands in the names of factories.
constexpr const char* interfaceName(Interface which) noexcept {
    constexpr const char* names[] = {"Instance", "Association", "Method", "Property"};
    return names[static_cast<unsigned>(which)];
}

/// The interface that answers the operation.
constexpr Interface interfaceFor(Operation operation) noexcept {
    if (operation < Operation::Associators) return Interface::Instance;
    if (operation <= Operation::ReferenceNames) return Interface::Association;
    return operation == Operation::InvokeMethod ? Interface::Method : Interface::Property;
}

/// Whether it starts from an instance and asks for what associations tie to it.
constexpr bool isAssociationOperation(Operation operation) noexcept {
    return interfaceFor(operation) == Interface::Association;
}

/// Whether its results are paths, without properties.
constexpr bool yieldsPaths(Operation operation) noexcept {
    return operation == Operation::EnumerateInstanceNames ||
           operation == Operation::AssociatorNames || operation == Operation::ReferenceNames ||
           operation == Operation::CreateInstance;
}

/// What accompanies a request: flags, and who sent it.
struct RequestContext {
    CMPIFlags flags = 0;
    /// None: the entry is there and its string has no characters, as for a client that is not
    /// authenticated.
    std::optional<std::string> principal{};
    std::optional<std::string> role{};
};

struct OperationRequest {
    Operation operation = Operation::EnumerateInstances;
    /// The class, the instance or the source of the association. A text key of type CMPI_chars
    /// reaches the provider as CMPI_chars, any other key as its own type.
    ObjectPathValue path{};
    /// The client's property list; none: a null list, that is all properties.
    std::optional<std::vector<std::string>> properties{};
    /// For CreateInstance and ModifyInstance.
    InstanceValue instance{};
    /// For ExecQuery.
    std::string query{};
    std::string queryLanguage = "WQL";
    /// Filters of the association operations; none: null.
    std::optional<std::string> assocClass{};
    std::optional<std::string> resultClass{};
    std::optional<std::string> role{};
    std::optional<std::string> resultRole{};
    /// The association class that is named stands for itself alone, not for those below it too.
    bool exactAssociation = false;
    /// For InvokeMethod, with the arguments that go in.
    std::string method{};
    std::vector<NamedValue> arguments{};
    /// For GetProperty and SetProperty, with the value that is set.
    std::string property{};
    Value value{};
    RequestContext context{};
};

/// What an operation answers.
struct OperationResult {
    CMPIrc rc = CMPI_RC_OK;
    /// The text of the status; none: the status carried no message.
    std::optional<std::string> message{};
    std::vector<ObjectPathValue> paths{};
    std::vector<InstanceValue> instances{};
    /// What a method returned, or the value of a property; none: the provider returned no data.
    std::optional<Value> value{};
    /// The arguments that came out of a method.
    std::vector<NamedValue> arguments{};
    /// Whether everybody who was asked ended the answer with returnDone. A provider that breaks off
    /// without a status leaves it out.
    bool done = false;
};

}  // namespace cmpihost

#endif
