// A small provider library for tests of the command line: what it answers depends on the class that
// is asked for, and what it was asked comes back in the message of a failure.
#include <cmpi/cmpimacs.h>

#include <cstdlib>
#include <stdexcept>
#include <string>

static const CMPIBroker* broker;

namespace {

const char* className(const CMPIObjectPath* path) {
    return CMGetCharsPtr(CMGetClassName(path, nullptr), nullptr);
}

std::string nameSpace(const CMPIObjectPath* path) {
    return CMGetCharsPtr(CMGetNameSpace(path, nullptr), nullptr);
}

bool asksFor(const CMPIObjectPath* path, const std::string& name) {
    return className(path) == name;
}

CMPIStatus status(CMPIrc rc) {
    return {rc, nullptr};
}

CMPIStatus failure(CMPIrc rc, const std::string& message) {
    return {rc, CMNewString(broker, message.c_str(), nullptr)};
}

CMPIStatus done(const CMPIResult* result) {
    CMReturnDone(result);
    return status(CMPI_RC_OK);
}

std::string joined(const char** names) {
    std::string list = names == nullptr ? "all" : "";
    for (; names != nullptr && *names != nullptr; ++names) {
        list += (list.empty() ? "" : ",") + std::string(*names);
    }
    return list;
}

std::string textOr(const char* text) {
    return text == nullptr ? "-" : text;
}

CMPIObjectPath* operatingSystemPath(const CMPIObjectPath* like) {
    CMPIObjectPath* path =
        CMNewObjectPath(broker, nameSpace(like).c_str(), "KORVA_OperatingSystem", nullptr);
    CMAddKey(path, "CSCreationClassName", "KORVA_ComputerSystem", CMPI_chars);
    CMAddKey(path, "CSName", "moon", CMPI_chars);
    CMAddKey(path, "CreationClassName", "KORVA_OperatingSystem", CMPI_chars);
    CMAddKey(path, "Name", "Test \"OS\"", CMPI_chars);
    return path;
}

CMPIInstance* operatingSystem(const CMPIObjectPath* like) {
    CMPIInstance* instance = CMNewInstance(broker, operatingSystemPath(like), nullptr);
    CMSetProperty(instance, "CSName", "moon", CMPI_chars);
    CMSetProperty(instance, "Name", "Test \"OS\"", CMPI_chars);
    CMSetProperty(instance, "Version", "1\x1b[31m", CMPI_chars);
    const CMPIUint16 type = 36;
    CMSetProperty(instance, "OSType", &type, CMPI_uint16);
    const CMPIUint64 size = 8123456;
    CMSetProperty(instance, "TotalVisibleMemorySize", &size, CMPI_uint64);
    return instance;
}

/// Hands on what the other provider of the host answers.
void returnComputerSystems(const CMPIContext* context, const CMPIResult* result,
                           const CMPIObjectPath* path) {
    CMPIEnumeration* names = CBEnumInstanceNames(broker, context, path, nullptr);
    while (names != nullptr && CMHasNext(names, nullptr) != 0) {
        CMReturnObjectPath(result, CMGetNext(names, nullptr).value.ref);
    }
}

/// Cleans up as the environment says: with a failure, an exception, or well.
CMPIStatus cleanedUp() {
    const char* const manner = std::getenv("STAND_IN_CLEANUP");
    if (manner != nullptr && std::string(manner) == "throws") {
        throw std::runtime_error("not now");
    }
    return status(manner == nullptr ? CMPI_RC_OK : CMPI_RC_ERR_FAILED);
}

CMPIStatus Cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return cleanedUp();
}

CMPIStatus EnumInstanceNames(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result,
                             const CMPIObjectPath* path) {
    if (asksFor(path, "KORVA_ComputerSystem")) {
        returnComputerSystems(context, result, path);
    } else if (asksFor(path, "KORVA_OperatingSystem")) {
        CMReturnObjectPath(result, operatingSystemPath(path));
    } else if (asksFor(path, "KORVA_OSElementCapabilities")) {
        return status(CMPI_RC_ERR_ACCESS_DENIED);
    }
    return done(result);
}

CMPIStatus EnumInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                         const CMPIObjectPath* path, const char** properties) {
    if (asksFor(path, "KORVA_RunningOS")) {
        throw std::runtime_error("the moon is down");
    }
    if (asksFor(path, "KORVA_OSElementCapabilities")) {
        throw 5;
    }
    if (asksFor(path, "KORVA_InstalledOS")) {
        CMReturnInstance(result, nullptr);
        return done(result);
    }
    if (asksFor(path, "KORVA_OperatingSystemCapabilities")) {
        CMReturnInstance(result, operatingSystem(path));
        return failure(CMPI_RC_ERR_FAILED, "properties " + joined(properties) + "\x1b[31m");
    }
    if (asksFor(path, "KORVA_OperatingSystem")) {
        CMReturnInstance(result, operatingSystem(path));
    }
    return done(result);
}

