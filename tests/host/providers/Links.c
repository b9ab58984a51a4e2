/* A provider with an association interface only, behind one generic factory: it ties each thing to
   all parts, which it asks the object manager for. */
#include <cmpi/cmpimacs.h>
#include <string.h>

static const CMPIBroker* broker;

static CMPIEnumeration* others(const CMPIContext* context, const CMPIObjectPath* source,
                               CMPIStatus* status) {
    const char* const nameSpace = CMGetCharsPtr(CMGetNameSpace(source, NULL), NULL);
    const char* const className = CMGetCharsPtr(CMGetClassName(source, NULL), NULL);
    const char* const other = strcmp(className, "TEST_Thing") == 0 ? "TEST_Part" : "TEST_Thing";
    CMPIObjectPath* const path = CMNewObjectPath(broker, nameSpace, other, NULL);
    return CBEnumInstanceNames(broker, context, path, status);
}

static CMPIStatus AssociationCleanup(CMPIAssociationMI* mi, const CMPIContext* context,
                                     CMPIBoolean ending) {
    (void)mi, (void)context, (void)ending;
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus AssociatorNames(CMPIAssociationMI* mi, const CMPIContext* context,
                                  const CMPIResult* result, const CMPIObjectPath* path,
                                  const char* assocClass, const char* resultClass, const char* role,
                                  const char* resultRole) {
    CMPIStatus status = {CMPI_RC_OK, NULL};
    CMPIEnumeration* const all = others(context, path, &status);
    (void)mi, (void)assocClass, (void)resultClass, (void)role, (void)resultRole;
    if (all == NULL) return status;
    while (CMHasNext(all, NULL)) CMReturnObjectPath(result, CMGetNext(all, NULL).value.ref);
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus Associators(CMPIAssociationMI* mi, const CMPIContext* context,
                              const CMPIResult* result, const CMPIObjectPath* path,
                              const char* assocClass, const char* resultClass, const char* role,
                              const char* resultRole, const char** properties) {
    CMPIStatus status = {CMPI_RC_OK, NULL};
    CMPIEnumeration* const all = others(context, path, &status);
    (void)mi, (void)assocClass, (void)resultClass, (void)role, (void)resultRole;
    if (all == NULL) return status;
    while (CMHasNext(all, NULL)) {
        CMPIObjectPath* const far = CMGetNext(all, NULL).value.ref;
        CMPIInstance* const instance = CBGetInstance(broker, context, far, properties, &status);
        if (instance == NULL) return status;
        CMReturnInstance(result, instance);
    }
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus References(CMPIAssociationMI* mi, const CMPIContext* context,
                             const CMPIResult* result, const CMPIObjectPath* path,
                             const char* resultClass, const char* role, const char** properties) {
    (void)mi, (void)context, (void)result, (void)path, (void)resultClass, (void)role;
    (void)properties;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus ReferenceNames(CMPIAssociationMI* mi, const CMPIContext* context,
                                 const CMPIResult* result, const CMPIObjectPath* path,
                                 const char* resultClass, const char* role) {
    (void)mi, (void)context, (void)result, (void)path, (void)resultClass, (void)role;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIAssociationMIFT table = {CMPICurrentVersion, CMPICurrentVersion, "Links",
                                    AssociationCleanup, Associators,        AssociatorNames,
                                    References,         ReferenceNames};

CMPI_EXTERN_C CMPIAssociationMI* _Generic_Create_AssociationMI(const CMPIBroker* given,
                                                               const CMPIContext* context,
                                                               const char* name,
                                                               CMPIStatus* status) {
    static CMPIAssociationMI mi = {NULL, &table};
    (void)context, (void)name, (void)status;
    broker = given;
    return &mi;
}
