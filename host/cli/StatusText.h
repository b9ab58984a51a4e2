#pragma once

#include <string>

#include "host/broker/Operation.h"

namespace cmpihost {

/// The name of a status with its number, as WBEM users know it: "CIM_ERR_NOT_FOUND (6)". A number
/// without a name gives "CMPI status 150".
std::string statusText(CMPIrc rc);

/// A failed operation in one line: the status and, if there is one, its message.
std::string failureText(const OperationResult& result);

}  // namespace cmpihost
