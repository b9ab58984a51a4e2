// Requests about associations, answered from the pairs that the provider enumerates: its own
// associators follow the first key that fits and know no filters, and it refuses references.
#include <map>
#include <set>

#include "CimError.h"
#include "Operations.h"
#include "base/Ascii.h"

namespace VA::OSStatusFacade {

namespace {

/// A way from the source over one association.
struct Traversal {
    const Class& association;
    const AssociationEnd& near;
    const AssociationEnd& far;
};

bool isGiven(const char* filter) {
    return filter != nullptr && *filter != '\0';
}

bool admits(const char* filter, const Class& cimClass) {
    return !isGiven(filter) || cimClass.isA(filter);
}

bool admits(const char* filter, const char* role) {
    return !isGiven(filter) || base::equalsIgnoreCase(filter, role);
}

// The ways that a source of that class has. None from a path that can name no instance.
std::vector<Traversal> traversalsFrom(const ClientRequest& request,
                                      const AssociationFilter& filter) {
    std::vector<Traversal> traversals;
    const Class* const source = request.knownClass();
    if (source == nullptr || !keyProblem(*source, keysOf(request.path())).empty()) {
        return traversals;
    }
    for (const Association& association : associations()) {
        for (const int near : {0, 1}) {
            const Traversal traversal = {association.associationClass, association.ends[near],
                                         association.ends[1 - near]};
            if (&traversal.near.elements == source &&
                admits(filter.associationClass, traversal.association) &&
                admits(filter.farClass, traversal.far.elements) &&
                admits(filter.role, traversal.near.role) &&
                admits(filter.farRole, traversal.far.role)) {
                traversals.push_back(traversal);
            }
        }
    }
    return traversals;
}

/// A pair that has the source at its near end.
struct Pair {
    const Class& farClass;
    const CMPIObjectPath* path;
    const CMPIObjectPath* far;
    const CMPIInstance* instance;  ///< null where only names were asked for
};

// Adds the pair that a path names, if the source is at its near end. One without a far end, or
// whose far end has no keys, ties the source to nothing.
void addPair(std::vector<Pair>& pairs, const ClientRequest& request, const Traversal& traversal,
             const CanonicalPath& source, const CMPIObjectPath* path,
             const CMPIInstance* instance) {
    const CMPIObjectPath* const near = referenceOf(path, traversal.near.role);
    const CMPIObjectPath* const far = referenceOf(path, traversal.far.role);
    if (near == nullptr || far == nullptr || keysOf(far).empty()) return;
    if (request.canonicalPathOf(near) == source) {
        pairs.push_back({traversal.far.elements, path, far, instance});
    }
}

enum class ResultKind { objectPaths, instances };

std::vector<Pair> pairsOf(const ClientRequest& request, const AssociationFilter& filter,
                          ResultKind kind) {
    std::vector<Pair> pairs;
    const std::vector<Traversal> traversals = traversalsFrom(request, filter);
    if (traversals.empty()) return pairs;
    const CanonicalPath source = request.canonicalPathOf(request.path());
    for (const Traversal& traversal : traversals) {
        const CMPIObjectPath* const classPath = request.newPath(traversal.association.name);
        const ResultCollector answer = kind == ResultKind::objectPaths
                                           ? request.enumerateInstanceNames(classPath)
                                           : request.enumerateInstances(classPath);
        requireWhole(answer, traversal.association.name);
        for (const CMPIObjectPath* path : answer.paths()) {
            addPair(pairs, request, traversal, source, path, nullptr);
        }
        for (const CMPIInstance* instance : answer.instances()) {
            addPair(pairs, request, traversal, source, pathOf(instance), instance);
        }
    }
    return pairs;
}

/// What was returned already.
using Seen = std::set<CanonicalPath>;

using Paths = std::vector<const CMPIObjectPath*>;
using Instances = std::vector<const CMPIInstance*>;

// The computer systems, which another provider of the object manager serves.
Instances computerSystems(const ClientRequest& request, const Class& cimClass) {
    const CimError failure(CMPI_RC_ERR_FAILED,
                           std::string("the object manager does not enumerate ") + cimClass.name);
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIEnumeration* const enumeration = request.broker()->bft->enumerateInstances(
        request.broker(), request.context(), request.newPath(cimClass.name), nullptr, &status);
    if (enumeration == nullptr || status.rc != CMPI_RC_OK) throw failure;
    Instances instances;
    while (enumeration->ft->hasNext(enumeration, &status) != 0) {
        const CMPIData data = enumeration->ft->getNext(enumeration, &status);
        if (status.rc != CMPI_RC_OK || data.value.inst == nullptr) throw failure;
        instances.push_back(data.value.inst);
    }
    if (status.rc != CMPI_RC_OK) throw failure;
    return instances;
}

Instances instancesOf(const ClientRequest& request, const Class& cimClass) {
    if (!cimClass.servedByProvider) return computerSystems(request, cimClass);
    const ResultCollector answer = request.enumerateInstances(request.newPath(cimClass.name));
    requireWhole(answer, cimClass.name);
    return answer.instances();
}

/// Instances by what they stand for, fetched class by class when one is first looked for.
class InstanceIndex {
  public:
    explicit InstanceIndex(const ClientRequest& request) : request_(request) {}

    /// Null when there is no such instance any more.
    const CMPIInstance* find(const CanonicalPath& path, const Class& cimClass) {
        if (fetched_.insert(&cimClass).second) {
            for (const CMPIInstance* instance : instancesOf(request_, cimClass)) {
                instances_.emplace(request_.canonicalPathOf(pathOf(instance)), instance);
            }
        }
        const auto found = instances_.find(path);
        return found == instances_.end() ? nullptr : found->second;
    }

  private:
    const ClientRequest& request_;
    std::set<const Class*> fetched_;
    std::map<CanonicalPath, const CMPIInstance*> instances_;
};

// Returns one path of each pair, but each once.
void returnPathOfEach(const ClientRequest& request, const AssociationFilter& filter,
                      const CMPIObjectPath* Pair::*path) {
    Paths paths;
    Seen seen;
    for (const Pair& pair : pairsOf(request, filter, ResultKind::objectPaths)) {
        if (seen.insert(request.canonicalPathOf(pair.*path)).second) paths.push_back(pair.*path);
    }
    request.returnPaths(paths);
}

}  // namespace

void associatorNames(const ClientRequest& request, const AssociationFilter& filter) {
    returnPathOfEach(request, filter, &Pair::far);
}

void associators(const ClientRequest& request, const AssociationFilter& filter,
                 const char** properties) {
    Instances instances;
    InstanceIndex index(request);
    Seen seen;
    for (const Pair& pair : pairsOf(request, filter, ResultKind::objectPaths)) {
        const CanonicalPath far = request.canonicalPathOf(pair.far);
        if (!seen.insert(far).second) continue;
        if (const CMPIInstance* instance = index.find(far, pair.farClass)) {
            instances.push_back(instance);
        }
    }
    request.returnInstances(instances, properties);
}

void referenceNames(const ClientRequest& request, const AssociationFilter& filter) {
    returnPathOfEach(request, filter, &Pair::path);
}

void references(const ClientRequest& request, const AssociationFilter& filter,
                const char** properties) {
    Instances instances;
    Seen seen;
    for (const Pair& pair : pairsOf(request, filter, ResultKind::instances)) {
        if (seen.insert(request.canonicalPathOf(pair.path)).second) {
            instances.push_back(pair.instance);
        }
    }
    request.returnInstances(instances, properties);
}

}  // namespace VA::OSStatusFacade
