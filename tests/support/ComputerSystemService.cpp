// Stands for the provider that owns the computer systems in an object manager, and fails on demand.
#include "support/ComputerSystemService.h"

namespace cmpihost {

namespace {

InstanceValue computerSystem(const std::string& nameSpace, const std::string& name) {
    InstanceValue instance;
    instance.path = {nameSpace,
                     ComputerSystemService::className,
                     {{"CreationClassName", ComputerSystemService::className}, {"Name", name}}};
    for (const KeyBinding& key : instance.path.keys) {
        instance.properties.push_back({key.name, key.value});
    }
    return instance;
}

}  // namespace

ComputerSystemService::ComputerSystemService(std::string hostName) : names_{std::move(hostName)} {}

ComputerSystemService::ComputerSystemService(std::vector<std::string> names)
    : names_(std::move(names)) {}

void ComputerSystemService::setNames(std::vector<std::string> names) {
    names_ = std::move(names);
}

void ComputerSystemService::failEnumerations(CMPIrc rc) {
    enumerationRc_ = rc;
}

void ComputerSystemService::failAtNext(unsigned k, CMPIrc rc) {
    failAt_ = k;
    failRc_ = rc;
}

/// Keys of the path do not matter, as an enumeration asks about a class.
UpcallAnswer ComputerSystemService::enumerate(const OperationRequest& request) const {
    UpcallAnswer answer;
    answer.rc = enumerationRc_;
    answer.failAt = failAt_;
    answer.failRc = failRc_;
    if (answer.rc != CMPI_RC_OK) return answer;
    for (const std::string& name : names_) {
        InstanceValue instance = computerSystem(request.path.nameSpace, name);
        answer.paths.push_back(instance.path);
        answer.instances.push_back(std::move(instance));
    }
    return answer;
}

UpcallAnswer ComputerSystemService::find(const OperationRequest& request) const {
    UpcallAnswer answer;
    answer.rc = CMPI_RC_ERR_NOT_FOUND;
    for (const std::string& name : names_) {
        InstanceValue instance = computerSystem(request.path.nameSpace, name);
        // All keys count, as object managers ask for an instance by its whole path.
        if (instance.path != request.path) continue;
        answer.rc = CMPI_RC_OK;
        answer.instances.push_back(std::move(instance));
        break;
    }
    return answer;
}

UpcallAnswer ComputerSystemService::perform(Broker&, const OperationRequest& request) {
    switch (request.operation) {
        case Operation::EnumerateInstances:
        case Operation::EnumerateInstanceNames:
            return enumerate(request);
        case Operation::GetInstance:
            return find(request);
        default:
            return {{CMPI_RC_ERR_NOT_SUPPORTED}};
    }
}

}  // namespace cmpihost
