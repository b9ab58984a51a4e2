#include "bench/Requests.h"

#include <algorithm>
#include <stdexcept>

namespace bench {

using namespace cmpihost;

namespace {

ObjectPathValue path(const std::string& className, std::vector<KeyBinding> keys = {}) {
    ObjectPathValue made;
    made.nameSpace = "root/cimv2";
    made.className = className;
    made.keys = std::move(keys);
    return made;
}

ObjectPathValue computerPath() {
    return path("KORVA_ComputerSystem",
                {{"CreationClassName", "KORVA_ComputerSystem"}, {"Name", "simulated.example"}});
}

ObjectPathValue systemPath() {
    return path("KORVA_OperatingSystem", {{"CSCreationClassName", "KORVA_ComputerSystem"},
                                          {"CSName", "simulated.example"},
                                          {"CreationClassName", "KORVA_OperatingSystem"},
                                          {"Name", "Simulated Linux"}});
}

ObjectPathValue capabilitiesPath() {
    return path("KORVA_OperatingSystemCapabilities", {{"InstanceID", "Simulated Linux"}});
}

ObjectPathValue pairPath(const std::string& className, const char* firstRole,
                         const ObjectPathValue& first, const char* secondRole,
                         const ObjectPathValue& second) {
    return path(className, {{firstRole, Value::fromReference(first)},
                            {secondRole, Value::fromReference(second)}});
}

std::vector<ObjectPathValue> instancePaths() {
    return {systemPath(), capabilitiesPath(),
            pairPath("KORVA_InstalledOS", "GroupComponent", computerPath(), "PartComponent",
                     systemPath()),
            pairPath("KORVA_RunningOS", "Antecedent", systemPath(), "Dependent", computerPath()),
            pairPath("KORVA_OSElementCapabilities", "ManagedElement", systemPath(), "Capabilities",
                     capabilitiesPath())};
}

struct Hop {
    ObjectPathValue source;
    const char* assocClass;
};

std::vector<Hop> hops() {
    return {{computerPath(), "KORVA_InstalledOS"},
            {systemPath(), "KORVA_InstalledOS"},
            {computerPath(), "KORVA_RunningOS"},
            {systemPath(), "KORVA_RunningOS"},
            {systemPath(), "KORVA_OSElementCapabilities"},
            {capabilitiesPath(), "KORVA_OSElementCapabilities"}};
}

NamedRequest onPath(Operation operation, ObjectPathValue path) {
    NamedRequest made;
    made.name = std::string(operationName(operation)) + " " + path.className;
    made.request.operation = operation;
    made.request.path = std::move(path);
    return made;
}

std::vector<NamedRequest> makeRequests() {
    std::vector<NamedRequest> made;
    for (const ObjectPathValue& instance : instancePaths()) {
        made.push_back(onPath(Operation::EnumerateInstances, path(instance.className)));
        made.push_back(onPath(Operation::EnumerateInstanceNames, path(instance.className)));
        made.push_back(onPath(Operation::GetInstance, instance));
    }
    for (const Hop& hop : hops()) {
        for (const Operation operation : {Operation::Associators, Operation::AssociatorNames}) {
            made.push_back(onPath(operation, hop.source));
            made.back().name += std::string(" ") + hop.assocClass;
            made.back().request.assocClass = hop.assocClass;
        }
    }
    for (const ObjectPathValue& instance : instancePaths()) {
        for (const Operation operation :
             {Operation::CreateInstance, Operation::ModifyInstance, Operation::DeleteInstance,
              Operation::ExecQuery, Operation::References, Operation::ReferenceNames}) {
            made.push_back(onPath(operation, instance));
            made.back().request.instance.path = instance;
        }
    }
    return made;
}

}  // namespace

const std::vector<NamedRequest>& requests() {
    static const std::vector<NamedRequest> all = makeRequests();
    return all;
}

const OperationRequest& requestNamed(const std::string& name) {
    const auto found = std::find_if(requests().begin(), requests().end(),
                                    [&](const NamedRequest& each) { return each.name == name; });
    if (found == requests().end()) throw std::invalid_argument("no request " + name);
    return found->request;
}

}  // namespace bench
