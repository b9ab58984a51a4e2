#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>
#include <strings.h>

#include <string>

#include "ComputerSystem.h"
#include "ProviderUtilities.h"

using Utilities = VA::ProviderUtilities;

static const CMPIBroker* broker;

namespace {

CMPIStatus status(CMPIrc rc) {
    return {rc, nullptr};
}

// Serves one request. No exception may reach the object manager.
template <class Serve>
CMPIStatus guarded(const CMPIObjectPath* path, Serve serve) {
    try {
        return serve(Utilities::getNamespace(path));
    } catch (...) {
        return status(CMPI_RC_ERR_FAILED);
    }
}

// Object managers do not survive a null.
template <class Object, class Return>
CMPIStatus handOver(const CMPIResult* result, Object* object, Return give) {
    return object == nullptr ? status(CMPI_RC_ERR_FAILED) : give(result, object);
}

// Whether the path names this computer system: by its keys, which compare as object managers give
// them, the creation class name without letter case.
bool names(const CMPIObjectPath* path, const std::string& name) {
    std::string className;
    std::string key;
    return Utilities::getKeyProperty(path, "Name", key) && key == name &&
           (!Utilities::getKeyProperty(path, "CreationClassName", className) ||
            strcasecmp(className.c_str(), "KORVA_ComputerSystem") == 0);
}

}  // namespace

static CMPIStatus ComputerSystem_Cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return status(CMPI_RC_OK);
}

static CMPIStatus ComputerSystem_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext*,
                                                   const CMPIResult* result,
                                                   const CMPIObjectPath* path) {
    return guarded(path, [&](const std::string& nameSpace) {
        for (const std::string& name : computersystem::names()) {
            const CMPIStatus given =
                handOver(result, computersystem::makePath(broker, nameSpace, name),
                         result->ft->returnObjectPath);
            if (given.rc != CMPI_RC_OK) return given;
        }
        return CMReturnDone(result);
    });
}

static CMPIStatus ComputerSystem_EnumInstances(CMPIInstanceMI*, const CMPIContext*,
                                               const CMPIResult* result, const CMPIObjectPath* path,
                                               const char**) {
    return guarded(path, [&](const std::string& nameSpace) {
        for (const std::string& name : computersystem::names()) {
            const CMPIStatus given =
                handOver(result, computersystem::makeInstance(broker, nameSpace, name),
                         result->ft->returnInstance);
            if (given.rc != CMPI_RC_OK) return given;
        }
        return CMReturnDone(result);
    });
}

static CMPIStatus ComputerSystem_GetInstance(CMPIInstanceMI*, const CMPIContext*,
                                             const CMPIResult* result, const CMPIObjectPath* path,
                                             const char**) {
    return guarded(path, [&](const std::string& nameSpace) {
        for (const std::string& name : computersystem::names()) {
            if (!names(path, name)) continue;
            const CMPIStatus given =
                handOver(result, computersystem::makeInstance(broker, nameSpace, name),
                         result->ft->returnInstance);
            return given.rc == CMPI_RC_OK ? CMReturnDone(result) : given;
        }
        return status(CMPI_RC_ERR_NOT_FOUND);
    });
}

static CMPIStatus ComputerSystem_CreateInstance(CMPIInstanceMI*, const CMPIContext*,
                                                const CMPIResult*, const CMPIObjectPath*,
                                                const CMPIInstance*) {
    return status(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus ComputerSystem_ModifyInstance(CMPIInstanceMI*, const CMPIContext*,
                                                const CMPIResult*, const CMPIObjectPath*,
                                                const CMPIInstance*, const char**) {
    return status(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus ComputerSystem_DeleteInstance(CMPIInstanceMI*, const CMPIContext*,
                                                const CMPIResult*, const CMPIObjectPath*) {
    return status(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus ComputerSystem_ExecQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                           const CMPIObjectPath*, const char*, const char*) {
    return status(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMInstanceMIStub(ComputerSystem_, ComputerSystemProvider, broker, CMNoHook)
