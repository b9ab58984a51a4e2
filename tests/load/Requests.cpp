#include "load/Requests.h"

#include <algorithm>
#include <iterator>
#include <optional>
#include <utility>

namespace load {
namespace {

using namespace cmpihost;

using Paths = std::vector<ObjectPathValue>;

struct InstanceOperation {
    Operation operation;
    CMPIrc status;
};
constexpr InstanceOperation instanceOperations[] = {
    {Operation::EnumerateInstanceNames, CMPI_RC_OK},
    {Operation::EnumerateInstances, CMPI_RC_OK},
    {Operation::GetInstance, CMPI_RC_OK},
    {Operation::CreateInstance, CMPI_RC_ERR_NOT_SUPPORTED},
    {Operation::ModifyInstance, CMPI_RC_ERR_NOT_SUPPORTED},
    {Operation::DeleteInstance, CMPI_RC_ERR_NOT_SUPPORTED},
    {Operation::ExecQuery, CMPI_RC_ERR_NOT_SUPPORTED},
};

struct AssociationClass {
    const char* name;  ///< null: none
    CMPIrc status;
};
constexpr AssociationClass associationClasses[] = {
    {"KORVA_InstalledOS", CMPI_RC_OK},
    {"korva_runningos", CMPI_RC_OK},
    {"KORVA_OSElementCapabilities", CMPI_RC_OK},
    {"KORVA_OperatingSystem", CMPI_RC_ERR_INVALID_CLASS},
    {nullptr, CMPI_RC_ERR_INVALID_CLASS},
};

ObjectPathValue path(const char* className, std::vector<KeyBinding> keys = {}) {
    return {"root/cimv2", className, std::move(keys)};
}

bool isServed(const ObjectPathValue& of) {
    return of.className != "KORVA_ComputerSystem" && of.className != "KORVA_Unknown";
}

ObjectPathValue computerPath(const std::string& name) {
    return path("KORVA_ComputerSystem",
                {{"CreationClassName", "KORVA_ComputerSystem"}, {"Name", name}});
}

ObjectPathValue systemPath(const std::string& computer, const std::string& name) {
    return path("KORVA_OperatingSystem", {{"CSCreationClassName", "KORVA_ComputerSystem"},
                                          {"CSName", computer},
                                          {"CreationClassName", "KORVA_OperatingSystem"},
                                          {"Name", name}});
}

ObjectPathValue capabilitiesPath(const std::string& id) {
    return path("KORVA_OperatingSystemCapabilities", {{"InstanceID", id}});
}

Paths sources(const std::string& computerName, const std::string& systemName) {
    const Value computer = Value::fromReference(computerPath(computerName));
    const Value system = Value::fromReference(systemPath(computerName, systemName));
    const Value abilities = Value::fromReference(capabilitiesPath(systemName));
    const Value others = Value::fromReference(capabilitiesPath("another"));
    const char* const element = "KORVA_OSElementCapabilities";
    return {
        path("KORVA_ComputerSystem"),
        computerPath(computerName),
        computerPath("elsewhere"),
        path("KORVA_OperatingSystem"),
        systemPath(computerName, systemName),
        systemPath("elsewhere", systemName),
        path("KORVA_OperatingSystem", {{"Other", Value::fromUnsigned(5)}}),
        path("KORVA_OperatingSystemCapabilities"),
        capabilitiesPath(systemName),
        capabilitiesPath(std::string(2000, 'x')),
        path("KORVA_InstalledOS"),
        path("KORVA_InstalledOS", {{"GroupComponent", computer}, {"PartComponent", system}}),
        path("KORVA_RunningOS"),
        path("KORVA_RunningOS", {{"Antecedent", system}, {"Dependent", computer}}),
        path(element),
        path(element, {{"ManagedElement", system}, {"Capabilities", abilities}}),
        path(element, {{"ManagedElement", system}, {"Capabilities", others}}),
        path("KORVA_Unknown"),
        path("KORVA_Unknown", {{"Name", systemName}}),
    };
}

MixedRequest instanceRequest(const InstanceOperation& row, const ObjectPathValue& source) {
    MixedRequest result;
    result.request.operation = row.operation;
    result.request.path = source;
    result.request.instance.path = source;
    result.request.query = "SELECT * FROM " + source.className;
    if (row.operation == Operation::GetInstance)
        result.request.properties = std::vector<std::string>{"Name", "OSType"};
    result.status =
        row.status == CMPI_RC_OK && !isServed(source) ? CMPI_RC_ERR_INVALID_CLASS : row.status;
    return result;
}

MixedRequest associationRequest(Operation operation, const ObjectPathValue& source,
                                const AssociationClass& association) {
    MixedRequest result;
    result.request.operation = operation;
    result.request.path = source;
    if (association.name != nullptr) result.request.assocClass = association.name;
    result.status = association.status;
    return result;
}

bool ofInstances(Operation operation) {
    return std::any_of(std::begin(instanceOperations), std::end(instanceOperations),
                       [&](const InstanceOperation& row) { return row.operation == operation; });
}

// What the facade answers where the provider has a status of its own.
void judgeAsFacade(MixedRequest& each) {
    const ObjectPathValue& source = each.request.path;
    if (!ofInstances(each.request.operation)) each.status = CMPI_RC_OK;
    if (each.request.operation != Operation::GetInstance || !isServed(source)) return;
    const bool keysAreRight = !source.keys.empty() && source.keys[0].name != "Other";
    each.status = keysAreRight ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_PARAMETER;
    each.mayBeNotFound = keysAreRight;
}

MixedRequest referenceRequest(Operation operation, const ObjectPathValue& source) {
    MixedRequest result;
    result.request.operation = operation;
    result.request.path = source;
    result.request.resultClass = "KORVA_RunningOS";
    result.status = CMPI_RC_ERR_NOT_SUPPORTED;
    return result;
}

}  // namespace

std::vector<MixedRequest> mixedRequests(const std::string& computer, const std::string& system) {
    std::vector<MixedRequest> result;
    for (const ObjectPathValue& source : sources(computer, system)) {
        for (const InstanceOperation& row : instanceOperations)
            result.push_back(instanceRequest(row, source));
        for (const Operation operation : {Operation::AssociatorNames, Operation::Associators})
            for (const AssociationClass& association : associationClasses)
                result.push_back(associationRequest(operation, source, association));
        for (const Operation operation : {Operation::ReferenceNames, Operation::References})
            result.push_back(referenceRequest(operation, source));
    }
    return result;
}

std::vector<MixedRequest> facadeRequests(const std::string& computer, const std::string& system) {
    std::vector<MixedRequest> result = mixedRequests(computer, system);
    for (MixedRequest& each : result) judgeAsFacade(each);
    for (const Operation operation : {Operation::AssociatorNames, Operation::Associators,
                                      Operation::ReferenceNames, Operation::References})
        for (const ObjectPathValue& source :
             {capabilitiesPath(system), systemPath(computer, system), computerPath(computer)}) {
            MixedRequest each = {{}, CMPI_RC_OK};
            each.request.operation = operation;
            each.request.path = source;
            each.request.role = "partcomponent";
            each.request.properties = std::vector<std::string>{"OSType", "PrimaryOS"};
            result.push_back(each);
            each.request.role.reset();
            result.push_back(each);
        }
    return result;
}

std::string describe(const OperationRequest& request) {
    return std::string(operationName(request.operation)) + " " + toString(request.path) +
           " through " + request.assocClass.value_or("no class");
}

}  // namespace load
