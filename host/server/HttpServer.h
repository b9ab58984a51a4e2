#ifndef HOST_SERVER_HTTP_SERVER_H
#define HOST_SERVER_HTTP_SERVER_H

#include <chrono>
#include <cstddef>
#include <memory>
#include <string>

#include "base/FileDescriptor.h"
#include "host/server/HttpMessage.h"

namespace cmpihost::server {

/// What a server withstands.
struct HttpLimits {
    unsigned connections = 64;
    unsigned connectionsOfAnAddress = 16;
    std::size_t headerBytes = 8192;
    std::size_t bodyBytes = 1024 * 1024;
    /// For the whole header, the whole body, the whole response.
    std::chrono::seconds transfer{10};
    /// For the next request on a kept connection.
    std::chrono::seconds idle{60};
};

/// A certificate chain and its key, as the texts of PEM files.
struct TlsIdentity {
    std::string certificate;
    std::string key;
};

/// An HTTP/1.1 server on one listening socket, with a thread for each connection.
class HttpServer {
  public:
    /// Starts to serve. `tls` null: without TLS. The handler outlives the server. Throws
    /// std::runtime_error when it cannot start, with the reason.
    HttpServer(base::FileDescriptor listener, HttpHandler& handler, const HttpLimits& limits,
               const TlsIdentity* tls = nullptr);
    /// Ends when the requests that run have been answered.
    ~HttpServer();
    HttpServer(const HttpServer&) = delete;
    HttpServer& operator=(const HttpServer&) = delete;

    /// Accepts no connection any more and gives the listening socket back, for another server;
    /// connections that are there go on.
    base::FileDescriptor stopListening();

  private:
    class Daemon;
    std::unique_ptr<Daemon> daemon_;
};

}  // namespace cmpihost::server

#endif
