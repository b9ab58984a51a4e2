// What object managers load in the provider's place: two factories, two function tables, and the
// handlers behind them. No exception leaves a handler, and every failure becomes a status.
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cxxabi.h>

#include <exception>
#include <string>

#include "CimError.h"
#include "Operations.h"
#include "Trace.h"
#include "base/SourceLocation.h"

// The factories of the provider behind the facade, as an object manager would call them: each
// returns its one record, with the broker that it was given last in use.
extern "C" {

CMPIInstanceMI* OperatingSystemProvider_Create_InstanceMI(const CMPIBroker* broker,
                                                          const CMPIContext* context,
                                                          CMPIStatus* status);
CMPIAssociationMI* OperatingSystemProvider_Create_AssociationMI(const CMPIBroker* broker,
                                                                const CMPIContext* context,
                                                                CMPIStatus* status);
}

namespace VA::OSStatusFacade {

using base::SourceLocation;

// As the last call of either factory left it.
static Provider provider;

static constexpr const char* sourceFile = "Facade.cpp";
static const std::string category("Zumbrel.OSStatusFacade");

// A message record, since those pass the log as it is shipped. It is put together here: the buffer
// of VA::trace is shared by all threads.
static void record(const std::string& text, SourceLocation handler) {
    const std::string whole = std::string("MESSAGE [File: ") + sourceFile +
                              ", Line: " + std::to_string(handler.line) + "]: " + text;
    writeRecord(handler.function, sourceFile, handler.line, category, parameterRecordLevel,
                [&whole] { return whole.c_str(); });
}

// Writes the one record of a request that failed, if any, and makes its status: the client is told
// why, and so is the log, since the provider itself says nothing. Without memory for record or
// message, those are left out. No exception leaves but the end of a cancelled thread.
static CMPIStatus failure(CMPIrc rc, const char* text, SourceLocation handler, Recorded recorded) {
    CMPIStatus status = {rc, nullptr};
    try {
        const CMPIBroker* const broker = provider.broker;
        const std::string safe = printable(text, 400);
        status.msg = broker->eft->newString(broker, safe.c_str(), nullptr);
        if (recorded == Recorded::yes) record(safe, handler);
    } catch (const abi::__forced_unwind&) {
        throw;
    } catch (...) {
        // The client then gets the status alone.
    }
    return status;
}

// Serves a request; whatever goes wrong becomes a status. No exception leaves but the one that ends
// a thread which the object manager cancels. That may also come while the failure is recorded: this
// is done after the catch blocks, since within one the runtime ends the process when a cancellation
// is caught.
template <class Serve>
static CMPIStatus guarded(Serve serve, SourceLocation handler = SourceLocation::current()) {
    CMPIrc rc = CMPI_RC_ERR_FAILED;
    Recorded recorded = Recorded::yes;
    const char* text = "unknown exception";
    std::exception_ptr ownerOfText;
    try {
        serve();
        return {CMPI_RC_OK, nullptr};
    } catch (const CimError& error) {
        rc = error.rc();
        recorded = error.recorded();
        text = error.what();
        ownerOfText = std::current_exception();
    } catch (const abi::__forced_unwind&) {
        throw;
    } catch (const std::exception& unexpected) {
        text = unexpected.what();
        ownerOfText = std::current_exception();
    } catch (...) {
        // Of a type without a text.
    }
    return failure(rc, text, handler, recorded);
}

// Passes a write operation or a query on to the provider, which refuses it.
template <class Pass>
static CMPIStatus passedOn(const char* operation, const CMPIObjectPath* path, Pass pass,
                           Recorded recorded = Recorded::yes,
                           SourceLocation handler = SourceLocation::current()) {
    return guarded(
        [&] {
            const CMPIStatus status = pass(provider.instances);
            if (status.rc != CMPI_RC_OK) {
                throw CimError(status.rc,
                               std::string(operation) + " is not supported for " +
                                   printable(classNameOf(path)),
                               recorded);
            }
        },
        handler);
}

static CMPIStatus OSStatusFacade_Cleanup(CMPIInstanceMI*, const CMPIContext* context,
                                         CMPIBoolean terminating) {
    CMPIInstanceMI* const mi = provider.instances;
    return mi->ft->cleanup(mi, context, terminating);
}

static CMPIStatus OSStatusFacade_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext* context,
                                                   const CMPIResult* result,
                                                   const CMPIObjectPath* path) {
    return guarded([&] { enumerateInstanceNames({provider, context, result, path}); });
}

static CMPIStatus OSStatusFacade_EnumInstances(CMPIInstanceMI*, const CMPIContext* context,
                                               const CMPIResult* result, const CMPIObjectPath* path,
                                               const char** properties) {
    return guarded([&] { enumerateInstances({provider, context, result, path}, properties); });
}

static CMPIStatus OSStatusFacade_GetInstance(CMPIInstanceMI*, const CMPIContext* context,
                                             const CMPIResult* result, const CMPIObjectPath* path,
                                             const char** properties) {
    return guarded([&] { getInstance({provider, context, result, path}, properties); });
}

static CMPIStatus OSStatusFacade_CreateInstance(CMPIInstanceMI*, const CMPIContext* context,
                                                const CMPIResult* result,
                                                const CMPIObjectPath* path,
                                                const CMPIInstance* instance) {
    return passedOn("CreateInstance", path, [&](CMPIInstanceMI* mi) {
        return mi->ft->createInstance(mi, context, result, path, instance);
    });
}

