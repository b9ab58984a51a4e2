// Several providers under names of their own. "Good" behaves: it answers with paths and instances
// of TEST_Thing, echoes what it was given, and can be told through exported variables to behave in
// other ways. The factories of the others misbehave, each in its own way.
#include <cmpi/cmpift.h>

#include <stdexcept>
#include <string>

extern "C" {
/// Non-zero: cleanup refuses unless terminating.
CMPI_EXPORT int refuseUnload = 0;
/// Calls of cleanup of both interfaces, and of those with terminating set.
CMPI_EXPORT int cleanups = 0;
CMPI_EXPORT int terminations = 0;
/// Set: cleanup asks for the names of that class, with this status.
CMPI_EXPORT const char* askedInCleanup = nullptr;
CMPI_EXPORT CMPIrc statusInCleanup = CMPI_RC_OK;
}

namespace {

const CMPIBroker* broker = nullptr;

CMPIStatus done(CMPIrc rc = CMPI_RC_OK) {
    return {rc, nullptr};
}

std::string textOf(const CMPIString* string) {
    const char* const text = string->ft->getCharPtr(string, nullptr);
    return text == nullptr ? "(none)" : text;
}

/// Returns the last instance or path of an answer, and its end.
CMPIStatus deliver(const CMPIResult* result, const CMPIInstance* instance) {
    CMReturnInstance(result, instance);
    CMReturnDone(result);
    return done();
}
CMPIStatus deliver(const CMPIResult* result, const CMPIObjectPath* path) {
    CMReturnObjectPath(result, path);
    CMReturnDone(result);
    return done();
}

CMPIObjectPath* pathOf(const CMPIObjectPath* given, const char* name) {
    CMPIObjectPath* const path = CMNewObjectPath(
        broker, textOf(CMGetNameSpace(given, nullptr)).c_str(), "TEST_Thing", nullptr);
    CMAddKey(path, "Name", name, CMPI_chars);
    return path;
}

CMPIInstance* instanceOf(const CMPIObjectPath* given, const char* name) {
    CMPIInstance* const instance = CMNewInstance(broker, pathOf(given, name), nullptr);
    CMSetProperty(instance, "Name", name, CMPI_chars);
    return instance;
}

void setText(CMPIInstance* instance, const char* name, const char* text) {
    CMSetProperty(instance, name, text == nullptr ? "(null)" : text, CMPI_chars);
}

CMPIStatus cleanup(const CMPIContext* context, CMPIBoolean terminating) {
    ++cleanups;
    if (terminating != 0) ++terminations;
    if (askedInCleanup != nullptr) {
        CMPIStatus status = done();
        CBEnumInstanceNames(broker, context,
                            CMNewObjectPath(broker, "root/cimv2", askedInCleanup, nullptr),
                            &status);
        statusInCleanup = status.rc;
    }
    return done(refuseUnload != 0 ? CMPI_RC_DO_NOT_UNLOAD : CMPI_RC_OK);
}

CMPIStatus instanceCleanup(CMPIInstanceMI*, const CMPIContext* context, CMPIBoolean terminating) {
    return cleanup(context, terminating);
}

CMPIStatus associationCleanup(CMPIAssociationMI*, const CMPIContext* context,
                              CMPIBoolean terminating) {
    return cleanup(context, terminating);
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                  const CMPIObjectPath* path) {
    CMReturnObjectPath(result, pathOf(path, "one"));
    return deliver(result, pathOf(path, "two"));
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                              const CMPIObjectPath* path, const char** properties) {
    CMPIInstance* const instance = instanceOf(path, "one");
    std::string list = properties == nullptr ? "(null)" : "";
    for (; properties != nullptr && *properties != nullptr; ++properties) list += *properties;
    setText(instance, "Properties", list.c_str());
    CMReturnInstance(result, instance);
    return deliver(result, instanceOf(path, "two"));
}

/// Tells the type of the key "Name" and what stands in the context.
CMPIStatus getInstance(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result,
                       const CMPIObjectPath* path, const char**) {
    CMPIInstance* const instance = instanceOf(path, "one");
    CMPIStatus status = done();
    const CMPIData key = CMGetKey(path, "name", &status);
    const CMPIUint16 type = status.rc == CMPI_RC_OK ? key.type : CMPIUint16{0};
    CMSetProperty(instance, "KeyType", &type, CMPI_uint16);
    const CMPIData flags = CMGetContextEntry(context, CMPIInvocationFlags, nullptr);
    CMSetProperty(instance, "Flags", &flags.value.uint32, CMPI_uint32);
    for (const char* const name : {CMPIPrincipal, CMPIRole, CMPIInitNameSpace}) {
        const CMPIData entry = CMGetContextEntry(context, name, &status);
        setText(instance, name,
                status.rc == CMPI_RC_OK ? textOf(entry.value.string).c_str() : "(missing)");
    }
    return deliver(result, instance);
}

CMPIStatus createInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                          const CMPIObjectPath* path, const CMPIInstance* instance) {
    const CMPIData name = CMGetProperty(instance, "Name", nullptr);
    return deliver(result, pathOf(path, textOf(name.value.string).c_str()));
}

