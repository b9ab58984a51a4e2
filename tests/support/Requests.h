#ifndef TESTS_SUPPORT_REQUESTS_H
#define TESTS_SUPPORT_REQUESTS_H

#include <ostream>
#include <string>
#include <vector>

#include "host/broker/ClassCatalogue.h"
#include "host/broker/Operation.h"

/// The paths and requests that tests and benchmarks ask with: one catalogue for all.

/// The classes of schema/, read once.
const cmpihost::ClassCatalogue& schemaCatalogue();

/// A path of one class in root/cimv2.
cmpihost::ObjectPathValue path(const std::string& className,
                               std::vector<cmpihost::KeyBinding> keys = {});

/// The path of the operating system named `name` on the computer `csName`, and so on.
cmpihost::ObjectPathValue operatingSystemPath(const std::string& csName, const std::string& name);
cmpihost::ObjectPathValue capabilitiesPath(const std::string& instanceId);
cmpihost::ObjectPathValue computerSystemPath(const std::string& name);

/// An association: its class, and the names of its references in their order.
struct Association {
    const char* className;
    const char* first;
    const char* second;
};
inline constexpr Association installedOS = {"KORVA_InstalledOS", "GroupComponent", "PartComponent"};
inline constexpr Association runningOS = {"KORVA_RunningOS", "Antecedent", "Dependent"};
inline constexpr Association elementCapabilities = {"KORVA_OSElementCapabilities", "ManagedElement",
                                                    "Capabilities"};

/// The path of an association with both references.
cmpihost::ObjectPathValue pairPath(const Association& association,
                                   const cmpihost::ObjectPathValue& first,
                                   const cmpihost::ObjectPathValue& second);

/// A request with a path and, for the association operations, an association class.
cmpihost::OperationRequest requestFor(cmpihost::Operation operation,
                                      const cmpihost::ObjectPathValue& path,
                                      const std::string& assocClass = "");

/// The request in a line: operation, path and association class.
std::string describe(const cmpihost::OperationRequest& request);

/// A request, and what is due for it on a host and a broker without faults.
struct NamedRequest {
    std::string name;     ///< of the request, unique, letters and digits
    std::string handler;  ///< the provider's function that answers it
    cmpihost::OperationRequest request;
    std::string message = "";  ///< of the exception that ends it; empty: none
    bool plain = false;  ///< what a client asks who follows the host's own paths: it finds them
};

std::ostream& operator<<(std::ostream& out, const NamedRequest& request);

/// A host: its computer, its first operating system, and another of its systems or the same.
struct HostNames {
    std::string computer;
    std::string system;
    std::string other;
};

/// The requests that the provider serves: each operation on each class, and each association from
/// each kind of source.
std::vector<NamedRequest> servedRequests(const HostNames& names);

/// Those that it refuses by CMPI_RC_ERR_NOT_SUPPORTED: each operation on each class.
std::vector<NamedRequest> refusedRequests();

/// Those for a class that it does not serve.
std::vector<NamedRequest> unservedRequests(const HostNames& names);

/// The requests for the facade: those that the provider serves or refuses, and those that it alone
/// answers. Their messages are empty.
std::vector<NamedRequest> facadeRequests(const HostNames& names);

/// The handlers of requests, each once, in their order.
std::vector<std::string> handlersOf(const std::vector<NamedRequest>& requests);

/// A request, and the status that it has on any host that has a computer system.
struct MixedRequest {
    cmpihost::OperationRequest request;
    CMPIrc status;
    bool mayBeNotFound = false;  ///< it depends on the host whether there is what is asked for

    bool allows(CMPIrc rc) const {
        return rc == status || (mayBeNotFound && rc == CMPI_RC_ERR_NOT_FOUND);
    }
};

/// Every operation of both interfaces, the refused ones too, on every class and on classes that are
/// not served: by the path of the class, by the path of an instance (that of an operating system
/// named `system` on a computer named `computer`, and what belongs to it), by paths whose keys name
/// nothing; the associations from every such source through every association class, through
/// another class and through none.
std::vector<MixedRequest> mixedRequests(const std::string& computer, const std::string& system);

/// The same for the facade, and what it alone tells of the three objects that there are:
/// associations and associators through any class, by role, with property lists.
std::vector<MixedRequest> mixedFacadeRequests(const std::string& computer,
                                              const std::string& system);

#endif