static CMPIStatus OSStatusFacade_ModifyInstance(CMPIInstanceMI*, const CMPIContext* context,
                                                const CMPIResult* result,
                                                const CMPIObjectPath* path,
                                                const CMPIInstance* instance,
                                                const char** properties) {
    return passedOn("ModifyInstance", path, [&](CMPIInstanceMI* mi) {
        return mi->ft->modifyInstance(mi, context, result, path, instance, properties);
    });
}

static CMPIStatus OSStatusFacade_DeleteInstance(CMPIInstanceMI*, const CMPIContext* context,
                                                const CMPIResult* result,
                                                const CMPIObjectPath* path) {
    return passedOn("DeleteInstance", path, [&](CMPIInstanceMI* mi) {
        return mi->ft->deleteInstance(mi, context, result, path);
    });
}

// An object manager may ask for each query before it evaluates it itself: no record, or the log
// would have one for each query that succeeds.
static CMPIStatus OSStatusFacade_ExecQuery(CMPIInstanceMI*, const CMPIContext* context,
                                           const CMPIResult* result, const CMPIObjectPath* path,
                                           const char* query, const char* language) {
    return passedOn(
        "ExecQuery", path,
        [&](CMPIInstanceMI* mi) {
            return mi->ft->execQuery(mi, context, result, path, query, language);
        },
        Recorded::no);
}

static CMPIStatus OSStatusFacade_AssociationCleanup(CMPIAssociationMI*, const CMPIContext* context,
                                                    CMPIBoolean terminating) {
    CMPIAssociationMI* const mi = provider.associations;
    return mi->ft->cleanup(mi, context, terminating);
}

static CMPIStatus OSStatusFacade_Associators(CMPIAssociationMI*, const CMPIContext* context,
                                             const CMPIResult* result, const CMPIObjectPath* path,
                                             const char* assocClass, const char* resultClass,
                                             const char* role, const char* resultRole,
                                             const char** properties) {
    return guarded([&] {
        associators({provider, context, result, path}, {assocClass, resultClass, role, resultRole},
                    properties);
    });
}

static CMPIStatus OSStatusFacade_AssociatorNames(CMPIAssociationMI*, const CMPIContext* context,
                                                 const CMPIResult* result,
                                                 const CMPIObjectPath* path, const char* assocClass,
                                                 const char* resultClass, const char* role,
                                                 const char* resultRole) {
    return guarded([&] {
        associatorNames({provider, context, result, path},
                        {assocClass, resultClass, role, resultRole});
    });
}

// The result class of references is the association.
static CMPIStatus OSStatusFacade_References(CMPIAssociationMI*, const CMPIContext* context,
                                            const CMPIResult* result, const CMPIObjectPath* path,
                                            const char* resultClass, const char* role,
                                            const char** properties) {
    return guarded([&] {
        references({provider, context, result, path}, {resultClass, nullptr, role, nullptr},
                   properties);
    });
}

static CMPIStatus OSStatusFacade_ReferenceNames(CMPIAssociationMI*, const CMPIContext* context,
                                                const CMPIResult* result,
                                                const CMPIObjectPath* path, const char* resultClass,
                                                const char* role) {
    return guarded([&] {
        referenceNames({provider, context, result, path}, {resultClass, nullptr, role, nullptr});
    });
}

// Headers of a later level may have more slots at the ends of the tables: these stay null, and the
// version says that this library does not have them.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wmissing-field-initializers"

static const CMPIInstanceMIFT instanceTable = {
    CMPIVersion200,
    CMPIVersion200,
    "instanceOSStatusFacade",
    OSStatusFacade_Cleanup,
    OSStatusFacade_EnumInstanceNames,
    OSStatusFacade_EnumInstances,
    OSStatusFacade_GetInstance,
    OSStatusFacade_CreateInstance,
    OSStatusFacade_ModifyInstance,
    OSStatusFacade_DeleteInstance,
    OSStatusFacade_ExecQuery,
};

static const CMPIAssociationMIFT associationTable = {
    CMPIVersion200,
    CMPIVersion200,
    "associationOSStatusFacade",
    OSStatusFacade_AssociationCleanup,
    OSStatusFacade_Associators,
    OSStatusFacade_AssociatorNames,
    OSStatusFacade_References,
    OSStatusFacade_ReferenceNames,
};

#pragma GCC diagnostic pop

// Either factory may be the only one that is called, and both kinds of requests need the provider's
// instances. False when the provider gives no record.
static bool createProvider(const CMPIBroker* broker, const CMPIContext* context,
                           CMPIStatus* status) {
    provider.broker = broker;
    provider.instances = OperatingSystemProvider_Create_InstanceMI(broker, context, status);
    provider.associations = OperatingSystemProvider_Create_AssociationMI(broker, context, status);
    return provider.instances != nullptr && provider.associations != nullptr;
}

}  // namespace VA::OSStatusFacade

extern "C" {

// Records point to their tables as if these could be written; object managers only read them.

[[gnu::visibility("default")]] CMPIInstanceMI* OSStatusFacade_Create_InstanceMI(
    const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* status) {
    static CMPIInstanceMI mi = {nullptr,
                                const_cast<CMPIInstanceMIFT*>(&VA::OSStatusFacade::instanceTable)};
    return VA::OSStatusFacade::createProvider(broker, context, status) ? &mi : nullptr;
}

[[gnu::visibility("default")]] CMPIAssociationMI* OSStatusFacade_Create_AssociationMI(
    const CMPIBroker* broker, const CMPIContext* context, CMPIStatus* status) {
    static CMPIAssociationMI mi = {
        nullptr, const_cast<CMPIAssociationMIFT*>(&VA::OSStatusFacade::associationTable)};
    return VA::OSStatusFacade::createProvider(broker, context, status) ? &mi : nullptr;
}
}
