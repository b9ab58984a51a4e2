#ifndef PROVIDER_REQUEST_DISPATCH_H
#define PROVIDER_REQUEST_DISPATCH_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include "CMPIElementCapabilities.h"
#include "CMPIInstalledOS.h"
#include "CMPIOperatingSystem.h"
#include "CMPIOperatingSystemCapabilities.h"
#include "CMPIRunningOS.h"
#include "ClassIds.h"
#include "base/Span.h"

// How a request finds its adapter, and how an adapter is walked. A request for instances names the
// adapter by the class of its path, and gets the elements of that class. A request for associators
// names it by the association class; the path is then one end, and it gets what is at the other.

namespace VA::OSStatusProvider {

/// What a request is to be answered with.
enum class ResultKind { objectPaths, instances };

/// What a handler was called with, as far as a walk needs it.
struct HandlerRequest {
    const CMPIBroker* broker;
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* objectPath;
    ResultKind resultKind;
    const char** properties;  ///< the client's list, null for object paths
};

/// Gives a path or an instance to the result; what the result says of it is ignored. False for
/// null, which is not given: object managers do not survive it.
inline bool returnResult(const HandlerRequest& request, const CMPIObjectPath* path) {
    if (path == nullptr) return false;
    request.result->ft->returnObjectPath(request.result, path);
    return true;
}

inline bool returnResult(const HandlerRequest& request, const CMPIInstance* instance) {
    if (instance == nullptr) return false;
    request.result->ft->returnInstance(request.result, instance);
    return true;
}

/// Fetches the adapter's current element and returns it; false when there is none to return.
template <class Adapter>
bool returnElement(const HandlerRequest& request, Adapter& adapter) {
    // The broker may give another class for the path when the adapter asks it again.
    // CMPIOSElementCapabilities would then return pairs for ever.
    if (!adapter.enumerates()) return false;
    return request.resultKind == ResultKind::objectPaths
               ? returnResult(request, adapter.getObjectPath())
               : returnResult(request, adapter.getCMPIInstance(request.properties));
}

/// The same for what is at the far end of the adapter's association.
template <class Adapter>
bool returnFarEnd(const HandlerRequest& request, Adapter& adapter) {
    return request.resultKind == ResultKind::objectPaths
               ? returnResult(request, adapter.getAssociatorNames())
               : returnResult(request, adapter.getAssociator(request.properties));
}

/// Builds the adapter, returns what it stands on until it ends, and reports the end. A null ends
/// the walk too: a CMPIOSElementCapabilities from a class that is no end of the association has no
/// other end.
template <class Adapter, bool (*returnCurrent)(const HandlerRequest&, Adapter&)>
void walk(const HandlerRequest& request) {
    Adapter adapter(request.broker, request.context, request.objectPath);
    while (adapter && returnCurrent(request, adapter)) ++adapter;
    request.result->ft->returnDone(request.result);
}

using Walk = void (*)(const HandlerRequest& request);

/// A class id, and the walk that serves requests for it.
struct DispatchRow {
    unsigned short classId;
    Walk walk;
};
using Dispatch = base::Span<const DispatchRow>;

/// By the class of the request's path.
constexpr DispatchRow instanceDispatch[] = {
    {operatingSystemId, walk<CMPIOperatingSystem, returnElement>},
    {operatingSystemCapabilitiesId, walk<CMPIOperatingSystemCapabilities, returnElement>},
    {installedOSId, walk<CMPIInstalledOS, returnElement>},
    {runningOSId, walk<CMPIRunningOS, returnElement>},
    {elementCapabilitiesId, walk<CMPIOSElementCapabilities, returnElement>},
};

/// By the association class that the request names. Asked only by object managers that load the
/// provider itself: the facade answers associators from the pairs that instanceDispatch returns.
constexpr DispatchRow associatorDispatch[] = {
    {runningOSId, walk<CMPIRunningOS, returnFarEnd>},
    {elementCapabilitiesId, walk<CMPIOSElementCapabilities, returnFarEnd>},
    {installedOSId, walk<CMPIInstalledOS, returnFarEnd>},
};

/// Null for a class that is not served.
inline Walk findWalk(Dispatch dispatch, unsigned short classId) {
    for (const DispatchRow& row : dispatch) {
        if (row.classId == classId) return row.walk;
    }
    return nullptr;
}

}  // namespace VA::OSStatusProvider

#endif
