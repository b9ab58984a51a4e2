// A CMPI provider: it serves the file systems that are mounted on this host, and their association
// with the computer system. It keeps nothing between two requests, so several may run at once.
#include <cstdlib>
#include <exception>
#include <string>

#include "CmpiHelp.h"
#include "MountTable.h"

// The object manager's services. The macros at the end of the file fill it in.
static const CMPIBroker* broker;

namespace {

constexpr const char* fileSystemClass = "EXAMPLE_MountedFileSystem";
constexpr const char* hostedClass = "EXAMPLE_HostedFileSystem";
// Another provider serves it; this one asks the object manager for it.
constexpr const char* computerSystemClass = "KORVA_ComputerSystem";

// The two ends of the association.
constexpr const char* systemRole = "GroupComponent";
constexpr const char* fileSystemRole = "PartComponent";

const char* fileSystemKeys[] = {"CSCreationClassName", "CSName", "CreationClassName", "Name",
                                nullptr};
const char* hostedKeys[] = {systemRole, fileSystemRole, nullptr};

/// What the object manager hands to a request.
struct Request {
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* path;
    /// The properties that the client wants; null: all.
    const char** properties = nullptr;
};

struct Host {
    /// The path of the computer system.
    CMPIObjectPath* path;
    FileSystems fileSystems;
};
using MountedFileSystem = FileSystems::value_type;

CMPIObjectPath* newPath(const Request& request, const char* ofClass) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIObjectPath* path =
        CMNewObjectPath(broker, nameSpace(request.path).c_str(), ofClass, &status);
    return required(path, status, "object path");
}

CMPIObjectPath* fileSystemPath(const Request& request, const Host& host,
                               const MountedFileSystem& item) {
    CMPIObjectPath* path = newPath(request, fileSystemClass);
    addKey(path, "CSCreationClassName", text(keyOf(host.path, "CreationClassName")));
    addKey(path, "CSName", text(keyOf(host.path, "Name")));
    addKey(path, "CreationClassName", fileSystemClass);
    addKey(path, "Name", item.first);
    return path;
}

CMPIObjectPath* hostedPath(const Request& request, const Host& host,
                           const MountedFileSystem& item) {
    CMPIObjectPath* path = newPath(request, hostedClass);
    addKey(path, systemRole, host.path);
    addKey(path, fileSystemRole, fileSystemPath(request, host, item));
    return path;
}

/// An instance of that path, with its keys as properties.
CMPIInstance* newInstance(const Request& request, const CMPIObjectPath* path, const char** keys) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIInstance* instance = required(CMNewInstance(broker, path, &status), status, "instance");
    if (request.properties != nullptr) {
        // From here on the object manager drops what the client did not ask for.
        require(CMSetPropertyFilter(instance, request.properties, keys), "a property list");
    }
    for (; *keys != nullptr; ++keys) {
        const CMPIData key = keyOf(path, *keys);
        if (key.type == CMPI_ref) {
            set(instance, *keys, key.value.ref, CMPI_ref);
        } else {
            setText(instance, *keys, text(key));
        }
    }
    return instance;
}

CMPIInstance* fileSystemInstance(const Request& request, const Host& host,
                                 const MountedFileSystem& item) {
    const FileSystem& fileSystem = item.second;
    CMPIInstance* instance =
        newInstance(request, fileSystemPath(request, host, item), fileSystemKeys);
    setText(instance, "Device", fileSystem.device);
    setText(instance, "FileSystemType", fileSystem.type);
    set<CMPIBoolean>(instance, "ReadOnly", fileSystem.readOnly, CMPI_boolean);
    set(instance, "PersistenceType", static_cast<CMPIUint16>(fileSystem.persistence), CMPI_uint16);
    // A value that is not known is left out: zero would be a lie.
    if (fileSystem.space) {
        set<CMPIUint64>(instance, "FileSystemSize", fileSystem.space->totalBytes, CMPI_uint64);
        set<CMPIUint64>(instance, "AvailableSpace", fileSystem.space->availableBytes, CMPI_uint64);
    }
    return instance;
}

CMPIInstance* hostedInstance(const Request& request, const Host& host,
                             const MountedFileSystem& item) {
    return newInstance(request, hostedPath(request, host, item), hostedKeys);
}

