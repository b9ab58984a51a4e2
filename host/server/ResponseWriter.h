#ifndef HOST_SERVER_RESPONSE_WRITER_H
#define HOST_SERVER_RESPONSE_WRITER_H

#include <string>

#include "host/server/Message.h"

/// Writes whole response documents. Any threads may call these.
namespace cmpihost::server {

/// Begins the response to a message, up to where the content of IMETHODRESPONSE or METHODRESPONSE
/// stands; `xml` is empty before.
void beginResponse(std::string& xml, const Message& message);
/// Ends it.
void endResponse(std::string& xml, const Message& message);

/// The response that says that the operation failed. The description is cut at 500 characters; an
/// empty one becomes "it failed".
std::string errorResponse(const Message& message, unsigned code, const std::string& description);

}  // namespace cmpihost::server

#endif
