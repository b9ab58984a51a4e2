/* Two providers in one library, with tables made by hand at level 2.1, which has more slots at the
   end. Each has an instance interface only: Parts serves TEST_Part, Spares its subclass. */
#include <cmpi/cmpimacs.h>
#include <string.h>

/* What a header of level 2.1 declares. */
struct InstanceTable210 {
    CMPIInstanceMIFT table;
    CMPIStatus (*enumerateInstancesFiltered)(CMPIInstanceMI* mi, const CMPIContext* context,
                                             const CMPIResult* result, const CMPIObjectPath* path,
                                             const char** properties, const void* filter);
};

static const CMPIBroker* broker;

static CMPIObjectPath* part(const CMPIObjectPath* like, const char* id) {
    const char* const nameSpace = CMGetCharsPtr(CMGetNameSpace(like, NULL), NULL);
    const char* const className = CMGetCharsPtr(CMGetClassName(like, NULL), NULL);
    CMPIObjectPath* const path = CMNewObjectPath(broker, nameSpace, className, NULL);
    CMAddKey(path, "Id", id, CMPI_chars);
    return path;
}

static const char* idOf(const CMPIInstanceMI* mi) {
    return strcmp(mi->ft->miName, "Spares") == 0 ? "spare" : "wheel";
}

static CMPIStatus cleanup(CMPIInstanceMI* mi, const CMPIContext* context, CMPIBoolean ending) {
    (void)mi, (void)context, (void)ending;
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus names(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                        const CMPIObjectPath* path) {
    (void)context;
    CMReturnObjectPath(result, part(path, idOf(mi)));
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus instances(CMPIInstanceMI* mi, const CMPIContext* context,
                            const CMPIResult* result, const CMPIObjectPath* path,
                            const char** properties) {
    CMPIInstance* const instance = CMNewInstance(broker, part(path, idOf(mi)), NULL);
    (void)context, (void)properties;
    CMSetProperty(instance, "Id", idOf(mi), CMPI_chars);
    CMReturnInstance(result, instance);
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus create(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                         const CMPIObjectPath* path, const CMPIInstance* instance) {
    (void)mi, (void)context, (void)result, (void)path, (void)instance;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus modify(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                         const CMPIObjectPath* path, const CMPIInstance* instance,
                         const char** properties) {
    (void)mi, (void)context, (void)result, (void)path, (void)instance, (void)properties;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus deletion(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                           const CMPIObjectPath* path) {
    (void)mi, (void)context, (void)result, (void)path;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus query(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                        const CMPIObjectPath* path, const char* text, const char* language) {
    (void)mi, (void)context, (void)result, (void)path, (void)text, (void)language;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

#define TABLE(name)                                                                              \
    {                                                                                            \
        {210, 210, name, cleanup, names, instances, instances, create, modify, deletion, query}, \
            NULL                                                                                 \
    }
static struct InstanceTable210 parts = TABLE("Parts");
static struct InstanceTable210 spares = TABLE("Spares");

CMPI_EXTERN_C CMPIInstanceMI* Parts_Create_InstanceMI(const CMPIBroker* given,
                                                      const CMPIContext* context,
                                                      CMPIStatus* status) {
    static CMPIInstanceMI mi = {NULL, &parts.table};
    (void)context, (void)status;
    broker = given;
    return &mi;
}

CMPI_EXTERN_C CMPIInstanceMI* Spares_Create_InstanceMI(const CMPIBroker* given,
                                                       const CMPIContext* context,
                                                       CMPIStatus* status) {
    static CMPIInstanceMI mi = {NULL, &spares.table};
    (void)context, (void)status;
    broker = given;
    return &mi;
}
