/* An instance provider as a C programmer writes it with the macros: it hands on what the object
 * manager enumerates, and makes one instance itself. */
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>
#include <cmpi/cmpios.h>

static const CMPIBroker* broker;

static CMPIStatus plainCleanup(CMPIInstanceMI* mi, const CMPIContext* ctx,
                               CMPIBoolean terminating) {
    if (!terminating) {
        CMReturn(CMPI_RC_DO_NOT_UNLOAD);
    }
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus plainEnumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                         const CMPIResult* rslt, const CMPIObjectPath* op) {
    CMPIStatus status = {CMPI_RC_OK, NULL};
    CMPIEnumeration* names = CBEnumInstanceNames(broker, ctx, op, &status);
    if (CMIsNullObject(names)) {
        CMReturnWithChars(broker, CMPI_RC_ERR_FAILED, "no enumeration");
    }
    while (CMHasNext(names, &status)) {
        const CMPIData item = CMGetNext(names, &status);
        CMReturnObjectPath(rslt, item.value.ref);
    }
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus plainEnumInstances(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                     const CMPIResult* rslt, const CMPIObjectPath* op,
                                     const char** properties) {
    CMPIEnumeration* instances = CBEnumInstances(broker, ctx, op, properties, NULL);
    while (CMHasNext(instances, NULL)) {
        CMReturnInstance(rslt, CMGetNext(instances, NULL).value.inst);
    }
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus plainGetInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                   const CMPIResult* rslt, const CMPIObjectPath* op,
                                   const char** properties) {
    const CMPIUint32 users = 3;
    CMPIObjectPath* path = CMNewObjectPath(broker, "root/cimv2", "Plain_Class", NULL);
    CMPIInstance* instance;
    CMAddKey(path, "Name", "first", CMPI_chars);
    instance = CMNewInstance(broker, path, NULL);
    CMSetProperty(instance, "NumberOfUsers", &users, CMPI_uint32);
    CMReturnInstance(rslt, instance);
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus plainCreateInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                      const CMPIResult* rslt, const CMPIObjectPath* op,
                                      const CMPIInstance* inst) {
    CMReturn(CMPI_RC_ERR_ALREADY_EXISTS);
}

static CMPIStatus plainModifyInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                      const CMPIResult* rslt, const CMPIObjectPath* op,
                                      const CMPIInstance* inst, const char** properties) {
    CMReturn(CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

static CMPIStatus plainDeleteInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                      const CMPIResult* rslt, const CMPIObjectPath* op) {
    CMPIStatus status = {CMPI_RC_OK, NULL};
    CMSetStatus(&status, CMPI_RC_ERR_ACCESS_DENIED);
    return status;
}

static CMPIStatus plainExecQuery(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                                 const CMPIObjectPath* op, const char* query, const char* lang) {
    CMReturn(CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED);
}

CMInstanceMIStub(plain, PlainProvider, broker, CMNoHook)
