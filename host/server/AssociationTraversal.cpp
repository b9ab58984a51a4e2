// Providers know associations by their concrete classes only, and few of them look at filters: each
// association that can have the source at one of its ends is asked by its name, and the answers are
// filtered here.
#include "host/server/AssociationTraversal.h"

#include "host/server/CimError.h"
#include "host/server/PathIdentity.h"

#include "base/Ascii.h"

#include <algorithm>
#include <iterator>
#include <set>
#include <utility>

namespace cmpihost::server {

namespace {

/// Association classes of the standard that clients know by name and do without where they are not
/// supported; to them an empty answer means that nothing is tied.
constexpr const char* standardAssociations[] = {"CIM_ElementConformsToProfile",
                                                "CIM_ReferencedProfile"};

void requireKnownFilter(const Call& call, const std::optional<std::string>& className) {
    if (!className || call.manager.knowsClass(call.nameSpace, *className)) return;
    for (const char* const known : standardAssociations) {
        if (base::equalsIgnoreCase(known, *className))
            throw CimError(cimNotSupported,
                           std::string(known) + ": not served in " + call.nameSpace);
    }
    throw CimError(cimInvalidParameter, *className + ": no such class in " + call.nameSpace);
}

bool canBeARole(const std::string& name) {
    const auto isLetter = [](char c) {
        return base::isAlpha(c) || c == '_' || static_cast<unsigned char>(c) >= 0x80;
    };
    return !name.empty() && isLetter(name.front()) &&
           std::all_of(name.begin(), name.end(),
                       [&](char c) { return isLetter(c) || base::isDigit(c); });
}

void requireRole(const std::optional<std::string>& role) {
    if (role && !canBeARole(*role))
        throw CimError(cimInvalidParameter, "\"" + *role + "\" is no name that a role can have");
}

}  // namespace

AssociationFilter associationFilter(const Call& call, Operation operation) {
    const Parameters& given = call.parameters;
    AssociationFilter filter;
    filter.role = given.text("Role");
    if (isReferenceOperation(operation)) {
        filter.association = given.className("ResultClass");
    } else {
        filter.association = given.className("AssocClass");
        filter.farRole = given.text("ResultRole");
        filter.farClass = given.className("ResultClass");
    }
    requireKnownFilter(call, filter.association);
    requireKnownFilter(call, filter.farClass);
    requireRole(filter.role);
    requireRole(filter.farRole);
    return filter;
}

std::string sourceClass(const Call& call, std::string_view parameter) {
    const std::string name = call.parameters.path(parameter)->className;
    if (!call.manager.knowsClass(call.nameSpace, name))
        throw CimError(cimInvalidParameter, name + ": no such class in " + call.nameSpace);
    return call.manager.spelling(call.nameSpace, name);
}

namespace {

ObjectPathValue sourcePath(const Call& call, std::string_view parameter) {
    RequestPath given = *call.parameters.path(parameter);
    given.className = sourceClass(call, parameter);
    given.nameSpace = call.nameSpace;
    ObjectPathValue path = typedPath(given, call.manager.catalogue(call.nameSpace), call.nameSpace);
    if (path.keys.empty())
        throw CimError(cimInvalidParameter, path.className + ": the path names no instance");
    return path;
}

/// An association operation from an instance.
class Traversal {
  public:
    Traversal(const Call& call, std::string_view sourceParameter, Operation operation)
        : call_(call),
          operation_(operation),
          source_(sourcePath(call, sourceParameter)),
          filter_(associationFilter(call, operation)) {}

    OperationResult answer();

  private:
    bool sourceExists();
    OperationResult asked(const Tie& tie) const;
    OperationResult answerOf(const Tie& tie) const;
    OperationRequest requestTo(const Tie& tie) const;
    OperationResult enumeratedReferences(const Tie& tie) const;
    bool refersToSource(const Tie& tie, const std::string& role, const Value& value) const;
    bool fits(const Tie& tie, const std::string& className) const;
    template <class Element>
    void keep(const Tie& tie, std::vector<Element>& kept, std::vector<Element>& found);

