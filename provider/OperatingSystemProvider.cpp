#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <algorithm>
#include <exception>
#include <iostream>
#include <string>

#include "CMPIElementCapabilities.h"
#include "CMPIInstalledOS.h"
#include "CMPIOperatingSystem.h"
#include "CMPIOperatingSystemCapabilities.h"
#include "CMPIRunningOS.h"
#include "ClassIds.h"
#include "ProviderUtilities.h"
#include "RequestWalk.h"
#include "Trace.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

[[gnu::visibility("default")]] extern const char COPYRIGHT[];
const char COPYRIGHT[] =
    "OperatingSystemProvider 1.0.0, the operating system status profile for WBEM. "
    "Copyright (C) 2026 the OperatingSystemProvider authors. All rights reserved.";

static const std::string loggerOperatingSystemProvider("Zumbrel.OperatingSystemProvider");
static constexpr const char* sourceFile = "OperatingSystemProvider.cpp";
static constexpr UnitLog records(sourceFile, loggerOperatingSystemProvider);

// The broker that either factory was given last. Not guarded: factories run before requests.
static const CMPIBroker* broker = nullptr;

// The adapters that serve requests for instances, and those that serve associators.
template <class Operation>
static constexpr DispatchRow instanceDispatch[] = {
    {operatingSystemId, walk<CMPIOperatingSystem, Operation>},
    {operatingSystemCapabilitiesId, walk<CMPIOperatingSystemCapabilities, Operation>},
    {installedOSId, walk<CMPIInstalledOS, Operation>},
    {runningOSId, walk<CMPIRunningOS, Operation>},
    {elementCapabilitiesId, walk<CMPIOSElementCapabilities, Operation>},
};

template <class Operation>
static constexpr DispatchRow associationDispatch[] = {
    {runningOSId, walk<CMPIRunningOS, Operation>},
    {elementCapabilitiesId, walk<CMPIOSElementCapabilities, Operation>},
    {installedOSId, walk<CMPIInstalledOS, Operation>},
};

// Serves a request: finds the adapter for the class that `classSource`, a path or a class name,
// stands for, and walks it. An exception of the standard hierarchy leaves a message record and the
// status OK; others pass through, as do those from outside the walk. All records are the handler's
// own.
template <class ClassSource, std::size_t rowCount>
static CMPIStatus serve(const DispatchRow (&dispatch)[rowCount], ClassSource classSource,
                        const Request& request, Caller handler = Caller::here()) {
    VA::markProviderEntry(loggerOperatingSystemProvider, sourceFile, handler.function,
                          handler.line);
    const unsigned short classId = VA::ProviderUtilities::getClassId(classSource);
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    records.variable("classId", classId, handler);
    const DispatchRow* row =
        std::find_if(dispatch, dispatch + rowCount,
                     [classId](const DispatchRow& each) { return each.classId == classId; });
    if (row == dispatch + rowCount) {
        status.rc = CMPI_RC_ERR_INVALID_CLASS;
    } else {
        try {
            row->walk(request);
        } catch (const std::exception& caught) {
            records.message(caught, handler);
        }
    }
    VA::markProviderExit(loggerOperatingSystemProvider, sourceFile, handler.function, handler.line);
    return status;
}

// Refuses an operation: the result is not touched.
static CMPIStatus refuse(Caller handler = Caller::here()) {
    const CMPIStatus status = {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
    records.method(handler);
    return status;
}

static CMPIStatus OperatingSystem_Cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return {CMPI_RC_OK, nullptr};
}

static CMPIStatus OperatingSystem_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext* ctx,
                                                    const CMPIResult* rslt,
                                                    const CMPIObjectPath* op) {
    return serve(instanceDispatch<ObjectPaths>, op, {broker, ctx, rslt, op, nullptr});
}

static CMPIStatus OperatingSystem_EnumInstances(CMPIInstanceMI*, const CMPIContext* ctx,
                                                const CMPIResult* rslt, const CMPIObjectPath* op,
                                                const char** properties) {
    return serve(instanceDispatch<Instances>, op, {broker, ctx, rslt, op, properties});
}

// The keys of the path have the adapter stand on the one element that they name; when they name
// none, nothing is returned and the status is OK.
static CMPIStatus OperatingSystem_GetInstance(CMPIInstanceMI*, const CMPIContext* ctx,
                                              const CMPIResult* rslt, const CMPIObjectPath* op,
                                              const char** properties) {
    return serve(instanceDispatch<Instances>, op, {broker, ctx, rslt, op, properties});
}

