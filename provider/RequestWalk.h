#ifndef OSSTATUS_REQUEST_WALK_H
#define OSSTATUS_REQUEST_WALK_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

namespace VA::OSStatusProvider {

/// What a handler was called with, as far as a walk needs it.
struct Request {
    const CMPIBroker* broker;
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* objectPath;
    const char** properties;
};

/// Hands a path or an instance to the result; what the result says of it is ignored. False for
/// null, which is not handed over: object managers do not survive it.
inline bool handOver(const Request& request, const CMPIObjectPath* path) {
    if (path == nullptr) return false;
    request.result->ft->returnObjectPath(request.result, path);
    return true;
}

inline bool handOver(const Request& request, const CMPIInstance* instance) {
    if (instance == nullptr) return false;
    request.result->ft->returnInstance(request.result, instance);
    return true;
}

/// The operations: what each takes from an adapter for its current element. Requests for instances
/// take nothing where the broker told the adapter another class of its path than the handler.
struct ObjectPaths {
    template <class Adapter>
    static CMPIObjectPath* take(Adapter& adapter, const Request&) {
        return adapter.enumerates() ? adapter.getObjectPath() : nullptr;
    }
};

struct Instances {
    template <class Adapter>
    static CMPIInstance* take(Adapter& adapter, const Request& request) {
        return adapter.enumerates() ? adapter.getCMPIInstance(request.properties) : nullptr;
    }
};

struct AssociatorNames {
    template <class Adapter>
    static CMPIObjectPath* take(Adapter& adapter, const Request&) {
        return adapter.getAssociatorNames();
    }
};

struct Associators {
    template <class Adapter>
    static CMPIInstance* take(Adapter& adapter, const Request& request) {
        return adapter.getAssociator(request.properties);
    }
};

/// Builds the adapter, hands over what the operation takes from each of its elements, and reports
/// the end. A null from the adapter ends the walk.
template <class Adapter, class Operation>
void walk(const Request& request) {
    Adapter adapter(request.broker, request.context, request.objectPath);
    while (adapter && handOver(request, Operation::take(adapter, request))) ++adapter;
    request.result->ft->returnDone(request.result);
}

/// One row of a dispatch table: the class, and the walk that serves it.
struct DispatchRow {
    unsigned short classId;
    void (*walk)(const Request& request);
};

}  // namespace VA::OSStatusProvider

#endif
