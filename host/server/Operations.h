#ifndef HOST_SERVER_OPERATIONS_H
#define HOST_SERVER_OPERATIONS_H

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "host/server/ElementWriter.h"
#include "host/server/ObjectManager.h"
#include "host/server/Parameters.h"

/// The operations of the endpoint: one table, in groups of one file each.
namespace cmpihost::server {

/// One call of an intrinsic operation.
struct Call {
    ObjectManager& manager;
    /// The namespace of the call, as the server spells it.
    const std::string& nameSpace;
    const Parameters& parameters;
    /// Who called; none: a client that need not say who it is.
    const std::optional<std::string>& user;

    Site site() const { return {manager.hostName(), nameSpace}; }
};

/// An operation by the name that messages have for it.
struct OperationRow {
    const char* name;
    std::vector<ParameterRow> parameters;
    /// Appends what stands in IMETHODRESPONSE, or throws CimError; what it appended before counts
    /// for nothing then.
    void (*run)(const Call& call, std::string& xml);
};

/// The groups.
const std::vector<OperationRow>& instanceOperations();
const std::vector<OperationRow>& associationOperations();
const std::vector<OperationRow>& classOperations();
const std::vector<OperationRow>& pullOperations();

/// The row of a name (without case), null for none.
const OperationRow* findOperation(std::string_view name);

/// Calls a method of a class or instance, as a METHODCALL asks for it: appends what stands in
/// METHODRESPONSE. `nameSpace` is that of the message as the server spells it. Throws CimError.
void invokeMethod(ObjectManager& manager, const std::string& nameSpace, const Message& message,
                  const std::optional<std::string>& user, std::string& xml);

/// What the operations that yield objects answer, before it is written: the pull operations hand it
/// out piece by piece. Their parameters are those of the operations of the same name. They throw
/// CimError.
std::vector<InstanceValue> enumeratedInstances(const Call& call);
std::vector<ObjectPathValue> enumeratedInstanceNames(const Call& call);
/// `sourceParameter` is the name of the parameter that holds the source.
std::vector<InstanceValue> associators(const Call& call, std::string_view sourceParameter);
std::vector<ObjectPathValue> associatorNames(const Call& call, std::string_view sourceParameter);
std::vector<InstanceValue> references(const Call& call, std::string_view sourceParameter);
std::vector<ObjectPathValue> referenceNames(const Call& call, std::string_view sourceParameter);

/// The one instance that has all the keys of the path of a GetInstance, with the properties that it
/// asks for; typedPath gave the path. Throws CimError with cimNotFound where there is none.
InstanceValue gottenInstance(ObjectManager& manager, const OperationRequest& request);
InstanceValue gottenInstance(ObjectManager& manager, const ObjectPathValue& path,
                             const std::optional<std::vector<std::string>>& properties);

/// Leaves out the properties that are not in the list (names without case), keys too. An absent
/// list keeps all.
void applyPropertyList(std::vector<InstanceValue>& instances,
                       const std::optional<std::vector<std::string>>& properties);

}  // namespace cmpihost::server

#endif
