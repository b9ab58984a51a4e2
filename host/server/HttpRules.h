#ifndef HOST_SERVER_HTTP_RULES_H
#define HOST_SERVER_HTTP_RULES_H

#include <cstddef>

#include "host/server/HttpServer.h"

namespace cmpihost::server {

/// Judges a request by its request line and header alone, before its body is read: the HTTP status
/// with which it and its connection end, 0 for a request that may go on. It refuses whatever two
/// programs might read in two ways, above all how long the body is. `headerBytes` is the size of
/// the header as it was sent. Any thread may call it.
unsigned refusalOfHeader(const HttpRequest& request, std::size_t headerBytes,
                         const HttpLimits& limits);

}  // namespace cmpihost::server

#endif
