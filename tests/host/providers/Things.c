/* A provider as makers write one in C, with the stubs of the standard: it keeps instances of
   TEST_Thing in memory as they come, and has methods and a property interface. */
#include <cmpi/cmpimacs.h>
#include <stdio.h>
#include <string.h>

static const CMPIBroker* broker;

/* What is kept: clones, which are released in cleanup. */
enum { most = 8 };
static CMPIInstance* things[most];

static const char* nameOf(CMPIData key) {
    if (key.type != CMPI_string || key.value.string == NULL) return "";
    return CMGetCharsPtr(key.value.string, NULL);
}

static int indexOf(const CMPIObjectPath* path) {
    CMPIStatus status = {CMPI_RC_OK, NULL};
    const CMPIData wanted = CMGetKey(path, "Name", &status);
    int index;
    if (status.rc != CMPI_RC_OK) return -1;
    for (index = 0; index < most; ++index) {
        if (things[index] == NULL) continue;
        if (strcmp(nameOf(CMGetProperty(things[index], "Name", NULL)), nameOf(wanted)) == 0)
            return index;
    }
    return -1;
}

/* The thing that a file of the last run holds would be read here; there is one from the start. */
static void addFirst(const CMPIContext* context) {
    CMPIObjectPath* path = CMNewObjectPath(broker, "root/test", "TEST_Thing", NULL);
    CMPIInstance* first;
    CMPIData parameters;
    CMPIStatus status = {CMPI_RC_OK, NULL};
    CMAddKey(path, "Name", "first", CMPI_chars);
    first = CMNewInstance(broker, path, NULL);
    CMSetProperty(first, "Name", "first", CMPI_chars);
    parameters = CMGetContextEntry(context, "sfcbProviderParameters", &status);
    if (status.rc == CMPI_RC_OK)
        CMSetProperty(first, "Text", &parameters.value.string, CMPI_string);
    things[0] = CMClone(first, NULL);
    CMLogMessage(broker, CMPI_SEV_INFO, "Things", "the first thing is there", NULL);
}

