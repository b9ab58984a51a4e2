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
    InvokeMethod,
    Associators,
    AssociatorNames,
    References,
    ReferenceNames
};

/// "EnumerateInstances" and so on.
constexpr const char* operationName(Operation operation) noexcept {
    constexpr const char* names[] = {
        "EnumerateInstances", "EnumerateInstanceNames", "GetInstance", "CreateInstance",
        "ModifyInstance",     "DeleteInstance",         "ExecQuery",   "InvokeMethod",
        "Associators",        "AssociatorNames",        "References",  "ReferenceNames"};
    return names[static_cast<unsigned>(operation)];
}

/// Whether it starts from an instance and asks for what associations tie to it.
constexpr bool isAssociationOperation(Operation operation) noexcept {
    return operation >= Operation::Associators;
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
    RequestContext context{};
};

/// What an operation answers.
struct OperationResult {
    CMPIrc rc = CMPI_RC_OK;
    /// The text of the status; none: the status carried no message.
    std::optional<std::string> message{};
    std::vector<ObjectPathValue> paths{};
    std::vector<InstanceValue> instances{};
};

}  // namespace cmpihost

#endif