    const Call& call_;
    const Operation operation_;
    const ObjectPathValue source_;
    const AssociationFilter filter_;
    /// By pathIdentity: the source in the client's words and in those of its provider, which may
    /// compare some keys without case; and what has been found.
    std::set<std::string> sourceNames_{};
    std::set<std::string> seen_{};
};

const ObjectPathValue& namingPath(const ObjectPathValue& path) {
    return path;
}
const ObjectPathValue& namingPath(const InstanceValue& instance) {
    return instance.path;
}

OperationResult Traversal::answer() {
    OperationResult all;
    if (!sourceExists()) return all;
    for (const Tie& tie : tiesOf(call_.manager, call_.nameSpace, source_.className, filter_)) {
        OperationResult found = asked(tie);
        keep(tie, all.paths, found.paths);
        keep(tie, all.instances, found.instances);
    }
    return all;
}

/// Providers look at some of the keys only, and would answer for an object that is not there. Of a
/// class whose instances nobody serves, nobody can tell.
bool Traversal::sourceExists() {
    OperationRequest request;
    request.operation = Operation::GetInstance;
    request.path = source_;
    request.context.principal = call_.user;
    sourceNames_.insert(pathIdentity(source_, call_.nameSpace));
    try {
        const InstanceValue found = gottenInstance(call_.manager, request);
        sourceNames_.insert(pathIdentity(found.path, call_.nameSpace));
        return true;
    } catch (const CimError& error) {
        if (error.code() == cimNotFound)
            return !call_.manager.hasInstanceProvider(call_.nameSpace, source_.className);
        if (error.code() == cimNotSupported) return true;
        throw;
    }
}

/// An association that may have nothing to do with the source may refuse it.
OperationResult Traversal::asked(const Tie& tie) const {
    try {
        return answerOf(tie);
    } catch (const CimError& error) {
        const bool refused = error.code() == cimInvalidParameter || error.code() == cimInvalidClass;
        if (refused && !tie.certain && !tie.ways.empty()) return {};
        throw CimError(error.code(), "the provider of " + tie.association + ": " + error.what());
    }
}

OperationResult Traversal::answerOf(const Tie& tie) const {
    if (!isReferenceOperation(operation_)) return call_.manager.ask(requestTo(tie));
    try {
        return call_.manager.ask(requestTo(tie));
    } catch (const CimError& error) {
        const bool enumerable = call_.manager.hasInstanceProvider(call_.nameSpace, tie.association);
        if (error.code() != cimNotSupported || !enumerable) throw;
    }
    return enumeratedReferences(tie);
}

OperationRequest Traversal::requestTo(const Tie& tie) const {
    OperationRequest request;
    request.operation = operation_;
    request.path = source_;
    request.context.principal = call_.user;
    (isReferenceOperation(operation_) ? request.resultClass : request.assocClass) = tie.association;
    request.exactAssociation = true;
    if (!yieldsPaths(operation_)) {
        request.properties = call_.parameters.names("PropertyList");
        if (call_.parameters.flag("IncludeClassOrigin", false))
            request.context.flags |= CMPI_FLAG_IncludeClassOrigin;
    }
    request.role = filter_.role;
    request.resultRole = filter_.farRole;
    // In the schema's spelling, for those who compare with case.
    if (!tie.ways.empty()) {
        if (request.role) request.role = tie.ways.front().near->name;
        if (request.resultRole) request.resultRole = tie.ways.front().far->name;
    }
    return request;
}

/// For providers that refuse references: of the instances of the association those that have the
/// source at a near end.
OperationResult Traversal::enumeratedReferences(const Tie& tie) const {
    OperationRequest request;
    request.operation =
        yieldsPaths(operation_) ? Operation::EnumerateInstanceNames : Operation::EnumerateInstances;
    request.path = {call_.nameSpace, tie.association};
    request.context.principal = call_.user;
    OperationResult all = call_.manager.ask(request);
    OperationResult ours;
    const auto refers = [&](const auto& named) {
        return refersToSource(tie, named.name, named.value);
    };
    const auto anyRefers = [&](const auto& items) {
        return std::any_of(items.begin(), items.end(), refers);
    };
    std::copy_if(all.paths.begin(), all.paths.end(), std::back_inserter(ours.paths),
                 [&](const ObjectPathValue& path) { return anyRefers(path.keys); });
    std::copy_if(all.instances.begin(), all.instances.end(), std::back_inserter(ours.instances),
                 [&](const InstanceValue& instance) {
                     return anyRefers(instance.path.keys) || anyRefers(instance.properties);
                 });
    return ours;
}

bool Traversal::refersToSource(const Tie& tie, const std::string& role, const Value& value) const {
    if (value.type() != CMPI_ref || value.isNull()) return false;
    const auto isNear = [&](const AssociationWay& way) {
        return base::equalsIgnoreCase(way.near->name, role);
    };
    const bool near = tie.ways.empty()
                          ? !filter_.role || base::equalsIgnoreCase(*filter_.role, role)
                          : std::any_of(tie.ways.begin(), tie.ways.end(), isNear);
    return near && sourceNames_.count(pathIdentity(value.reference(), call_.nameSpace)) != 0;
}

/// Whether a result of that class is one that was asked for.
bool Traversal::fits(const Tie& tie, const std::string& className) const {
    const auto isA = [&](const std::string& ancestor) {
        return call_.manager.isA(call_.nameSpace, className, ancestor);
    };
    if (isReferenceOperation(operation_)) return isA(tie.association);
    if (filter_.farClass && !isA(*filter_.farClass)) return false;
    const ClassCatalogue& catalogue = call_.manager.catalogue(call_.nameSpace);
    return tie.ways.empty() ||
           std::any_of(tie.ways.begin(), tie.ways.end(), [&](const AssociationWay& way) {
               return classRelation(&catalogue, className, way.far->referenceClass) !=
                      ClassRelation::Unrelated;
           });
}

template <class Element>
void Traversal::keep(const Tie& tie, std::vector<Element>& kept, std::vector<Element>& found) {
    for (Element& element : found) {
        const ObjectPathValue& path = namingPath(element);
        if (!fits(tie, path.className)) continue;
        if (!seen_.insert(pathIdentity(path, call_.nameSpace)).second) continue;
        kept.push_back(std::move(element));
    }
}

}  // namespace

OperationResult traversed(const Call& call, std::string_view sourceParameter, Operation operation) {
    return Traversal(call, sourceParameter, operation).answer();
}

}  // namespace cmpihost::server
