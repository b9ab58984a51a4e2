#ifndef TESTS_LOAD_REQUESTS_H
#define TESTS_LOAD_REQUESTS_H

#include <string>
#include <vector>

#include "host/broker/Operation.h"

namespace load {

/// A request, and the status that it has on any host that has a computer system.
struct MixedRequest {
    cmpihost::OperationRequest request;
    CMPIrc status;
};

/// Every operation of both interfaces, the refused ones too, on every class and on classes that are
/// not served: by the path of the class, by the path of an instance (that of an operating system
/// named `system` on a computer named `computer`, and what belongs to it), by paths whose keys name
/// nothing; the associations from every such source through every association class, through
/// another class and through none.
std::vector<MixedRequest> mixedRequests(const std::string& computer, const std::string& system);

/// The request in a line, for messages.
std::string describe(const cmpihost::OperationRequest& request);

}  // namespace load

#endif
