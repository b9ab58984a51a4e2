#ifndef HOST_SERVER_HTTP_MESSAGE_H
#define HOST_SERVER_HTTP_MESSAGE_H

#include <chrono>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

/// HTTP requests and responses as values.
namespace cmpihost::server {

/// A whole request, as the HTTP library has read it.
struct HttpRequest {
    std::string method{};
    /// As the request line has it: "HTTP/1.1".
    std::string version{};
    std::string target{};
    /// In their order; names as they were sent.
    std::vector<std::pair<std::string, std::string>> headers{};
    std::string body{};
    /// The numeric address of the peer: "127.0.0.1", "::1", "unix".
    std::string peer{};

    /// The value of the first header of that name (without case), null for none.
    const std::string* header(std::string_view name) const;
    /// How many headers have that name.
    std::size_t count(std::string_view name) const;
};

struct HttpResponse {
    unsigned status = 200;
    /// Without Content-Length, which the server adds.
    std::vector<std::pair<std::string, std::string>> headers{};
    std::string body{};
    /// The connection ends after it.
    bool close = false;
    /// So long the client waits for it. Meanwhile the connection gives way to one of another
    /// address, where all are taken.
    std::chrono::milliseconds delay{0};
    /// For the access log: the operation, empty for none, and the CIM status of a response 200.
    std::string operation{};
    unsigned cimStatus = 0;
    std::string user{};
};

/// Answers requests. Several threads call it at once.
class HttpHandler {
  public:
    virtual ~HttpHandler() = default;
    virtual HttpResponse answer(const HttpRequest& request) = 0;

  protected:
    HttpHandler() = default;
    HttpHandler(const HttpHandler&) = default;
    HttpHandler& operator=(const HttpHandler&) = default;
};

}  // namespace cmpihost::server

#endif
