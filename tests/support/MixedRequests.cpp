// The requests that load is made of: the cross product of operations, sources and association
// classes, each with the one status that it has.
#include <algorithm>
#include <iterator>
#include <utility>

#include "support/Requests.h"

namespace {

using namespace cmpihost;

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

constexpr std::pair<const char*, CMPIrc> associationClasses[] = {
    {"KORVA_InstalledOS", CMPI_RC_OK},
    {"korva_runningos", CMPI_RC_OK},
    {"KORVA_OSElementCapabilities", CMPI_RC_OK},
    {"KORVA_OperatingSystem", CMPI_RC_ERR_INVALID_CLASS},
    {"", CMPI_RC_ERR_INVALID_CLASS},
};

bool isServed(const ObjectPathValue& of) {
    return of.className != "KORVA_ComputerSystem" && of.className != "KORVA_Unknown";
}

std::vector<ObjectPathValue> sources(const std::string& computerName,
                                     const std::string& systemName) {
    const ObjectPathValue computer = computerSystemPath(computerName);
    const ObjectPathValue system = operatingSystemPath(computerName, systemName);
    const ObjectPathValue abilities = capabilitiesPath(systemName);
    return {
        path("KORVA_ComputerSystem"),
        computer,
        computerSystemPath("elsewhere"),
        path("KORVA_OperatingSystem"),
        system,
        operatingSystemPath("elsewhere", systemName),
        path("KORVA_OperatingSystem", {{"Other", Value::fromUnsigned(5)}}),
        path("KORVA_OperatingSystemCapabilities"),
        abilities,
        capabilitiesPath(std::string(2000, 'x')),
        path("KORVA_InstalledOS"),
        pairPath(installedOS, computer, system),
        path("KORVA_RunningOS"),
        pairPath(runningOS, system, computer),
        path("KORVA_OSElementCapabilities"),
        pairPath(elementCapabilities, system, abilities),
        pairPath(elementCapabilities, system, capabilitiesPath("another")),
        path("KORVA_Unknown"),
        path("KORVA_Unknown", {{"Name", systemName}}),
    };
}

MixedRequest instanceRequest(const InstanceOperation& row, const ObjectPathValue& source) {
    MixedRequest result = {requestFor(row.operation, source), row.status};
    result.request.instance.path = source;
    result.request.query = "SELECT * FROM " + source.className;
    if (row.operation == Operation::GetInstance)
        result.request.properties = std::vector<std::string>{"Name", "OSType"};
    if (row.status == CMPI_RC_OK && !isServed(source)) result.status = CMPI_RC_ERR_INVALID_CLASS;
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

}  // namespace

std::vector<MixedRequest> mixedRequests(const std::string& computer, const std::string& system) {
    std::vector<MixedRequest> result;
    for (const ObjectPathValue& source : sources(computer, system)) {
        for (const InstanceOperation& row : instanceOperations)
            result.push_back(instanceRequest(row, source));
        for (const Operation operation : {Operation::AssociatorNames, Operation::Associators})
            for (const auto& [assocClass, status] : associationClasses)
                result.push_back({requestFor(operation, source, assocClass), status});
        for (const Operation operation : {Operation::ReferenceNames, Operation::References}) {
            result.push_back({requestFor(operation, source), CMPI_RC_ERR_NOT_SUPPORTED});
            result.back().request.resultClass = "KORVA_RunningOS";
        }
    }
    return result;
}

std::vector<MixedRequest> mixedFacadeRequests(const std::string& computer,
                                              const std::string& system) {
    std::vector<MixedRequest> result = mixedRequests(computer, system);
    for (MixedRequest& each : result) judgeAsFacade(each);
    for (const Operation operation : {Operation::AssociatorNames, Operation::Associators,
                                      Operation::ReferenceNames, Operation::References})
        for (const ObjectPathValue& source :
             {capabilitiesPath(system), operatingSystemPath(computer, system),
              computerSystemPath(computer)}) {
            MixedRequest each = {requestFor(operation, source), CMPI_RC_OK};
            each.request.properties = std::vector<std::string>{"OSType", "PrimaryOS"};
            result.push_back(each);
            each.request.role = "partcomponent";
            result.push_back(each);
        }
    return result;
}
