// The face that the library shows to object managers: two factories, two function tables, and the
// handlers behind them. A handler decides nothing itself: it names a dispatch table, and serve()
// does what is common to all requests, their markers and their exceptions.
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <exception>
#include <iostream>  // its streams are ready before the first record needs one
#include <string>

#include "ProviderUtilities.h"
#include "RequestDispatch.h"
#include "Trace.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

[[gnu::visibility("default")]] extern const char COPYRIGHT[];
const char COPYRIGHT[] =
    "OperatingSystemProvider 1.0.0, the operating system status profile for WBEM. "
    "Copyright (C) 2026 the OperatingSystemProvider authors. All rights reserved.";

static const std::string loggerOperatingSystemProvider("Zumbrel.OperatingSystemProvider");
static constexpr const char* sourceFile = "OperatingSystemProvider.cpp";
static constexpr UnitLog log(sourceFile, loggerOperatingSystemProvider);

// The broker that either factory was given last. Not guarded: factories run before requests.
static const CMPIBroker* broker = nullptr;

// Serves a request: finds the adapter for the class that `classSource`, a path or a class name,
// stands for, and walks it. An exception of the standard hierarchy leaves a message record and the
// status OK; others pass through, as do those from outside the walk. All records are the handler's
// own.
template <class ClassSource>
static CMPIStatus serve(Dispatch dispatch, ClassSource classSource, const HandlerRequest& request,
                        SourceLocation handler = SourceLocation::current()) {
    VA::markProviderEntry(loggerOperatingSystemProvider, sourceFile, handler.function,
                          handler.line);
    const unsigned short classId = VA::ProviderUtilities::getClassId(classSource);
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    log.variable("classId", classId, handler);
    if (const Walk walk = findWalk(dispatch, classId)) {
        try {
            walk(request);
        } catch (const std::exception& caught) {
            log.message(caught, handler);
        }
    } else {
        status.rc = CMPI_RC_ERR_INVALID_CLASS;
    }
    VA::markProviderExit(loggerOperatingSystemProvider, sourceFile, handler.function, handler.line);
    return status;
}

// Refuses an operation: the result is not touched.
static CMPIStatus refuse(SourceLocation handler = SourceLocation::current()) {
    log.method(handler);
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

static CMPIStatus OperatingSystem_Cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return {CMPI_RC_OK, nullptr};
}

static CMPIStatus OperatingSystem_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext* ctx,
                                                    const CMPIResult* rslt,
                                                    const CMPIObjectPath* op) {
    return serve(instanceDispatch, op, {broker, ctx, rslt, op, ResultKind::objectPaths, nullptr});
}

static CMPIStatus OperatingSystem_EnumInstances(CMPIInstanceMI*, const CMPIContext* ctx,
                                                const CMPIResult* rslt, const CMPIObjectPath* op,
                                                const char** properties) {
    return serve(instanceDispatch, op, {broker, ctx, rslt, op, ResultKind::instances, properties});
}

// The keys of the path have the adapter stand on the one element that they name; when they name
// none, nothing is returned and the status is OK.
static CMPIStatus OperatingSystem_GetInstance(CMPIInstanceMI*, const CMPIContext* ctx,
                                              const CMPIResult* rslt, const CMPIObjectPath* op,
                                              const char** properties) {
    return serve(instanceDispatch, op, {broker, ctx, rslt, op, ResultKind::instances, properties});
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
    return serve(associatorDispatch, assocClass,
                 {broker, ctx, rslt, op, ResultKind::instances, properties});
}

static CMPIStatus OperatingSystem_AssociatorNames(CMPIAssociationMI*, const CMPIContext* ctx,
                                                  const CMPIResult* rslt, const CMPIObjectPath* op,
                                                  const char* assocClass, const char*, const char*,
                                                  const char*) {
    return serve(associatorDispatch, assocClass,
                 {broker, ctx, rslt, op, ResultKind::objectPaths, nullptr});
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
// version says that this library does not have them.
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
