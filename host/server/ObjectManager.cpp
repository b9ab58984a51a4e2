// Providers speak in the terms of CMPI and as they please; what leaves this file is whole, spelled
// as the schema has it, or a CimError.
#include "host/server/ObjectManager.h"

#include "base/Ascii.h"
#include "host/server/CimError.h"

#include <algorithm>
#include <set>
#include <utility>

namespace cmpihost::server {

namespace {

bool isInterop(const std::string& nameSpace) {
    return base::equalsIgnoreCase(nameSpace, Interop::nameSpace);
}

std::vector<std::string> namesOfSpaces(const Registrations& registrations) {
    std::vector<std::string> names = registrations.nameSpaces();
    names.erase(std::remove_if(names.begin(), names.end(), isInterop), names.end());
    if (names.empty()) names.emplace_back("root/cimv2");
    names.emplace_back(Interop::nameSpace);
    return names;
}

/// The classes that are registered for the interop namespace, and what they descend from.
mof::Document classesForInterop(const Schema& schema, const Registrations& registrations) {
    mof::Document document;
    for (const mof::QualifierType* const type : schema.qualifierTypes().all())
        document.qualifierTypes.push_back(*type);
    std::set<const mof::Class*> added;
    for (const Registration& each : registrations.all()) {
        if (!each.isFor(Interop::nameSpace)) continue;
        const mof::Class* found = schema.find(each.className);
        for (; found != nullptr && added.insert(found).second;
             found = schema.find(found->superclass))
            document.classes.push_back(*found);
    }
    return document;
}

bool isEnumeration(Operation operation) {
    return operation == Operation::EnumerateInstances ||
           operation == Operation::EnumerateInstanceNames;
}

/// Whether an answer that the provider did not end may lack something. A GetInstance without a
/// result has found none; an operation that changes something has none.
bool brokeOff(Operation operation, const OperationResult& result) {
    if (result.done) return false;
    if (operation == Operation::InvokeMethod || operation == Operation::GetProperty)
        return !result.value;
    return isEnumeration(operation) || operation == Operation::ExecQuery ||
           isAssociationOperation(operation);
}

std::string subject(const OperationRequest& request) {
    return std::string(operationName(request.operation)) + " of " + request.path.className;
}

[[noreturn]] void refuse(const OperationRequest& request, const OperationResult& result) {
    const auto code = static_cast<unsigned>(result.rc);
    const bool said = result.message && !result.message->empty();
    throw CimError(code, said ? *result.message : subject(request) + ": " + wordsForStatus(code));
}

template <class Element>
void moveOver(std::vector<Element>& to, std::vector<Element>& from) {
    to.insert(to.end(), std::make_move_iterator(from.begin()), std::make_move_iterator(from.end()));
}

}  // namespace

bool namesClass(std::string_view key) {
    constexpr std::string_view ending = "CreationClassName";
    return key.size() >= ending.size() &&
           base::equalsIgnoreCase(key.substr(key.size() - ending.size()), ending);
}

ObjectManager::ObjectManager(ObjectManagerSetup setup)
    : hostName_(std::move(setup.hostName)),
      schema_(std::move(setup.schema)),
      catalogue_(schema_),
      broker_(&catalogue_),
      router_(broker_, catalogue_, std::move(setup.registrations), std::move(setup.libraryFolders)),
      interop_(hostName_, namesOfSpaces(router_.registrations()), statistics_,
               classesForInterop(schema_, router_.registrations())),
      nameSpaces_(readNameSpaces()) {
    broker_.setMessageSink(std::move(setup.messageSink));
}

ObjectManager::~ObjectManager() = default;

std::vector<ObjectManager::NameSpace> ObjectManager::readNameSpaces() const {
    std::vector<NameSpace> spaces;
    for (const std::string& name : namesOfSpaces(registrations())) {
        NameSpace space{name, {}};
        for (const std::string& declared : schema(name).classNames()) addLine(space, declared);
        for (const Registration& each : registrations().all()) {
            if (each.isFor(name)) addLine(space, each.className);
        }
        spaces.push_back(std::move(space));
    }
    return spaces;
}

/// Adds a class and all that it descends from.
void ObjectManager::addLine(NameSpace& space, const std::string& className) const {
    std::optional<std::string_view> each = className;
    while (each && !each->empty()) {
        if (!space.classes.emplace(base::toLower(*each), *each).second) return;
        each = catalogue(space.name).superclassOf(*each);
    }
}

const ObjectManager::NameSpace* ObjectManager::find(const std::string& name) const {
    const auto found = std::find_if(
        nameSpaces_.begin(), nameSpaces_.end(),
        [&](const NameSpace& each) { return base::equalsIgnoreCase(each.name, name); });
    return found == nameSpaces_.end() ? nullptr : &*found;
}

std::string ObjectManager::nameSpace(const std::string& name) const {
    if (const NameSpace* const found = find(name)) return found->name;
    throw CimError(cimInvalidNamespace, name + ": no such namespace");
}

std::vector<std::string> ObjectManager::nameSpaces() const {
    std::vector<std::string> names;
    for (const NameSpace& each : nameSpaces_) names.push_back(each.name);
    return names;
}

const Schema& ObjectManager::schema(const std::string& nameSpace) const {
    return isInterop(nameSpace) ? interop_.schema() : schema_;
}

const ClassCatalogue& ObjectManager::catalogue(const std::string& nameSpace) const {
    if (isInterop(nameSpace)) return interop_.catalogue();
    return catalogue_;
}

bool ObjectManager::knowsClass(const std::string& nameSpace, const std::string& className) const {
    const NameSpace* const space = find(nameSpace);
    return space != nullptr && space->classes.count(base::toLower(className)) > 0;
}

std::string ObjectManager::spelling(const std::string& nameSpace,
                                    const std::string& className) const {
    const NameSpace* const space = find(nameSpace);
    if (space == nullptr) return className;
    const auto found = space->classes.find(base::toLower(className));
    return found == space->classes.end() ? className : found->second;
}

std::string ObjectManager::knownClass(const std::string& nameSpace,
                                      const std::string& className) const {
    if (knowsClass(nameSpace, className)) return spelling(nameSpace, className);
    throw CimError(cimInvalidClass, className + ": no such class in " + nameSpace);
}

bool ObjectManager::isA(const std::string& nameSpace, const std::string& className,
                        const std::string& ancestor) const {
    const ClassRelation relation = classRelation(&catalogue(nameSpace), className, ancestor);
    return relation == ClassRelation::Same || relation == ClassRelation::Subclass;
}

bool ObjectManager::hasInstanceProvider(const std::string& nameSpace,
                                        const std::string& className) const {
    const auto& all = registrations().all();
    return std::any_of(all.begin(), all.end(), [&](const Registration& each) {
        return each.serves(Interface::Instance, nameSpace) &&
               isA(nameSpace, each.className, className);
    });
}

OperationResult ObjectManager::ask(OperationRequest request) {
    spellClassKeys(request.path);
    OperationResult result = answerOf(request);
    if (result.rc != CMPI_RC_OK) refuse(request, result);
    if (brokeOff(request.operation, result))
        throw CimError(cimFailed, subject(request) + ": the answer of the provider broke off");
    finish(request, result);
    return result;
}

/// Providers compare these as texts: CreationClassName, CSCreationClassName and the like.
void ObjectManager::spellClassKeys(ObjectPathValue& path) const {
    for (KeyBinding& key : path.keys) {
        if (key.value.isNull()) continue;
        if (key.value.type() == CMPI_ref) {
            ObjectPathValue reference = key.value.reference();
            spellClassKeys(reference);
            key.value = Value::fromReference(std::move(reference));
        } else if (key.value.type() == CMPI_string && namesClass(key.name)) {
            key.value = spelling(path.nameSpace, key.value.text());
        }
    }
}

/// Whether a provider is registered for the class or, of an enumeration, for one below it.
bool ObjectManager::isServed(const OperationRequest& request) const {
    const ObjectPathValue& path = request.path;
    if (!isEnumeration(request.operation))
        return registrations().find(path.className, path.nameSpace, Interface::Instance) != nullptr;
    return hasInstanceProvider(path.nameSpace, path.className);
}

OperationResult ObjectManager::answerOf(const OperationRequest& request) {
    const ObjectPathValue& path = request.path;
    if (isInterop(path.nameSpace) && !isAssociationOperation(request.operation) &&
        interop_.serves(path.className))
        return askInterop(request);
    const bool reads =
        isEnumeration(request.operation) || request.operation == Operation::GetInstance;
    if (reads && !isServed(request) && knowsClass(path.nameSpace, path.className)) {
        OperationResult nothing;
        nothing.done = true;
        return nothing;
    }
    return askProviders(request);
}

OperationResult ObjectManager::askProviders(const OperationRequest& request) {
    try {
        OperationResult result = router_.ask(request);
        gatherComplaints();
        return result;
    } catch (const LoadError& error) {
        complain(error.what());
        throw CimError(cimFailed, error.what());
    } catch (const std::exception&) {
        throw;
    } catch (...) {
        // Of a factory: whatever leaves a provider later is in the result.
        throw CimError(cimFailed, subject(request) + ": the provider cannot be made");
    }
}

/// Of a class of the interop namespace there may be instances of other makers, too.
OperationResult ObjectManager::askInterop(const OperationRequest& request) {
    OperationResult result = interop_.ask(request);
    result.done = true;
    if (result.rc != CMPI_RC_OK || !isEnumeration(request.operation) || !isServed(request))
        return result;
    OperationResult others = askProviders(request);
    if (others.rc != CMPI_RC_OK) return others;
    moveOver(result.paths, others.paths);
    moveOver(result.instances, others.instances);
    result.done = others.done;
    return result;
}

void ObjectManager::finish(const OperationRequest& request, OperationResult& result) const {
    for (ObjectPathValue& path : result.paths) finish(request, path);
    for (InstanceValue& instance : result.instances) finish(request, instance.path);
}

void ObjectManager::finish(const OperationRequest& request, ObjectPathValue& path) const {
    // Only an association leads to another namespace.
    const bool elsewhere =
        isAssociationOperation(request.operation) && find(path.nameSpace) != nullptr;
    path.nameSpace = nameSpace(elsewhere ? path.nameSpace : request.path.nameSpace);
    path.className = spelling(path.nameSpace, path.className);
    path.hostName.clear();
}

void ObjectManager::complain(const std::string& line) {
    const std::lock_guard<std::mutex> lock(complaintMutex_);
    if (complaints_.size() < mostComplaints) {
        complaints_.push_back(line.substr(0, longestComplaint));
    } else {
        ++complaintsLeftOut_;
    }
}

/// Takes over what the broker and the router would keep until somebody asks.
void ObjectManager::gatherComplaints() {
    for (const std::string& line : broker_.takeViolations()) complain(line);
    for (const std::string& line : router_.takeLoadErrors()) complain(line);
}

std::vector<std::string> ObjectManager::takeComplaints() {
    gatherComplaints();
    const std::lock_guard<std::mutex> lock(complaintMutex_);
    std::vector<std::string> lines = std::exchange(complaints_, {});
    const std::size_t more = std::exchange(complaintsLeftOut_, 0);
    if (more > 0) lines.push_back("and " + std::to_string(more) + " more complaints");
    return lines;
}

}  // namespace cmpihost::server
