#include "host/server/HttpServer.h"

#include <microhttpd.h>

namespace cmpihost::server {

class HttpServer::Daemon {};

HttpServer::HttpServer(base::FileDescriptor, HttpHandler&, const HttpLimits&, const TlsIdentity*) {}
HttpServer::~HttpServer() = default;
base::FileDescriptor HttpServer::stopListening() {
    return {};
}

}  // namespace cmpihost::server
