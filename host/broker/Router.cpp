// Targets are found first and asked then, one after the other: an answer of several providers is
// that of one object manager, whole or a failure.
#include "host/broker/Router.h"

#include "host/broker/Invoke.h"

#include "base/Ascii.h"

#include <algorithm>
#include <exception>
#include <utility>

namespace cmpihost {

namespace {

OperationResult failureOf(const std::string& what) {
    OperationResult result;
    result.rc = CMPI_RC_ERR_FAILED;
    result.message = "an exception left the provider: " + what;
    return result;
}

/// Calls a provider for a client. An exception that leaves it must not end the host: in an object
/// manager it would end the process for everybody, and a person who looks into that wants to read
/// what was thrown.
OperationResult resultOrFailure(ProviderLibrary& library, Broker& broker,
                                const OperationRequest& request) {
    try {
        return invoke(library, broker, request);
    } catch (const std::exception& error) {
        return failureOf(error.what());
    } catch (...) {
        return failureOf("of an unknown type");
    }
}

bool isPolymorphic(Operation operation) {
    return operation == Operation::EnumerateInstances ||
           operation == Operation::EnumerateInstanceNames || operation == Operation::ExecQuery;
}

/// The association class that a request names; none: any.
const std::optional<std::string>& associationOf(const OperationRequest& request) {
    const bool references = request.operation == Operation::References ||
                            request.operation == Operation::ReferenceNames;
    return references ? request.resultClass : request.assocClass;
}

const ObjectPathValue& pathOf(const ObjectPathValue& path) {
    return path;
}
const ObjectPathValue& pathOf(const InstanceValue& instance) {
    return instance.path;
}

/// Moves the elements over; `once`: but those whose path is there already.
template <class Element>
void append(std::vector<Element>& to, std::vector<Element>& from, bool once) {
    for (Element& element : from) {
        const auto isSame = [&](const Element& other) { return pathOf(other) == pathOf(element); };
        if (once && std::any_of(to.begin(), to.end(), isSame)) continue;
        to.push_back(std::move(element));
    }
}

OperationResult refused(CMPIrc rc, std::string message) {
    OperationResult result;
    result.rc = rc;
    result.message = std::move(message);
    return result;
}

std::string listed(const std::vector<std::string>& names) {
    std::string text;
    for (const std::string& name : names) text += (text.empty() ? "" : ", ") + name;
    return text;
}

}  // namespace

std::string selectedClass(const std::string& query) {
    constexpr const char* blanks = " \t\r\n;";
    bool afterFrom = false;
    for (std::size_t start = query.find_first_not_of(blanks); start != std::string::npos;) {
        const std::size_t end = query.find_first_of(blanks, start);
        std::string word = query.substr(start, end - start);
        if (afterFrom) return word;
        afterFrom = base::equalsIgnoreCase(word, "FROM");
        start = query.find_first_not_of(blanks, end);
    }
    return {};
}

Router::Router(Broker& broker, const ClassCatalogue& catalogue, Registrations registrations,
               std::vector<std::filesystem::path> folders)
    : broker_(broker),
      catalogue_(catalogue),
      registrations_(std::move(registrations)),
      libraries_(broker, std::move(folders)) {
    broker_.routeOthers(*this);
}

OperationResult Router::ask(const OperationRequest& request) {
    return sole_ != nullptr ? resultOrFailure(*sole_, broker_, request)
                            : askRegistered(targetsOf(request), request);
}

OperationResult Router::askAnyone(const OperationRequest& request) {
    OperationResult result = ask(request);
    const bool failed = result.rc != CMPI_RC_OK && result.rc != CMPI_RC_ERR_INVALID_CLASS &&
                        result.rc != CMPI_RC_ERR_NOT_SUPPORTED;
    if (sole_ == nullptr || failed || !result.paths.empty() || !result.instances.empty()) {
        return result;
    }
    const std::vector<Target> targets = targetsOf(request);
    return targets.empty() ? result : askRegistered(targets, request);
}

OperationResult Router::askRegistered(const std::vector<Target>& targets,
                                      const OperationRequest& request) {
    if (targets.empty()) return refusal(request);
    return joined(targets, request, [&](ProviderLibrary& library, const OperationRequest& each) {
        return resultOrFailure(library, broker_, each);
    });
}

UpcallAnswer Router::perform(Broker& broker, const OperationRequest& request) {
    const std::vector<Target> targets = targetsOf(request);
    if (targets.empty() && sole_ != nullptr) return sole_->perform(broker, request);
    UpcallAnswer answer;
    OperationResult& result = answer;
    try {
        result = targets.empty()
                     ? refusal(request)
                     : joined(targets, request,
                              [&](ProviderLibrary& library, const OperationRequest& each) {
                                  return OperationResult(library.perform(broker, each));
                              });
    } catch (const LoadError& error) {
        result = refused(CMPI_RC_ERR_FAILED, error.what());
        const std::lock_guard<std::mutex> lock(mutex_);
        const std::string line = "an up-call for " + request.path.className + ": " + error.what();
        if (std::find(loadErrors_.begin(), loadErrors_.end(), line) == loadErrors_.end())
            loadErrors_.push_back(line);
    }
    return answer;
}

std::vector<std::string> Router::takeLoadErrors() {
    const std::lock_guard<std::mutex> lock(mutex_);
    return std::exchange(loadErrors_, {});
}

void Router::unload() noexcept {
    // While it cleans up, its up-calls go by registration.
    std::exchange(sole_, nullptr).reset();
    libraries_.unload();
}

std::vector<Router::Target> Router::targetsOf(const OperationRequest& request) const {
    if (isAssociationOperation(request.operation)) return associationTargets(request);
    if (isPolymorphic(request.operation)) return polymorphicTargets(request.path);
    const Registration* const found = registrations_.find(
        request.path.className, request.path.nameSpace, interfaceFor(request.operation));
    if (found == nullptr) return {};
    return {{found, request.path.className}};
}

std::vector<Router::Target> Router::polymorphicTargets(const ObjectPathValue& path) const {
    std::vector<Target> targets;
    for (const Registration& each : registrations_.all()) {
        if (!each.serves(Interface::Instance, path.nameSpace)) continue;
        const ClassRelation relation = classRelation(&catalogue_, each.className, path.className);
        if (relation != ClassRelation::Same && relation != ClassRelation::Subclass) continue;
        const auto isSame = [&](const Target& other) {
            return base::equalsIgnoreCase(other.className, each.className);
        };
        if (std::none_of(targets.begin(), targets.end(), isSame))
            targets.push_back({&each, each.className});
    }
    return targets;
}

std::vector<Router::Target> Router::associationTargets(const OperationRequest& request) const {
    const std::optional<std::string>& association = associationOf(request);
    std::vector<Target> targets;
    for (const Registration& each : registrations_.all()) {
        if (!each.serves(Interface::Association, request.path.nameSpace)) continue;
        if (association) {
            const ClassRelation relation = classRelation(&catalogue_, each.className, *association);
            const bool below = relation == ClassRelation::Subclass && !request.exactAssociation;
            if (relation != ClassRelation::Same && !below) continue;
        }
        const auto isSame = [&](const Target& other) {
            return providerKey(*other.registration) == providerKey(each);
        };
        if (std::none_of(targets.begin(), targets.end(), isSame))
            targets.push_back({&each, request.path.className});
    }
    return targets;
}

OperationResult Router::refusal(const OperationRequest& request) const {
    const std::string& nameSpace = request.path.nameSpace;
    if (!registrations_.names(nameSpace)) {
        const std::string known = listed(registrations_.nameSpaces());
        return refused(CMPI_RC_ERR_INVALID_NAMESPACE,
                       "no registration names the namespace " + nameSpace +
                           (known.empty() ? "" : "; known are " + known));
    }
    std::string kind = interfaceName(interfaceFor(request.operation));
    kind.front() = base::toLower(kind.front());
    const bool anyAssociation =
        isAssociationOperation(request.operation) && !associationOf(request).has_value();
    if (anyAssociation) {
        return refused(CMPI_RC_ERR_NOT_SUPPORTED,
                       "no association provider is registered in the namespace " + nameSpace);
    }
    const std::string& className = associationOf(request).value_or(request.path.className);
    if (className.empty()) {
        return refused(CMPI_RC_ERR_INVALID_QUERY, "the query names no class behind FROM");
    }
    if (!knows(className)) {
        return refused(CMPI_RC_ERR_INVALID_CLASS,
                       "neither the schema nor a registration names the class " + className);
    }
    return refused(CMPI_RC_ERR_NOT_SUPPORTED, "no " + kind + " provider is registered for " +
                                                  className + " in the namespace " + nameSpace);
}

bool Router::knows(const std::string& className) const {
    const auto& all = registrations_.all();
    return catalogue_.find(className) != nullptr ||
           std::any_of(all.begin(), all.end(), [&](const Registration& each) {
               const ClassRelation relation = classRelation(&catalogue_, each.className, className);
               return relation == ClassRelation::Same || relation == ClassRelation::Subclass;
           });
}

template <class Call>
OperationResult Router::joined(const std::vector<Target>& targets, const OperationRequest& request,
                               const Call& call) {
    OperationResult all;
    all.done = true;
    const bool once = isAssociationOperation(request.operation);
    for (const Target& target : targets) {
        OperationRequest each = request;
        each.path.className = target.className;
        OperationResult result = call(libraries_.of(*target.registration), each);
        if (targets.size() == 1) return result;
        if (result.rc != CMPI_RC_OK) {
            const std::string& className = target.registration->className;
            return refused(result.rc, "the provider of " + className +
                                          (result.message ? ": " + *result.message : ""));
        }
        append(all.paths, result.paths, once);
        append(all.instances, result.instances, once);
        all.done = all.done && result.done;
    }
    return all;
}

}  // namespace cmpihost