/// Asks the provider of the computer system, through the object manager, and reads the mounts.
Host readHost(const Request& request) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIObjectPath* systems = newPath(request, computerSystemClass);
    CMPIEnumeration* found = CBEnumInstanceNames(broker, request.context, systems, &status);
    if (status.rc != CMPI_RC_OK || CMIsNullObject(found) || !CMHasNext(found, nullptr)) {
        throw CimError(CMPI_RC_ERR_FAILED, std::string("the computer's name is not known: no "
                                                       "provider answers for ") +
                                               computerSystemClass);
    }
    CMPIObjectPath* path = CMGetNext(found, &status).value.ref;
    required(path, status, "path of the computer system");
    // For tests. Object managers start without that variable: the provider reads its own host.
    const char* const root = std::getenv("EXAMPLE_ROOT");
    return {path, readFileSystems(root == nullptr ? "" : root)};
}

// Instance requests: both classes are asked in the same way.

struct ServedClass {
    const char* name;
    CMPIObjectPath* (*path)(const Request&, const Host&, const MountedFileSystem&);
    CMPIInstance* (*instance)(const Request&, const Host&, const MountedFileSystem&);
};

constexpr ServedClass servedClasses[] = {{fileSystemClass, fileSystemPath, fileSystemInstance},
                                         {hostedClass, hostedPath, hostedInstance}};

const ServedClass& classOf(const Request& request) {
    const std::string name = className(request.path);
    for (const ServedClass& served : servedClasses) {
        if (sameName(name, served.name)) return served;
    }
    throw CimError(CMPI_RC_ERR_INVALID_CLASS, "this provider does not serve " + name);
}

void returnPath(const Request& request, const CMPIObjectPath* path) {
    require(CMReturnObjectPath(request.result, path), "a path as a result");
}

void returnInstance(const Request& request, const CMPIInstance* instance) {
    require(CMReturnInstance(request.result, instance), "an instance as a result");
}

void enumerateNames(const Request& request) {
    const ServedClass& served = classOf(request);
    const Host host = readHost(request);
    for (const MountedFileSystem& item : host.fileSystems) {
        returnPath(request, served.path(request, host, item));
    }
}

void enumerate(const Request& request) {
    const ServedClass& served = classOf(request);
    const Host host = readHost(request);
    for (const MountedFileSystem& item : host.fileSystems) {
        returnInstance(request, served.instance(request, host, item));
    }
}

void getInstance(const Request& request) {
    const ServedClass& served = classOf(request);
    const Host host = readHost(request);
    for (const MountedFileSystem& item : host.fileSystems) {
        if (samePath(request.path, served.path(request, host, item))) {
            returnInstance(request, served.instance(request, host, item));
            return;
        }
    }
    throw CimError(CMPI_RC_ERR_NOT_FOUND, "no such file system is mounted");
}

// Association requests: from the computer system to its file systems, or back.

/// What the client narrows the answer down with; null: nothing.
struct Filters {
    const char* assocClass;
    const char* resultClass;
    const char* role;
    const char* resultRole;
};

/// One association of the source.
struct Link {
    const Host& host;
    const MountedFileSystem& item;
    const CMPIObjectPath* farEnd;
};

bool passesRole(const char* filter, const char* role) {
    return filter == nullptr || sameName(filter, role);
}

/// Clients may name a superclass, and the object manager knows the classes.
bool passesClass(const char* filter, const CMPIObjectPath* path) {
    if (filter == nullptr) return true;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const bool passes = CMClassPathIsA(broker, path, filter, &status);
    require(status, "to compare classes");
    return passes;
}

template <class Visit>
void forEachLink(const Request& request, const Filters& filters, Visit visit) {
    const Host host = readHost(request);
    const bool fromSystem = samePath(request.path, host.path);
    if (!passesRole(filters.role, fromSystem ? systemRole : fileSystemRole)) return;
    if (!passesRole(filters.resultRole, fromSystem ? fileSystemRole : systemRole)) return;
    if (!passesClass(filters.assocClass, newPath(request, hostedClass))) return;
    for (const MountedFileSystem& item : host.fileSystems) {
        const CMPIObjectPath* path = fileSystemPath(request, host, item);
        if (!fromSystem && !samePath(request.path, path)) continue;
        const CMPIObjectPath* farEnd = fromSystem ? path : host.path;
        if (passesClass(filters.resultClass, farEnd)) visit(Link{host, item, farEnd});
    }
}

/// A file system, or the computer system: its own provider knows the properties of that.
CMPIInstance* farInstance(const Request& request, const Link& link) {
    if (link.farEnd != link.host.path) return fileSystemInstance(request, link.host, link.item);
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIInstance* system =
        CBGetInstance(broker, request.context, link.farEnd, request.properties, &status);
    return required(system, status, "computer system");
}