static CMPIStatus OperatingSystem_CreateInstance(CMPIInstanceMI*, const CMPIContext*,
                                                 const CMPIResult*, const CMPIObjectPath*,
                                                 const CMPIInstance*) {
    return refuse();
}

static CMPIStatus OperatingSystem_ModifyInstance(CMPIInstanceMI*, const CMPIContext*,
                                                 const CMPIResult*, const CMPIObjectPath*,
                                                 const CMPIInstance*, const char**) {
    return refuse();
}

static CMPIStatus OperatingSystem_DeleteInstance(CMPIInstanceMI*, const CMPIContext*,
                                                 const CMPIResult*, const CMPIObjectPath*) {
    return refuse();
}

static CMPIStatus OperatingSystem_ExecQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                            const CMPIObjectPath*, const char*, const char*) {
    return refuse();
}

static CMPIStatus OperatingSystem_AssociationCleanup(CMPIAssociationMI*, const CMPIContext*,
                                                     CMPIBoolean) {
    return {CMPI_RC_OK, nullptr};
}

// Result class and roles have no effect: the association class alone decides.
static CMPIStatus OperatingSystem_Associators(CMPIAssociationMI*, const CMPIContext* ctx,
                                              const CMPIResult* rslt, const CMPIObjectPath* op,
                                              const char* assocClass, const char*, const char*,
                                              const char*, const char** properties) {
    return serve(associationDispatch<Associators>, assocClass, {broker, ctx, rslt, op, properties});
}

static CMPIStatus OperatingSystem_AssociatorNames(CMPIAssociationMI*, const CMPIContext* ctx,
                                                  const CMPIResult* rslt, const CMPIObjectPath* op,
                                                  const char* assocClass, const char*, const char*,
                                                  const char*) {
    return serve(associationDispatch<AssociatorNames>, assocClass,
                 {broker, ctx, rslt, op, nullptr});
}

static CMPIStatus OperatingSystem_References(CMPIAssociationMI*, const CMPIContext*,
                                             const CMPIResult*, const CMPIObjectPath*, const char*,
                                             const char*, const char**) {
    return refuse();
}

static CMPIStatus OperatingSystem_ReferenceNames(CMPIAssociationMI*, const CMPIContext*,
                                                 const CMPIResult*, const CMPIObjectPath*,
                                                 const char*, const char*) {
    return refuse();
}

// Headers of a later level may have more slots at the ends of the tables: these stay null, and the
// version tells that they are none of this library's.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wmissing-field-initializers"

static const CMPIInstanceMIFT instMIFT__ = {
    CMPIVersion200,
    CMPIVersion200,
    "instanceOperatingSystemProvider",
    OperatingSystem_Cleanup,
    OperatingSystem_EnumInstanceNames,
    OperatingSystem_EnumInstances,
    OperatingSystem_GetInstance,
    OperatingSystem_CreateInstance,
    OperatingSystem_ModifyInstance,
    OperatingSystem_DeleteInstance,
    OperatingSystem_ExecQuery,
};

static const CMPIAssociationMIFT assocMIFT__ = {
    CMPIVersion200,
    CMPIVersion200,
    "associationOperatingSystemProvider",
    OperatingSystem_AssociationCleanup,
    OperatingSystem_Associators,
    OperatingSystem_AssociatorNames,
    OperatingSystem_References,
    OperatingSystem_ReferenceNames,
};

#pragma GCC diagnostic pop

}  // namespace VA::OSStatusProvider

extern "C" {

// Each factory stores the broker, whichever is called later, and returns its one record. The status
// is never written. Records point to their tables as if these could be written; object managers
// only read them, and they lie in memory that is read-only after loading.

[[gnu::visibility("default")]] CMPIInstanceMI* OperatingSystemProvider_Create_InstanceMI(
    const CMPIBroker* broker, const CMPIContext*, CMPIStatus*) {
    static CMPIInstanceMI mi = {nullptr,
                                const_cast<CMPIInstanceMIFT*>(&VA::OSStatusProvider::instMIFT__)};
    VA::OSStatusProvider::broker = broker;
    return &mi;
}

[[gnu::visibility("default")]] CMPIAssociationMI* OperatingSystemProvider_Create_AssociationMI(
    const CMPIBroker* broker, const CMPIContext*, CMPIStatus*) {
    static CMPIAssociationMI mi = {
        nullptr, const_cast<CMPIAssociationMIFT*>(&VA::OSStatusProvider::assocMIFT__)};
    VA::OSStatusProvider::broker = broker;
    return &mi;
}
}
