// A handful of instances, made anew for each request: the counters are as of now.
#include "host/server/Interop.h"

#include <algorithm>
#include <utility>

#include "base/Ascii.h"
#include "host/mof/MofParser.h"
#include "host/server/InteropClasses.h"

namespace cmpihost::server {

namespace {

constexpr const char* managerClass = "KORVA_ObjectManager";
constexpr const char* nameSpaceClass = "CIM_Namespace";
constexpr const char* systemClass = "KORVA_ComputerSystem";
constexpr const char* managerName = "cmpihost";

Schema interopSchema() {
    Schema schema;
    schema.add(mof::parse(interopMof, Interop::nameSpace));
    return schema;
}

void refuse(OperationResult& result, CMPIrc rc, std::string message) {
    result.rc = rc;
    result.message = std::move(message);
}

/// All keys here are names, of hosts, classes and namespaces: they compare without case.
bool isNamedBy(const ObjectPathValue& given, const ObjectPathValue& asked) {
    const auto same = [&](const KeyBinding& key) {
        const Value* const other = asked.key(key.name);
        return other != nullptr && other->isText() &&
               base::equalsIgnoreCase(key.value.text(), other->text());
    };
    return base::equalsIgnoreCase(given.className, asked.className) &&
           given.keys.size() == asked.keys.size() &&
           std::all_of(given.keys.begin(), given.keys.end(), same);
}

std::uint64_t whole(std::chrono::nanoseconds time, std::chrono::nanoseconds unit) {
    return static_cast<std::uint64_t>(time / unit);
}

}  // namespace

Interop::Interop(std::string hostName, std::vector<std::string> nameSpaces,
                 const Statistics& statistics)
    : hostName_(std::move(hostName)),
      nameSpaces_(std::move(nameSpaces)),
      statistics_(statistics),
      schema_(interopSchema()),
      catalogue_(schema_) {}

// The schema declares nothing but what is served and what that descends from.
bool Interop::serves(const std::string& className) const {
    return schema_.find(className) != nullptr;
}

OperationResult Interop::ask(const OperationRequest& request) const {
    OperationResult result;
    const std::string& className = request.path.className;
    if (!serves(className)) {
        refuse(result, CMPI_RC_ERR_INVALID_CLASS, className + ": no such class in " + nameSpace);
        return result;
    }
    switch (request.operation) {
        case Operation::EnumerateInstances:
        case Operation::EnumerateInstanceNames:
            for (InstanceValue& each : instances()) {
                if (!schema_.isA(each.path.className, className)) continue;
                if (yieldsPaths(request.operation)) {
                    result.paths.push_back(std::move(each.path));
                } else {
                    result.instances.push_back(std::move(each));
                }
            }
            break;
        case Operation::GetInstance:
            for (InstanceValue& each : instances())
                if (isNamedBy(each.path, request.path)) result.instances.push_back(std::move(each));
            if (result.instances.empty())
                refuse(result, CMPI_RC_ERR_NOT_FOUND,
                       toString(request.path) + ": no such instance");
            break;
        default:
            refuse(result, CMPI_RC_ERR_NOT_SUPPORTED,
                   std::string("what ") + nameSpace + " holds is only to be read, not by " +
                       operationName(request.operation));
    }
    return result;
}

std::vector<InstanceValue> Interop::instances() const {
    std::vector<InstanceValue> result = {objectManager()};
    for (const std::string& name : nameSpaces_) result.push_back(nameSpaceInstance(name));
    for (const std::string& name : nameSpaces_)
        result.push_back(instanceOf("__Namespace", {{"Name", name}}));
    return result;
}

InstanceValue Interop::objectManager() const {
    using std::chrono::microseconds;
    using std::chrono::seconds;
    return instanceOf(
        managerClass,
        {{"Description", "cmpihost version " KORVA_VERSION
                         ", which answers WBEM clients from the CMPI providers of this host"},
         {"ElementName", managerName},
         {"EnabledState", Value::fromUnsigned(2, CMPI_uint16)},
         {"SystemCreationClassName", systemClass},
         {"SystemName", hostName_},
         {"CreationClassName", managerClass},
         {"Name", managerName},
         {"Started", Value::fromBoolean(true)},
         {"GatherStatisticalData", Value::fromBoolean(false)},
         {"Operations", Value::fromUnsigned(statistics_.operations())},
         {"FailedOperations", Value::fromUnsigned(statistics_.failures())},
         {"RefusedRequests", Value::fromUnsigned(statistics_.refusals())},
         {"OperationTime", Value::fromUnsigned(whole(statistics_.busyTime(), microseconds(1)))},
         {"UpTime", Value::fromUnsigned(whole(statistics_.upTime(), seconds(1)))}});
}

InstanceValue Interop::nameSpaceInstance(const std::string& name) const {
    return instanceOf(nameSpaceClass, {{"SystemCreationClassName", systemClass},
                                       {"SystemName", hostName_},
                                       {"ObjectManagerCreationClassName", managerClass},
                                       {"ObjectManagerName", managerName},
                                       {"CreationClassName", nameSpaceClass},
                                       {"Name", name},
                                       {"ClassInfo", Value::fromUnsigned(1, CMPI_uint16)}});
}

/// An instance whose path has those of its properties that are keys.
InstanceValue Interop::instanceOf(const char* className,
                                  std::vector<PropertyValue> properties) const {
    InstanceValue result{{nameSpace, className}, std::move(properties)};
    for (const PropertyValue& property : result.properties)
        if (schema_.isKey(className, property.name))
            result.path.keys.push_back({property.name, property.value});
    return result;
}

}  // namespace cmpihost::server