// The functions of the interfaces. The macros at the end find them by their names.

CMPIStatus failure(CMPIrc rc, const char* message) {
    CMReturnWithChars(broker, rc, message);
}

CMPIStatus notSupported() {
    return failure(CMPI_RC_ERR_NOT_SUPPORTED, "file systems can only be looked at");
}

/// No exception may reach the object manager: it would end the whole process.
template <class Serve>
CMPIStatus answer(const Request& request, Serve serve) {
    try {
        serve(request);
        return CMReturnDone(request.result);
    } catch (const CimError& error) {
        return failure(error.rc(), error.what());
    } catch (const std::exception& error) {
        return failure(CMPI_RC_ERR_FAILED, error.what());
    }
}

CMPIStatus MountsCleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    CMReturn(CMPI_RC_OK);
}

CMPIStatus MountsEnumInstanceNames(CMPIInstanceMI*, const CMPIContext* context,
                                   const CMPIResult* result, const CMPIObjectPath* path) {
    return answer({context, result, path}, enumerateNames);
}

CMPIStatus MountsEnumInstances(CMPIInstanceMI*, const CMPIContext* context,
                               const CMPIResult* result, const CMPIObjectPath* path,
                               const char** properties) {
    return answer({context, result, path, properties}, enumerate);
}

CMPIStatus MountsGetInstance(CMPIInstanceMI*, const CMPIContext* context, const CMPIResult* result,
                             const CMPIObjectPath* path, const char** properties) {
    return answer({context, result, path, properties}, getInstance);
}

CMPIStatus MountsCreateInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                const CMPIObjectPath*, const CMPIInstance*) {
    return notSupported();
}

CMPIStatus MountsModifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                const CMPIObjectPath*, const CMPIInstance*, const char**) {
    return notSupported();
}

CMPIStatus MountsDeleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                                const CMPIObjectPath*) {
    return notSupported();
}

CMPIStatus MountsExecQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                           const CMPIObjectPath*, const char*, const char*) {
    return notSupported();
}

CMPIStatus MountsAssociationCleanup(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean) {
    CMReturn(CMPI_RC_OK);
}

CMPIStatus MountsAssociators(CMPIAssociationMI*, const CMPIContext* context,
                             const CMPIResult* result, const CMPIObjectPath* path,
                             const char* assocClass, const char* resultClass, const char* role,
                             const char* resultRole, const char** properties) {
    return answer({context, result, path, properties}, [&](const Request& request) {
        forEachLink(request, {assocClass, resultClass, role, resultRole},
                    [&](const Link& link) { returnInstance(request, farInstance(request, link)); });
    });
}

CMPIStatus MountsAssociatorNames(CMPIAssociationMI*, const CMPIContext* context,
                                 const CMPIResult* result, const CMPIObjectPath* path,
                                 const char* assocClass, const char* resultClass, const char* role,
                                 const char* resultRole) {
    return answer({context, result, path}, [&](const Request& request) {
        forEachLink(request, {assocClass, resultClass, role, resultRole},
                    [&](const Link& link) { returnPath(request, link.farEnd); });
    });
}

// References are the associations themselves: their result class is that of the association.
CMPIStatus MountsReferences(CMPIAssociationMI*, const CMPIContext* context,
                            const CMPIResult* result, const CMPIObjectPath* path,
                            const char* resultClass, const char* role, const char** properties) {
    return answer({context, result, path, properties}, [&](const Request& request) {
        forEachLink(request, {resultClass, nullptr, role, nullptr}, [&](const Link& link) {
            returnInstance(request, hostedInstance(request, link.host, link.item));
        });
    });
}

CMPIStatus MountsReferenceNames(CMPIAssociationMI*, const CMPIContext* context,
                                const CMPIResult* result, const CMPIObjectPath* path,
                                const char* resultClass, const char* role) {
    return answer({context, result, path}, [&](const Request& request) {
        forEachLink(request, {resultClass, nullptr, role, nullptr}, [&](const Link& link) {
            returnPath(request, hostedPath(request, link.host, link.item));
        });
    });
}

}  // namespace

// The tables of those functions, and the exported functions that hand them out:
// MountedFileSystemProvider_Create_InstanceMI and MountedFileSystemProvider_Create_AssociationMI.
CMInstanceMIStub(Mounts, MountedFileSystemProvider, broker, CMNoHook)
CMAssociationMIStub(Mounts, MountedFileSystemProvider, broker, CMNoHook)
