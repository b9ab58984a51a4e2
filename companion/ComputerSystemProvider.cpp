// The computer system is somebody else's class: a host whose object manager has no provider of it
// gets this one, so that the operating system's associations have their other end. It serves one
// instance, the host itself, under the name that the provider of the operating system uses.
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <optional>
#include <string>

#include "Instrumentation.h"
#include "ProviderUtilities.h"
#include "base/Ascii.h"

using Utilities = VA::ProviderUtilities;

static const CMPIBroker* broker;

namespace {

constexpr const char* className = "KORVA_ComputerSystem";

// The host's name; none where it is not known, and then no computer system is served.
std::optional<std::string> hostName() {
    VA::Instrumentation instrumentation;
    instrumentation.selectNode(VA::NodeLexicon::OperatingSystemNode);
    std::string name;
    if (!instrumentation.getComputerName(name)) return std::nullopt;
    return name;
}

// The computer system's path or instance, in the namespace of the path that was asked for; null
// when the broker makes none.
CMPIObjectPath* makePath(const CMPIObjectPath* asked, const std::string& name) {
    CMPIObjectPath* path =
        Utilities::createObjectPath(broker, className, Utilities::getNamespace(asked));
    Utilities::setKeyProperty(path, "CreationClassName", className);
    Utilities::setKeyProperty(path, "Name", name);
    return path;
}

// Nobody measures the state of the computer system, its health or its purpose: those properties are
// left out.
CMPIInstance* makeInstance(const CMPIObjectPath* asked, const std::string& name) {
    CMPIInstance* instance = Utilities::createInstance(broker, makePath(asked, name));
    std::string elementName = name;
    std::string nameFormat = "Other";
    Utilities::setProperty(instance, "ElementName", elementName);
    Utilities::setProperty(instance, "NameFormat", nameFormat);
    return instance;
}

// Whether the path names this computer system: by its keys, which compare as object managers give
// them, the creation class name without letter case.
bool names(const CMPIObjectPath* path, const std::string& name) {
    std::string creationClassName;
    std::string key;
    return Utilities::getKeyProperty(path, "Name", key) && key == name &&
           (!Utilities::getKeyProperty(path, "CreationClassName", creationClassName) ||
            base::equalsIgnoreCase(creationClassName, className));
}

CMPIStatus status(CMPIrc rc) {
    return {rc, nullptr};
}

// Serves one request. No exception may reach the object manager.
template <class Serve>
CMPIStatus guarded(Serve serve) {
    try {
        return serve(hostName());
    } catch (...) {
        return status(CMPI_RC_ERR_FAILED);
    }
}

// Returns the one object and the end of the results. Object managers do not survive a null.
template <class Object, class Return>
CMPIStatus returnResult(const CMPIResult* result, Object* object, Return returnObject) {
    if (object == nullptr) return status(CMPI_RC_ERR_FAILED);
    const CMPIStatus returned = returnObject(result, object);
    return returned.rc == CMPI_RC_OK ? CMReturnDone(result) : returned;
}

CMPIStatus returnPath(const CMPIResult* result, const CMPIObjectPath* asked,
                      const std::string& name) {
    return returnResult(result, makePath(asked, name), result->ft->returnObjectPath);
}

CMPIStatus returnInstance(const CMPIResult* result, const CMPIObjectPath* asked,
                          const std::string& name) {
    return returnResult(result, makeInstance(asked, name), result->ft->returnInstance);
}

}  // namespace

static CMPIStatus ComputerSystem_Cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return status(CMPI_RC_OK);
}

static CMPIStatus ComputerSystem_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext*,
                                                   const CMPIResult* result,
                                                   const CMPIObjectPath* path) {
    return guarded([&](const std::optional<std::string>& name) {
        return name ? returnPath(result, path, *name) : CMReturnDone(result);
    });
}

static CMPIStatus ComputerSystem_EnumInstances(CMPIInstanceMI*, const CMPIContext*,
                                               const CMPIResult* result, const CMPIObjectPath* path,
                                               const char**) {
    return guarded([&](const std::optional<std::string>& name) {
        return name ? returnInstance(result, path, *name) : CMReturnDone(result);
    });
}

static CMPIStatus ComputerSystem_GetInstance(CMPIInstanceMI*, const CMPIContext*,
                                             const CMPIResult* result, const CMPIObjectPath* path,
                                             const char**) {
    return guarded([&](const std::optional<std::string>& name) {
        return name && names(path, *name) ? returnInstance(result, path, *name)
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
// version says that this library does not have them.
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
