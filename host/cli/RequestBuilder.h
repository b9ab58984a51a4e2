#ifndef HOST_CLI_REQUEST_BUILDER_H
#define HOST_CLI_REQUEST_BUILDER_H

#include "host/broker/ClassCatalogue.h"
#include "host/broker/Operation.h"
#include "host/cli/CommandLine.h"
#include "host/mof/Schema.h"

namespace cmpihost {

/// Reads the texts of a command line: the path, the values, the names. Values take the types that
/// the schema declares; those of a class that it does not know are texts. Throws UsageError, and
/// PathError for a path that is none.
OperationRequest buildRequest(const CommandLine& commandLine, const Schema& schema,
                              const ClassCatalogue& catalogue);

}  // namespace cmpihost

#endif
