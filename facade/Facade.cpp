#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include "Provider.h"

namespace VA::OSStatusFacade {

// Not guarded: factories run before requests.
static Provider provider;

static CMPIStatus OSStatusFacade_Cleanup(CMPIInstanceMI*, const CMPIContext* context,
                                         CMPIBoolean terminating) {
    return provider.instances->ft->cleanup(provider.instances, context, terminating);
}

static CMPIStatus OSStatusFacade_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext* context,
                                                   const CMPIResult* result,
                                                   const CMPIObjectPath* path) {
    return provider.instances->ft->enumerateInstanceNames(provider.instances, context, result,
                                                          path);
}

static CMPIStatus OSStatusFacade_EnumInstances(CMPIInstanceMI*, const CMPIContext* context,
                                               const CMPIResult* result, const CMPIObjectPath* path,
                                               const char** properties) {
    return provider.instances->ft->enumerateInstances(provider.instances, context, result, path,
                                                      properties);
}

static CMPIStatus OSStatusFacade_GetInstance(CMPIInstanceMI*, const CMPIContext* context,
                                             const CMPIResult* result, const CMPIObjectPath* path,
                                             const char** properties) {
    return provider.instances->ft->getInstance(provider.instances, context, result, path,
                                               properties);
}

static CMPIStatus OSStatusFacade_CreateInstance(CMPIInstanceMI*, const CMPIContext* context,
                                                const CMPIResult* result,
                                                const CMPIObjectPath* path,
                                                const CMPIInstance* instance) {
    return provider.instances->ft->createInstance(provider.instances, context, result, path,
                                                  instance);
}

static CMPIStatus OSStatusFacade_ModifyInstance(CMPIInstanceMI*, const CMPIContext* context,
                                                const CMPIResult* result,
                                                const CMPIObjectPath* path,
                                                const CMPIInstance* instance,
                                                const char** properties) {
    return provider.instances->ft->modifyInstance(provider.instances, context, result, path,
                                                  instance, properties);
}

static CMPIStatus OSStatusFacade_DeleteInstance(CMPIInstanceMI*, const CMPIContext* context,
                                                const CMPIResult* result,
                                                const CMPIObjectPath* path) {
    return provider.instances->ft->deleteInstance(provider.instances, context, result, path);
}

static CMPIStatus OSStatusFacade_ExecQuery(CMPIInstanceMI*, const CMPIContext* context,
                                           const CMPIResult* result, const CMPIObjectPath* path,
                                           const char* query, const char* language) {
    return provider.instances->ft->execQuery(provider.instances, context, result, path, query,
                                             language);
}

static CMPIStatus OSStatusFacade_AssociationCleanup(CMPIAssociationMI*, const CMPIContext* context,
                                                    CMPIBoolean terminating) {
    return provider.associations->ft->cleanup(provider.associations, context, terminating);
}

static CMPIStatus OSStatusFacade_Associators(CMPIAssociationMI*, const CMPIContext* context,
                                             const CMPIResult* result, const CMPIObjectPath* path,
                                             const char* assocClass, const char* resultClass,
                                             const char* role, const char* resultRole,
                                             const char** properties) {
    return provider.associations->ft->associators(provider.associations, context, result, path,
                                                  assocClass, resultClass, role, resultRole,
                                                  properties);
}

static CMPIStatus OSStatusFacade_AssociatorNames(CMPIAssociationMI*, const CMPIContext* context,
                                                 const CMPIResult* result,
                                                 const CMPIObjectPath* path, const char* assocClass,
                                                 const char* resultClass, const char* role,
                                                 const char* resultRole) {
    return provider.associations->ft->associatorNames(provider.associations, context, result, path,
                                                      assocClass, resultClass, role, resultRole);
}

static CMPIStatus OSStatusFacade_References(CMPIAssociationMI*, const CMPIContext* context,
                                            const CMPIResult* result, const CMPIObjectPath* path,
                                            const char* resultClass, const char* role,
                                            const char** properties) {
    return provider.associations->ft->references(provider.associations, context, result, path,
                                                 resultClass, role, properties);
}

static CMPIStatus OSStatusFacade_ReferenceNames(CMPIAssociationMI*, const CMPIContext* context,
                                                const CMPIResult* result,
                                                const CMPIObjectPath* path, const char* resultClass,
                                                const char* role) {
    return provider.associations->ft->referenceNames(provider.associations, context, result, path,
                                                     resultClass, role);
}

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
