#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>
#include <strings.h>

#include <optional>
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
CMPIStatus guarded(Serve serve) {
    try {
        return serve(computersystem::name());
    } catch (...) {
        return status(CMPI_RC_ERR_FAILED);
    }
}

// Returns the one object and the end of the results. Object managers do not survive a null.
template <class Object, class Return>
CMPIStatus handOver(const CMPIResult* result, Object* object, Return give) {
    if (object == nullptr) return status(CMPI_RC_ERR_FAILED);
    const CMPIStatus given = give(result, object);
    return given.rc == CMPI_RC_OK ? CMReturnDone(result) : given;
}

CMPIStatus handOverPath(const CMPIResult* result, const CMPIObjectPath* asked,
                        const std::string& name) {
    return handOver(result, computersystem::makePath(broker, Utilities::getNamespace(asked), name),
                    result->ft->returnObjectPath);
}

CMPIStatus handOverInstance(const CMPIResult* result, const CMPIObjectPath* asked,
                            const std::string& name) {
    return handOver(result,
                    computersystem::makeInstance(broker, Utilities::getNamespace(asked), name),
                    result->ft->returnInstance);
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
    return guarded([&](const std::optional<std::string>& name) {
        return name ? handOverPath(result, path, *name) : CMReturnDone(result);
    });
}

static CMPIStatus ComputerSystem_EnumInstances(CMPIInstanceMI*, const CMPIContext*,
                                               const CMPIResult* result, const CMPIObjectPath* path,
                                               const char**) {
    return guarded([&](const std::optional<std::string>& name) {
        return name ? handOverInstance(result, path, *name) : CMReturnDone(result);
    });
}

static CMPIStatus ComputerSystem_GetInstance(CMPIInstanceMI*, const CMPIContext*,
                                             const CMPIResult* result, const CMPIObjectPath* path,
                                             const char**) {
    return guarded([&](const std::optional<std::string>& name) {
        return name && names(path, *name) ? handOverInstance(result, path, *name)
                                          : status(CMPI_RC_ERR_NOT_FOUND);
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

// Headers of a later level may have more slots at the end of the table: these stay null, and the
// version tells that they are none of this library's.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wmissing-field-initializers"

static const CMPIInstanceMIFT instanceTable = {
    CMPIVersion200,
    CMPIVersion200,
    "instanceComputerSystemProvider",
    ComputerSystem_Cleanup,
    ComputerSystem_EnumInstanceNames,
    ComputerSystem_EnumInstances,
    ComputerSystem_GetInstance,
    ComputerSystem_CreateInstance,
    ComputerSystem_ModifyInstance,
    ComputerSystem_DeleteInstance,
    ComputerSystem_ExecQuery,
};

#pragma GCC diagnostic pop

// The record points to the table as if it could be written; object managers only read it.
extern "C" [[gnu::visibility("default")]] CMPIInstanceMI* ComputerSystemProvider_Create_InstanceMI(
    const CMPIBroker* cmpiBroker, const CMPIContext*, CMPIStatus*) {
    static CMPIInstanceMI mi = {nullptr, const_cast<CMPIInstanceMIFT*>(&instanceTable)};
    broker = cmpiBroker;
    return &mi;
}
