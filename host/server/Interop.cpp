// A handful of instances, made anew for each request: the counters are as of now.
#include "host/server/Interop.h"

#include <algorithm>
#include <utility>

#include "base/Ascii.h"
#include "host/mof/MofParser.h"

namespace cmpihost::server {

namespace {

constexpr const char* managerClass = "KORVA_ObjectManager";
constexpr const char* nameSpaceClass = "CIM_Namespace";
constexpr const char* otherNameSpaceClass = "__Namespace";
constexpr const char* systemClass = "KORVA_ComputerSystem";
constexpr const char* managerName = "cmpihost";

/// Of the CIM schema's classes what is served.
constexpr const char* interopMof = R"mof(
   [Abstract, Version ( "1.0.0" ),
    Description ("Anything that is managed. Here: what the server is made of.")]
class CIM_ManagedElement {
      [Description ("A short text about the object. Not published.")]
   string Caption;

      [Description ("A text about the object.")]
   string Description;

      [Description ("A name for people to read.")]
   string ElementName;
};

   [Abstract, Version ( "1.0.0" ), Description ("A part of a system.")]
class CIM_ManagedSystemElement : CIM_ManagedElement {
};

   [Abstract, Version ( "1.0.0" ), Description ("A part of a system that is no hardware.")]
class CIM_LogicalElement : CIM_ManagedSystemElement {
};

   [Abstract, Version ( "1.0.0" ), Description ("A part of a system that can be in use or not.")]
class CIM_EnabledLogicalElement : CIM_LogicalElement {
      [Description ("Whether it is in use."),
       ValueMap { "0", "1", "2", "3", "4", "5", "6", "7", "8", "9", "10", "11..32767",
          "32768..65535" },
       Values { "Unknown", "Other", "Enabled", "Disabled", "Shutting Down", "Not Applicable",
          "Enabled but Offline", "In Test", "Deferred", "Quiesce", "Starting", "DMTF Reserved",
          "Vendor Reserved" }]
   uint16 EnabledState;
};

   [Abstract, Version ( "1.0.0" ), Description ("What a system does for others.")]
class CIM_Service : CIM_EnabledLogicalElement {
      [Key, MaxLen ( 256 ), Propagated ( "CIM_System.CreationClassName" ),
       Description ("The class of the system that the service runs on.")]
   string SystemCreationClassName;

      [Key, MaxLen ( 256 ), Propagated ( "CIM_System.Name" ),
       Description ("The name of the system that the service runs on.")]
   string SystemName;

      [Key, MaxLen ( 256 ), Description ("The class that the instance was made from.")]
   string CreationClassName;

      [Key, MaxLen ( 256 ), Description ("The name of the service on its system.")]
   string Name;

      [Description ("Whether the service runs.")]
   boolean Started;
};

   [Abstract, Version ( "1.0.0" ), Description ("A service by which WBEM clients ask a system.")]
class CIM_WBEMService : CIM_Service {
};

   [Version ( "1.0.0" ), Description ("The server that answers WBEM clients.")]
class CIM_ObjectManager : CIM_WBEMService {
      [Description (
          "Whether statistics are gathered by the model of the CIM schema: false. The counters of "
          "KORVA_ObjectManager always count.")]
   boolean GatherStatisticalData;
};

   [Version ( "1.0.0" ),
    Description (
       "This server, with counters of what it did since it was started. A request that is being "
       "answered is not counted yet.")]
class KORVA_ObjectManager : CIM_ObjectManager {
      [Counter, Description ("The operations and methods that were answered, failed ones too.")]
   uint64 Operations;

      [Counter, Description ("The operations and methods that ended with a status other than OK.")]
   uint64 FailedOperations;

      [Counter,
       Description (
          "The requests that were refused before they were understood as an operation: with an "
          "HTTP status other than 200.")]
   uint64 RefusedRequests;

      [Counter, Units ( "MicroSeconds" ),
       Description (
          "The time that the operations took, in sum; divided by Operations it is the mean. Of "
          "two that ran at once each counts in full.")]
   uint64 OperationTime;

      [Units ( "Seconds" ), Description ("The time since the server was started.")]
   uint64 UpTime;
};

   [Version ( "1.0.0" ), Description ("A namespace of the server; there is one for each.")]
class CIM_Namespace : CIM_ManagedElement {
      [Key, MaxLen ( 256 ), Propagated ( "CIM_ObjectManager.SystemCreationClassName" ),
       Description ("The class of the system that the server runs on.")]
   string SystemCreationClassName;

      [Key, MaxLen ( 256 ), Propagated ( "CIM_ObjectManager.SystemName" ),
       Description ("The name of the system that the server runs on.")]
   string SystemName;

      [Key, MaxLen ( 256 ), Propagated ( "CIM_ObjectManager.CreationClassName" ),
       Description ("The class of the server: KORVA_ObjectManager.")]
   string ObjectManagerCreationClassName;

      [Key, MaxLen ( 256 ), Propagated ( "CIM_ObjectManager.Name" ),
       Description ("The name of the server.")]
   string ObjectManagerName;

      [Key, MaxLen ( 256 ), Description ("The class that the instance was made from.")]
   string CreationClassName;

      [Key, MaxLen ( 256 ), Description ("The name of the namespace, as requests have it.")]
   string Name;

      [Required,
       Description ("What kind of classes the namespace holds; 1 says nothing in particular.")]
   uint16 ClassInfo;
};

   [Version ( "1.0.0" ), Description ("A namespace, for clients that look for no other class.")]
class __Namespace {
      [Key, MaxLen ( 256 ), Description ("The whole name of the namespace, as requests have it.")]
   string Name;
};
)mof";

Schema interopSchema(mof::Document others) {
    Schema schema;
    schema.add(mof::parse(interopMof, Interop::nameSpace));
    others.classes.erase(
        std::remove_if(others.classes.begin(), others.classes.end(),
                       [&](const mof::Class& each) { return schema.find(each.name) != nullptr; }),
        others.classes.end());
    schema.add(std::move(others));
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
                 const Statistics& statistics, mof::Document others)
    : hostName_(std::move(hostName)),
      nameSpaces_(std::move(nameSpaces)),
      statistics_(statistics),
      schema_(interopSchema(std::move(others))),
      catalogue_(schema_) {}

bool Interop::serves(const std::string& className) const {
    const auto served = {managerClass, nameSpaceClass, otherNameSpaceClass};
    return std::any_of(served.begin(), served.end(),
                       [&](const char* each) { return schema_.isA(each, className); });
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
        result.push_back(instanceOf(otherNameSpaceClass, {{"Name", name}}));
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
