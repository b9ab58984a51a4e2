// The requests that are measured: every operation on every class.
#pragma once

#include "host/broker/Operation.h"

#include <string>
#include <vector>

namespace bench {

struct NamedRequest {
    std::string name;  ///< operation and class, or operation, source and association
    cmpihost::OperationRequest request;
};

/// For each of the five classes EnumerateInstances, EnumerateInstanceNames and GetInstance; for
/// each hop of an association Associators and AssociatorNames; for each class the six operations
/// that are refused. Paths are those of Setting's one node.
const std::vector<NamedRequest>& requests();

/// The request of that name, which must be one of them.
const cmpihost::OperationRequest& requestNamed(const std::string& name);

}  // namespace bench