CMPIStatus GetInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                       const CMPIObjectPath* path, const char**) {
    if (asksFor(path, "CIM_Faulty")) {
        CMReturnInstance(result, nullptr);
    }
    CMPIStatus found = status(CMPI_RC_OK);
    const CMPIData name = CMGetKey(path, "CSName", &found);
    const bool here = found.rc == CMPI_RC_OK && name.type == CMPI_string &&
                      std::string(CMGetCharsPtr(name.value.string, nullptr)) == "moon";
    if (here) {
        CMReturnInstance(result, operatingSystem(path));
    }
    return done(result);
}

CMPIStatus CreateInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                          const CMPIObjectPath* path, const CMPIInstance* instance) {
    if (asksFor(path, "Changeable")) {
        CMReturnObjectPath(result, path);
        return done(result);
    }
    CMPIStatus found = status(CMPI_RC_OK);
    const CMPIData type = CMGetProperty(instance, "OSType", &found);
    const std::string seen =
        found.rc == CMPI_RC_OK && type.type == CMPI_uint16 ? std::to_string(type.value.uint16) : "";
    return failure(static_cast<CMPIrc>(150), "OSType " + seen);
}

CMPIStatus ModifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                          const CMPIObjectPath* path, const CMPIInstance*,
                          const char** properties) {
    if (asksFor(path, "Changeable")) {
        return done(result);
    }
    return failure(CMPI_RC_ERR_NOT_SUPPORTED, "properties " + joined(properties));
}

CMPIStatus DeleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                          const CMPIObjectPath* path) {
    return asksFor(path, "Changeable") ? done(result) : status(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus ExecQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                     const CMPIObjectPath* path, const char* query, const char* language) {
    return failure(CMPI_RC_ERR_INVALID_QUERY, std::string(language) + "|" + query + "|" +
                                                  nameSpace(path) + "|" + className(path));
}

CMPIStatus AssociationCleanup(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean) {
    return cleanedUp();
}

CMPIStatus Associators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                       const CMPIObjectPath*, const char* associationClass, const char* resultClass,
                       const char* role, const char* resultRole, const char** properties) {
    return failure(CMPI_RC_ERR_FAILED, textOr(associationClass) + "|" + textOr(resultClass) + "|" +
                                           textOr(role) + "|" + textOr(resultRole) + "|" +
                                           joined(properties));
}

CMPIStatus AssociatorNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                           const CMPIObjectPath* path, const char*, const char*, const char*,
                           const char*) {
    CMReturnObjectPath(result, operatingSystemPath(path));
    return done(result);
}

CMPIStatus References(CMPIAssociationMI*, const CMPIContext*, const CMPIResult*,
                      const CMPIObjectPath*, const char* resultClass, const char* role,
                      const char** properties) {
    return failure(CMPI_RC_ERR_FAILED,
                   textOr(resultClass) + "|" + textOr(role) + "|" + joined(properties));
}

CMPIStatus ReferenceNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                          const CMPIObjectPath*, const char*, const char*) {
    return done(result);
}

CMPIStatus MethodCleanup(CMPIMethodMI*, const CMPIContext*, CMPIBoolean) {
    return status(CMPI_RC_OK);
}

/// RequestState of a Disk: refuses all but the state 1, and names the disk itself as the worker.
CMPIStatus InvokeMethod(CMPIMethodMI*, const CMPIContext*, const CMPIResult* result,
                        const CMPIObjectPath* path, const char* method, const CMPIArgs* in,
                        CMPIArgs* out) {
    if (std::string(method) != "RequestState") {
        return failure(CMPI_RC_ERR_METHOD_NOT_FOUND, std::string("no ") + method);
    }
    const CMPIData state = CMGetArg(in, "State", nullptr);
    const CMPIUint32 answer = state.type == CMPI_uint16 && state.value.uint16 == 1 ? 0 : 1;
    CMPIValue when;
    when.dateTime = CMNewDateTimeFromChars(broker, "20240102030405.000000+000", nullptr);
    CMAddArg(out, "When", &when, CMPI_dateTime);
    CMPIValue worker;
    worker.array = CMNewArray(broker, 1, CMPI_ref, nullptr);
    CMPIValue disk;
    disk.ref = const_cast<CMPIObjectPath*>(path);
    CMSetArrayElementAt(worker.array, 0, &disk, CMPI_ref);
    CMAddArg(out, "Worker", &worker, CMPI_refA);
    CMReturnData(result, &answer, CMPI_uint32);
    return done(result);
}

}  // namespace

CMInstanceMIStub(, OperatingSystemProvider, broker, CMNoHook)
CMMethodMIStub(, OperatingSystemProvider, broker, CMNoHook)
CMAssociationMIStub(, OperatingSystemProvider, broker, CMNoHook)
CMInstanceMIStub(, OSStatusFacade, broker, CMNoHook)
CMAssociationMIStub(, OSStatusFacade, broker, CMNoHook)
CMInstanceMIStub(, ComputerSystemProvider, broker, CMNoHook)
