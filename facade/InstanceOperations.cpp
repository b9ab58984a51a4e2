// Requests for instances. The provider answers a path by some of its keys and tells of nothing that
// is not there: whether all keys name the instance, and which key does not, is found out here.

#include <algorithm>

#include "Operations.h"
#include "Refusal.h"
#include "base/Ascii.h"

namespace VA::OSStatusFacade {

namespace {

using Identities = std::vector<Identity>;

// The path of a request for an instance as the provider is asked for it, from keys without a
// problem: its text keys in their order, which has a meaning to the provider, and the references
// left out, which keeps the provider from judging them. What comes back is compared anyway.
CMPIObjectPath* pathToAskFor(const ClientRequest& request, const Class& cimClass,
                             const std::vector<KeyBinding>& bindings) {
    CMPIObjectPath* const path = request.newPath(cimClass.name);
    for (const Key& key : cimClass.keys)
        for (const KeyBinding& binding : bindings) {
            if (key.isReference || !base::equalsIgnoreCase(binding.name, key.name)) continue;
            // Of characters, brokers take the pointer itself, not the address of one.
            const CMPIStatus status = path->ft->addKey(
                path, key.name, reinterpret_cast<const CMPIValue*>(binding.text()->c_str()),
                CMPI_chars);
            if (status.rc != CMPI_RC_OK)
                throw Refusal(CMPI_RC_ERR_FAILED, "the object manager does not take a key");
        }
    return path;
}

bool hasKey(const Identity& candidate, const std::pair<std::string, std::string>& key) {
    return std::find(candidate.keys.begin(), candidate.keys.end(), key) != candidate.keys.end();
}

// Names the keys that no instance has, or all of them when instances have each, but none has all.
Refusal notFound(const Class& cimClass, const Identity& wanted, const Identities& candidates) {
    std::string all;
    std::string unknown;
    for (const Key& key : cimClass.keys) {
        const std::string name = std::string(all.empty() ? "" : ", ") + key.name;
        all += name;
        const auto wantedKey = std::find_if(
            wanted.keys.begin(), wanted.keys.end(),
            [&key](const auto& each) { return base::equalsIgnoreCase(each.first, key.name); });
        // The identity is of a reading of its own.
        if (wantedKey == wanted.keys.end() ||
            std::none_of(candidates.begin(), candidates.end(),
                         [&](const Identity& candidate) { return hasKey(candidate, *wantedKey); }))
            unknown += std::string(unknown.empty() ? "" : ", ") + key.name;
    }
    return Refusal(CMPI_RC_ERR_NOT_FOUND, std::string("no instance of ") + cimClass.name +
                                              " has this " + (unknown.empty() ? all : unknown));
}

}  // namespace

void enumerateInstanceNames(const ClientRequest& request) {
    const Answer answer = request.enumerateInstanceNames(request.path());
    requireWhole(answer, request.className());
    request.returnPaths(answer.paths());
}

void enumerateInstances(const ClientRequest& request, const char** properties) {
    const Answer answer = request.enumerateInstances(request.path());
    requireWhole(answer, request.className());
    request.returnInstances(answer.instances(), properties);
}

void getInstance(const ClientRequest& request, const char** properties) {
    const Class* const known = request.knownClass();
    if (known == nullptr || !known->servedByProvider)
        return requireServed(request.getInstance(request.path()), request.className());
    // An object manager may tell other keys the second time that it is asked: the provider gets
    // those that were checked.
    const std::vector<KeyBinding> bindings = keysOf(request.path());
    const std::string problem = keyProblem(*known, bindings);
    if (!problem.empty()) throw Refusal(CMPI_RC_ERR_INVALID_PARAMETER, problem);

    const Identity wanted = request.identityOf(request.path());
    const Answer answer = request.getInstance(pathToAskFor(request, *known, bindings));
    requireServed(answer, request.className());
    Identities candidates;
    for (const CMPIInstance* instance : answer.instances()) {
        candidates.push_back(request.identityOf(pathOf(instance)));
        if (candidates.back() == wanted) return request.returnInstances({instance}, properties);
    }
    requireWhole(answer, known->name);
    // The provider tells of elements only those that have some of the keys.
    if (!known->isAssociation()) {
        const Answer names = request.enumerateInstanceNames(request.newPath(known->name));
        requireWhole(names, known->name);
        for (const CMPIObjectPath* path : names.paths())
            candidates.push_back(request.identityOf(path));
    }
    throw notFound(*known, wanted, candidates);
}

}  // namespace VA::OSStatusFacade
