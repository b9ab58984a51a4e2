#ifndef HOST_SERVER_HTTP_SERVER_H
#define HOST_SERVER_HTTP_SERVER_H

#include <chrono>
#include <cstddef>
#include <functional>
#include <memory>
#include <string>

#include "base/FileDescriptor.h"
#include "host/server/HttpMessage.h"

namespace cmpihost::server {

/// What a server withstands.
struct HttpLimits {
    unsigned connections = 64;
    /// Of one numeric address; those of a unix socket have none.
    unsigned connectionsOfAnAddress = 16;
    std::size_t headerBytes = 8192;
    std::size_t headerFields = 64;
    std::size_t bodyBytes = 1024 * 1024;
    /// For the first request line, for each whole header after it, for each whole body, for each
    /// whole response.
    std::chrono::milliseconds transfer = std::chrono::seconds(10);
    /// For the next request line on a kept connection.
    std::chrono::milliseconds idle = std::chrono::seconds(60);
};

/// What a server tells of its work. Several threads call these at once; what they throw is lost.
struct HttpEvents {
    /// After each response, whether or not the client took it; the time is that from the whole
    /// request until then.
    std::function<void(const HttpRequest&, const HttpResponse&, std::chrono::nanoseconds)>
        answered{};
    /// A connection was refused, or cut while a request or response was on its way: who, and why in
    /// a few ASCII words. The peer is empty where no connection could be accepted.
    std::function<void(const std::string& peer, const char* reason)> cut{};
};

/// A certificate chain and its key, as the texts of PEM files.
struct TlsIdentity {
    std::string certificate;
    std::string key;
};

/// An HTTP/1.1 server on one listening socket (IPv4, IPv6 or unix), with a thread for each
/// connection. Where all connections are taken, a new one replaces the one that has waited longest
/// for a delayed response, else for a request. Any thread may call it, one at a time, but none that
/// answers a request.
class HttpServer {
  public:
    /// Starts to serve. `tls` null: without TLS; it is read here only. The handler outlives the
    /// server. Throws std::runtime_error when it cannot start, with the reason.
    HttpServer(base::FileDescriptor listener, HttpHandler& handler, const HttpLimits& limits,
               const TlsIdentity* tls = nullptr, HttpEvents events = {});
    /// Ends when the requests that run have been answered; connections without one end at once, and
    /// clients have half of `transfer` to take the last responses.
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
