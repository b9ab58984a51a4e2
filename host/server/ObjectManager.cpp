#include "host/server/ObjectManager.h"

#include "host/server/CimError.h"

#include <utility>

namespace cmpihost::server {

ObjectManager::ObjectManager(ObjectManagerSetup setup)
    : hostName_(std::move(setup.hostName)),
      schema_(std::move(setup.schema)),
      catalogue_(schema_),
      broker_(&catalogue_),
      router_(broker_, catalogue_, std::move(setup.registrations), std::move(setup.libraryFolders)),
      interop_(hostName_, {}, statistics_) {
    broker_.setMessageSink(std::move(setup.messageSink));
}

ObjectManager::~ObjectManager() = default;

std::string ObjectManager::nameSpace(const std::string& name) const {
    return name;
}
std::vector<std::string> ObjectManager::nameSpaces() const {
    return {};
}
const Schema& ObjectManager::schema(const std::string&) const {
    return schema_;
}
const ClassCatalogue& ObjectManager::catalogue(const std::string&) const {
    return catalogue_;
}
bool ObjectManager::knowsClass(const std::string&, const std::string&) const {
    return false;
}
std::string ObjectManager::spelling(const std::string&, const std::string& className) const {
    return className;
}
bool ObjectManager::isA(const std::string&, const std::string&, const std::string&) const {
    return false;
}
OperationResult ObjectManager::ask(const OperationRequest&) {
    throw CimError(cimNotSupported, "not built yet");
}
std::vector<std::string> ObjectManager::takeComplaints() {
    return {};
}

}  // namespace cmpihost::server
