#ifndef HOST_CLI_DIAGNOSTICS_H
#define HOST_CLI_DIAGNOSTICS_H

#include <string>

#include "host/broker/Operation.h"
#include "host/mof/Schema.h"

namespace cmpihost {

/// The name of a status with its number, as WBEM users know it: "CIM_ERR_NOT_FOUND (6)". A number
/// without a name gives "CMPI status 150".
std::string statusText(CMPIrc rc);

/// A failed operation in one line: the status and, if there is one, its message.
std::string failureText(const OperationResult& result);

/// What a user should know about an answer that is no failure: that an object manager would do
/// otherwise with it, that a name in the property list is that of no declared property, that an
/// association request was answered with nothing and the schema does not know one of its names.
/// Lines that begin with "note: ", safe to print on a terminal; empty when there is nothing to
/// say.
std::string notesOn(const OperationRequest& request, const OperationResult& result,
                    const Schema& schema);

/// How to mend a request that failed, in lines that begin with "hint: "; empty when the failure
/// gives no clue.
std::string hintFor(const OperationRequest& request, const OperationResult& failure,
                    const Schema& schema);

}  // namespace cmpihost

#endif
