#ifndef HOST_CLI_NAME_NOTES_H
#define HOST_CLI_NAME_NOTES_H

#include <string>

#include "host/broker/Operation.h"
#include "host/mof/Schema.h"

namespace cmpihost {

/// What the schema makes of the names in a request, in the light of its answer: a class, key, role
/// or method that it does not have when the answer is a failure or empty, a property in the list
/// that no class of the answer declares, an association that the request should have named. Each
/// with the names that may be meant. Lines for the standard error, see noteLine(); empty when there
/// is nothing to say.
std::string notesOnNames(const OperationRequest& request, const OperationResult& result,
                         const Schema& schema);

}  // namespace cmpihost

#endif