static CMPIStatus Cleanup(CMPIInstanceMI* mi, const CMPIContext* context, CMPIBoolean ending) {
    int index;
    (void)mi, (void)context, (void)ending;
    for (index = 0; index < most; ++index) {
        if (things[index] != NULL) CMRelease(things[index]);
        things[index] = NULL;
    }
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus EnumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* context,
                                    const CMPIResult* result, const CMPIObjectPath* path) {
    int index;
    (void)mi, (void)context, (void)path;
    for (index = 0; index < most; ++index) {
        if (things[index] != NULL) CMReturnObjectPath(result, CMGetObjectPath(things[index], NULL));
    }
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus EnumInstances(CMPIInstanceMI* mi, const CMPIContext* context,
                                const CMPIResult* result, const CMPIObjectPath* path,
                                const char** properties) {
    int index;
    (void)mi, (void)context, (void)path, (void)properties;
    for (index = 0; index < most; ++index) {
        if (things[index] != NULL) CMReturnInstance(result, things[index]);
    }
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus GetInstance(CMPIInstanceMI* mi, const CMPIContext* context,
                              const CMPIResult* result, const CMPIObjectPath* path,
                              const char** properties) {
    const int index = indexOf(path);
    (void)mi, (void)context, (void)properties;
    if (index < 0) CMReturn(CMPI_RC_ERR_NOT_FOUND);
    CMReturnInstance(result, things[index]);
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

/* Tells what came: how many properties, and each by name and type. */
static CMPIStatus told(const char* what, const CMPIInstance* instance, const char** list) {
    char text[1024];
    size_t used = (size_t)snprintf(text, sizeof text, "%s", what);
    const CMPICount count = CMGetPropertyCount(instance, NULL);
    CMPICount index;
    for (index = 0; index < count; ++index) {
        CMPIString* name = NULL;
        const CMPIData data = CMGetPropertyAt(instance, index, &name, NULL);
        used +=
            (size_t)snprintf(text + used, sizeof text - used, " %s:%x%s", CMGetCharsPtr(name, NULL),
                             (unsigned)data.type, CMIsNullValue(data) ? "(null)" : "");
    }
    for (; list != NULL && *list != NULL; ++list)
        used += (size_t)snprintf(text + used, sizeof text - used, " [%s]", *list);
    CMReturnWithChars(broker, CMPI_RC_ERR_FAILED, text);
}

static CMPIStatus CreateInstance(CMPIInstanceMI* mi, const CMPIContext* context,
                                 const CMPIResult* result, const CMPIObjectPath* path,
                                 const CMPIInstance* instance) {
    int index = 0;
    (void)mi, (void)context;
    if (CMGetPropertyCount(instance, NULL) > 2) return told("create", instance, NULL);
    if (indexOf(path) >= 0) CMReturn(CMPI_RC_ERR_ALREADY_EXISTS);
    while (index < most && things[index] != NULL) ++index;
    if (index == most) CMReturnWithChars(broker, CMPI_RC_ERR_FAILED, "no room");
    things[index] = CMClone(instance, NULL);
    CMReturnObjectPath(result, path);
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus ModifyInstance(CMPIInstanceMI* mi, const CMPIContext* context,
                                 const CMPIResult* result, const CMPIObjectPath* path,
                                 const CMPIInstance* instance, const char** properties) {
    (void)mi, (void)context;
    if (indexOf(path) < 0) return told("modify", instance, properties);
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus DeleteInstance(CMPIInstanceMI* mi, const CMPIContext* context,
                                 const CMPIResult* result, const CMPIObjectPath* path) {
    const int index = indexOf(path);
    (void)mi, (void)context;
    if (index < 0) CMReturnWithChars(broker, CMPI_RC_ERR_NOT_FOUND, "no such thing");
    CMRelease(things[index]);
    things[index] = NULL;
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

/* Knows one query of one language. */
static CMPIStatus ExecQuery(CMPIInstanceMI* mi, const CMPIContext* context,
                            const CMPIResult* result, const CMPIObjectPath* path, const char* query,
                            const char* language) {
    if (strcmp(language, "DMTF:CQL") != 0)
        CMReturnWithChars(broker, CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED, language);
    if (strcmp(query, "SELECT * FROM TEST_Thing") != 0)
        CMReturnWithChars(broker, CMPI_RC_ERR_INVALID_QUERY, query);
    return EnumInstances(mi, context, result, path, NULL);
}

static CMPIStatus MethodCleanup(CMPIMethodMI* mi, const CMPIContext* context, CMPIBoolean ending) {
    (void)mi, (void)context, (void)ending;
    CMReturn(CMPI_RC_OK);
}

/* Sum is a method of the class: Total = A + B; it returns how many were added. */
static CMPIStatus sum(const CMPIResult* result, const CMPIArgs* in, CMPIArgs* out) {
    CMPIUint32 total = 0;
    CMPIUint16 added = 0;
    const char* const names[] = {"A", "B"};
    size_t index;
    for (index = 0; index < 2; ++index) {
        CMPIStatus status = {CMPI_RC_OK, NULL};
        const CMPIData data = CMGetArg(in, names[index], &status);
        if (status.rc != CMPI_RC_OK) continue;
        if (data.type != CMPI_uint32) CMReturn(CMPI_RC_ERR_TYPE_MISMATCH);
        total += data.value.uint32;
        ++added;
    }
    CMAddArg(out, "Total", &total, CMPI_uint32);
    CMReturnData(result, &added, CMPI_uint16);
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus InvokeMethod(CMPIMethodMI* mi, const CMPIContext* context,
                               const CMPIResult* result, const CMPIObjectPath* path,
                               const char* method, const CMPIArgs* in, CMPIArgs* out) {
    const int index = indexOf(path);
    (void)mi, (void)context;
    if (strcmp(method, "Sum") == 0) return sum(result, in, out);
    if (strcmp(method, "Describe") != 0) CMReturn(CMPI_RC_ERR_METHOD_NOT_FOUND);
    if (index < 0) CMReturn(CMPI_RC_ERR_NOT_FOUND);
    /* Describe is a method of an instance. */
    CMReturnData(result, "one of the things", CMPI_chars);
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus PropertyCleanup(CMPIPropertyMI* mi, const CMPIContext* context,
                                  CMPIBoolean ending) {
    (void)mi, (void)context, (void)ending;
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus SetProperty(CMPIPropertyMI* mi, const CMPIContext* context,
                              const CMPIResult* result, const CMPIObjectPath* path,
                              const char* name, const CMPIData data) {
    const int index = indexOf(path);
    (void)mi, (void)context;
    if (index < 0) CMReturn(CMPI_RC_ERR_NOT_FOUND);
    CMSetProperty(things[index], name, &data.value, data.type);
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus GetProperty(CMPIPropertyMI* mi, const CMPIContext* context,
                              const CMPIResult* result, const CMPIObjectPath* path,
                              const char* name) {
    const int index = indexOf(path);
    CMPIStatus status = {CMPI_RC_OK, NULL};
    CMPIData data;
    (void)mi, (void)context;
    if (index < 0) CMReturn(CMPI_RC_ERR_NOT_FOUND);
    data = CMGetProperty(things[index], name, &status);
    if (status.rc != CMPI_RC_OK) CMReturn(CMPI_RC_ERR_NO_SUCH_PROPERTY);
    CMReturnData(result, &data.value, data.type);
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

CMInstanceMIStub(, Things, broker, addFirst(ctx))
CMMethodMIStub(, Things, broker, CMNoHook)
CMPropertyMIStub(, Things, broker, CMNoHook)
