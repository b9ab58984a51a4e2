#ifndef HOST_CLI_EXPLANATION_H
#define HOST_CLI_EXPLANATION_H

#include <functional>
#include <string>

#include "host/broker/Operation.h"
#include "host/mof/Schema.h"

namespace cmpihost {

/// Whether an operation that is to return something was answered with nothing, and no failure.
bool isEmptyAnswer(const OperationRequest& request, const OperationResult& result);

/// Why the request was answered with nothing: that the class has no instance, which filter lets
/// nothing through, that the source of an association is not there. `ask` answers the questions
/// that this takes, for an association request one for each filter and two more at most. Lines for
/// the standard error, see noteLine().
std::string reasonForNothing(const OperationRequest& request, const Schema& schema,
                             const std::function<OperationResult(const OperationRequest&)>& ask);

}  // namespace cmpihost

#endif
