#ifndef HOST_CLI_DIAGNOSTICS_H
#define HOST_CLI_DIAGNOSTICS_H

#include <string>

#include "host/broker/Operation.h"

namespace cmpihost {

/// The lines of a text as they go to the standard error: each behind "cmpihost: ".
std::string messageLines(const std::string& text);

/// A line that explains an answer or a failure: "cmpihost: note: ".
std::string noteLine(const std::string& text);

/// The name of a status with its number, as WBEM users know it: "CIM_ERR_NOT_FOUND (6)". A number
/// without a name gives "CMPI status 150".
std::string statusText(CMPIrc rc);

/// What was asked: "GetInstance of KORVA_RunningOS in root/cimv2". Safe to print on a terminal.
std::string requestText(const OperationRequest& request);

/// A failed operation in one line: the request, the status and, if there is one, its message.
std::string failureText(const OperationRequest& request, const OperationResult& result);

}  // namespace cmpihost

#endif