CMPIStatus modifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                          const CMPIObjectPath*, const CMPIInstance*, const char**) {
    return done(CMPI_RC_ERR_ACCESS_DENIED);
}

CMPIStatus deleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                          const CMPIObjectPath*) {
    return {CMPI_RC_ERR_NOT_FOUND, CMNewString(broker, "It has gone", nullptr)};
}

CMPIStatus execQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                     const char* query, const char* language) {
    throw std::runtime_error(std::string(query) + " in " + language);
}

CMPIInstance* echo(const CMPIObjectPath* path, const char* operation, const char* assocClass,
                   const char* resultClass, const char* role, const char* resultRole) {
    CMPIInstance* const instance = instanceOf(path, operation);
    setText(instance, "AssocClass", assocClass);
    setText(instance, "ResultClass", resultClass);
    setText(instance, "Role", role);
    setText(instance, "ResultRole", resultRole);
    return instance;
}

CMPIStatus associators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                       const CMPIObjectPath* path, const char* assocClass, const char* resultClass,
                       const char* role, const char* resultRole, const char**) {
    return deliver(result, echo(path, "associators", assocClass, resultClass, role, resultRole));
}

CMPIStatus associatorNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                           const CMPIObjectPath* path, const char*, const char*, const char*,
                           const char*) {
    return deliver(result, pathOf(path, "associatorNames"));
}

CMPIStatus references(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                      const CMPIObjectPath* path, const char* resultClass, const char* role,
                      const char**) {
    return deliver(result, echo(path, "references", nullptr, resultClass, role, nullptr));
}

CMPIStatus referenceNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                          const CMPIObjectPath* path, const char*, const char*) {
    return deliver(result, pathOf(path, "referenceNames"));
}

CMPIInstanceMIFT instanceTable = {
    CMPICurrentVersion,     CMPICurrentVersion, "instanceGood", instanceCleanup,
    enumerateInstanceNames, enumerateInstances, getInstance,    createInstance,
    modifyInstance,         deleteInstance,     execQuery};

CMPIAssociationMIFT associationTable = {CMPICurrentVersion, CMPICurrentVersion, "associationGood",
                                        associationCleanup, associators,        associatorNames,
                                        references,         referenceNames};

}  // namespace

CMPI_EXTERN_C CMPIInstanceMI* Good_Create_InstanceMI(const CMPIBroker* given, const CMPIContext*,
                                                     CMPIStatus*) {
    static CMPIInstanceMI mi = {nullptr, &instanceTable};
    broker = given;
    return &mi;
}

CMPI_EXTERN_C CMPIAssociationMI* Good_Create_AssociationMI(const CMPIBroker* given,
                                                           const CMPIContext*, CMPIStatus*) {
    static CMPIAssociationMI mi = {nullptr, &associationTable};
    broker = given;
    return &mi;
}

namespace {

CMPIStatus failingCleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return {CMPI_RC_ERR_FAILED, nullptr};
}

CMPIInstanceMIFT tableOf(int ftVersion, int miVersion) {
    CMPIInstanceMIFT table{};
    table.ftVersion = ftVersion;
    table.miVersion = miVersion;
    table.miName = "instanceBad";
    return table;
}

CMPIInstanceMIFT lowVersion = tableOf(1, 1);
CMPIInstanceMIFT highMi = tableOf(100, 200);
CMPIInstanceMIFT emptySlots = [] {
    CMPIInstanceMIFT table = tableOf(200, 200);
    table.cleanup = failingCleanup;
    table.miName = nullptr;
    return table;
}();

/// One interface for each table, as a factory hands it out.
CMPIInstanceMI lowVersionMI = {nullptr, &lowVersion};
CMPIInstanceMI highMiMI = {nullptr, &highMi};
CMPIInstanceMI emptySlotsMI = {nullptr, &emptySlots};
CMPIInstanceMI tablelessMI = {nullptr, nullptr};

}  // namespace

CMPI_EXTERN_C CMPIInstanceMI* Null_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                     CMPIStatus*) {
    return nullptr;
}

CMPI_EXTERN_C CMPIInstanceMI* Refusing_Create_InstanceMI(const CMPIBroker* given,
                                                         const CMPIContext*, CMPIStatus* rc) {
    *rc = {CMPI_RC_ERR_ACCESS_DENIED, CMNewString(given, "not today", nullptr)};
    return &lowVersionMI;
}

CMPI_EXTERN_C CMPIInstanceMI* Throwing_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                         CMPIStatus*) {
    throw std::runtime_error("no such luck");
}

CMPI_EXTERN_C CMPIInstanceMI* NoTable_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                        CMPIStatus*) {
    return &tablelessMI;
}

CMPI_EXTERN_C CMPIInstanceMI* LowVersion_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                           CMPIStatus*) {
    return &lowVersionMI;
}

CMPI_EXTERN_C CMPIInstanceMI* HighMi_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                       CMPIStatus*) {
    return &highMiMI;
}

CMPI_EXTERN_C CMPIInstanceMI* EmptySlots_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                           CMPIStatus*) {
    return &emptySlotsMI;
}
