#ifndef TESTS_LOAD_REQUESTS_H
#define TESTS_LOAD_REQUESTS_H

#include <string>
#include <vector>

#include "host/broker/Operation.h"

namespace load {

/// A built library that object managers load: its file, and the name of the provider in it.
struct Server {
    const char* file;
    const char* name;
};
constexpr Server provider = {KORVA_BINARY_DIR "/lib/libkorzbosstatusprofileprovider.so.1",
                             "OperatingSystemProvider"};
constexpr Server facade = {KORVA_BINARY_DIR "/lib/libkorvaosstatusfacade.so.1", "OSStatusFacade"};

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
std::vector<MixedRequest> facadeRequests(const std::string& computer, const std::string& system);

/// The request in a line, for messages.
std::string describe(const cmpihost::OperationRequest& request);

}  // namespace load

#endif
