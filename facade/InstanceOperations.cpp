// Requests for instances. The provider answers a path by some of its keys, and returns OK without
// an instance when there is none: whether all keys name the instance, and which key does not, is
// found out here.
#include <algorithm>

#include "CimError.h"
#include "Operations.h"
#include "base/Ascii.h"
#include "base/CmpiText.h"

namespace VA::OSStatusFacade {

namespace {

using CanonicalPaths = std::vector<CanonicalPath>;

// The path of a request for an instance as the provider is asked for it, from keys without a
// problem: its text keys in their order, which has a meaning to the provider, and the references
// left out, which keeps the provider from judging them. What comes back is compared anyway.
CMPIObjectPath* pathToAskFor(const ClientRequest& request, const Class& cimClass,
                             const std::vector<KeyBinding>& bindings) {
    CMPIObjectPath* const path = request.newPath(cimClass.name);
    for (const ClassKey& key : cimClass.keys) {
        for (const KeyBinding& binding : bindings) {
            if (key.isReference || !base::equalsIgnoreCase(binding.name, key.name)) continue;
            const CMPIStatus status = path->ft->addKey(
                path, key.name, base::charsArgument(binding.text()->c_str()), CMPI_chars);
            if (status.rc != CMPI_RC_OK) {
                throw CimError(CMPI_RC_ERR_FAILED, "the object manager does not take a key");
            }
        }
    }
    return path;
}

bool hasKey(const CanonicalPath& candidate, const std::pair<std::string, std::string>& key) {
    return std::find(candidate.keys.begin(), candidate.keys.end(), key) != candidate.keys.end();
}

// Names the keys that no instance has, or all of them when instances have each, but none has all.
CimError notFound(const Class& cimClass, const CanonicalPath& wanted,
                  const CanonicalPaths& candidates) {
    std::string all;
    std::string unknown;
    for (const ClassKey& key : cimClass.keys) {
        const std::string name = std::string(all.empty() ? "" : ", ") + key.name;
        all += name;
        const auto wantedKey = std::find_if(
            wanted.keys.begin(), wanted.keys.end(),
            [&key](const auto& each) { return base::equalsIgnoreCase(each.first, key.name); });
        // canonicalPathOf() read the path again: the broker may have given other keys this time.
        if (wantedKey == wanted.keys.end() ||
            std::none_of(candidates.begin(), candidates.end(), [&](const CanonicalPath& candidate) {
                return hasKey(candidate, *wantedKey);
            })) {
            unknown += std::string(unknown.empty() ? "" : ", ") + key.name;
        }
    }
    return CimError(CMPI_RC_ERR_NOT_FOUND, std::string("no instance of ") + cimClass.name +
                                               " has this " + (unknown.empty() ? all : unknown));
}

}  // namespace

void enumerateInstanceNames(const ClientRequest& request) {
    const ResultCollector answer = request.enumerateInstanceNames(request.path());
    requireWhole(answer, request.className());
    request.returnPaths(answer.paths());
}

void enumerateInstances(const ClientRequest& request, const char** properties) {
    const ResultCollector answer = request.enumerateInstances(request.path());
    requireWhole(answer, request.className());
    request.returnInstances(answer.instances(), properties);
}

void getInstance(const ClientRequest& request, const char** properties) {
    const Class* const known = request.knownClass();
    // The provider is asked all the same: its status is the client's, and its records show the
    // request. It refuses such a class; nothing it could return would be known here.
    if (known == nullptr || !known->servedByProvider) {
        return requireServed(request.getInstance(request.path()), request.className());
    }
    // An object manager may give other keys when it is asked again: the provider gets those that
    // were checked.
    const std::vector<KeyBinding> bindings = keysOf(request.path());
    const std::string problem = keyProblem(*known, bindings);
    if (!problem.empty()) throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, problem);

    const CanonicalPath wanted = request.canonicalPathOf(request.path());
    const ResultCollector answer = request.getInstance(pathToAskFor(request, *known, bindings));
    requireServed(answer, request.className());
    CanonicalPaths candidates;
    for (const CMPIInstance* instance : answer.instances()) {
        candidates.push_back(request.canonicalPathOf(pathOf(instance)));
        if (candidates.back() == wanted) return request.returnInstances({instance}, properties);
    }
    requireWhole(answer, known->name);
    // The provider returned only elements that have some of the keys. Which key names none is found
    // among all of them.
    if (!known->isAssociation()) {
        const ResultCollector names = request.enumerateInstanceNames(request.newPath(known->name));
        requireWhole(names, known->name);
        for (const CMPIObjectPath* path : names.paths()) {
            candidates.push_back(request.canonicalPathOf(path));
        }
    }
    throw notFound(*known, wanted, candidates);
}

}  // namespace VA::OSStatusFacade
