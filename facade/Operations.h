#ifndef FACADE_OPERATIONS_H
#define FACADE_OPERATIONS_H

#include "ClientRequest.h"

// What a client may ask. Each operation answers one request, or throws CimError.

namespace VA::OSStatusFacade {

void enumerateInstanceNames(const ClientRequest& request);
void enumerateInstances(const ClientRequest& request, const char** properties);

/// The one instance that all keys name.
void getInstance(const ClientRequest& request, const char** properties);

/// What a client wants of the associations of a source; null filters nothing.
struct AssociationFilter {
    const char* associationClass = nullptr;
    const char* farClass = nullptr;
    const char* role = nullptr;
    const char* farRole = nullptr;
};

// The pairs that the provider enumerates are the truth: what is returned is the other end, or the
// pair itself, of each pair that has the source at one end. A source that is at no end, or filters
// that admit nothing, give an empty answer.
//
// A question to the object manager for computer systems is the expensive part. Each association
// with the computer system that is looked at costs one, asked by the provider; associators that
// lead to computer systems cost one more, for the instances. Names of them, and all other
// instances, need none.

void associatorNames(const ClientRequest& request, const AssociationFilter& filter);
void associators(const ClientRequest& request, const AssociationFilter& filter,
                 const char** properties);
void referenceNames(const ClientRequest& request, const AssociationFilter& filter);
void references(const ClientRequest& request, const AssociationFilter& filter,
                const char** properties);

}  // namespace VA::OSStatusFacade

#endif
