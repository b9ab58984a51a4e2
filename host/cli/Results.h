#ifndef HOST_CLI_RESULTS_H
#define HOST_CLI_RESULTS_H

#include <string>
#include <vector>

#include "host/broker/Operation.h"
#include "host/cli/Printer.h"
#include "host/mof/Schema.h"

namespace cmpihost {

/// The instance without the properties that the list does not name. Keys stay, as clients expect.
InstanceValue withoutUnlisted(InstanceValue instance, const std::vector<std::string>& list,
                              const Schema& schema);

/// Prints what an operation that was answered with OK yields: paths, instances as far as they were
/// asked for, or nothing.
void printResult(const OperationRequest& request, OperationResult result, const Schema& schema,
                 Printer& printer);

}  // namespace cmpihost

#endif
