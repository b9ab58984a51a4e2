#ifndef OSSTATUS_FACADE_INSTANCE_REQUESTS_H
#define OSSTATUS_FACADE_INSTANCE_REQUESTS_H

#include "Request.h"

namespace VA::OSStatusFacade {

// Each answers one request, or throws Refusal.

void enumerateInstanceNames(const Request& request);
void enumerateInstances(const Request& request, const char** properties);

/// The one instance that all keys name.
void getInstance(const Request& request, const char** properties);

}  // namespace VA::OSStatusFacade

#endif
