#ifndef TESTS_HOST_SERVER_HTTP_TEST_SERVER_H
#define TESTS_HOST_SERVER_HTTP_TEST_SERVER_H

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <thread>
#include <utility>
#include <vector>

#include "base/FileDescriptor.h"
#include "host/server/HttpServer.h"

/// A server with a plain handler, and clients that send it bytes.
namespace cmpihost::server::fixture {

/// A socket that listens on a free port of 127.0.0.1, and its port.
base::FileDescriptor listeningSocket();
std::uint16_t portOf(int socket);

/// A connection to 127.0.0.1. What waits gives up after five seconds.
class HttpTestClient {
  public:
    /// `source` is an address of the client, 127.x.y.z; `receiveBuffer` is that of its socket, 0
    /// for the usual one.
    explicit HttpTestClient(std::uint16_t port, const char* source = "127.0.0.1",
                            int receiveBuffer = 0);
    /// Over a socket that is connected.
    explicit HttpTestClient(base::FileDescriptor socket) : socket_(std::move(socket)) {}

    /// False where the connection has ended.
    bool send(std::string_view bytes);
    /// The next response, header and body; what there is of it where the connection ends.
    std::string receive();
    /// All until the connection ends; "(open)" behind it where it does not.
    std::string receiveAll();
    /// Whether the connection has ended, without waiting.
    bool hasEnded();
    /// Ends the connection with a reset.
    void reset();
    int socket() const noexcept { return socket_.number(); }

  private:
    bool read();

    base::FileDescriptor socket_;
    std::string unread_{};
};

/// "POST", a target and a body.
std::string httpPost(const std::string& target, const std::string& body = {});

/// Answers "TARGET BYTES", the bytes of the body. /wait waits until open() was called, /throw
/// throws, /big answers 8 MiB, /delay delays its answer.
class PlainHandler final : public HttpHandler {
  public:
    /// To be set before the first request.
    std::chrono::milliseconds delay{50};

    HttpResponse answer(const HttpRequest& request) override;
    void open();
    /// Waits until that many requests have come.
    void await(unsigned requests);
    unsigned requests() const noexcept { return requests_; }
    HttpRequest lastRequest();

  private:
    std::atomic<unsigned> requests_ = 0;
    std::mutex mutex_;
    std::condition_variable changed_;
    bool isOpen_ = false;
    HttpRequest last_{};
};

class HttpTestServer {
  public:
    explicit HttpTestServer(const HttpLimits& limits = {}, const TlsIdentity* tls = nullptr);
    explicit HttpTestServer(base::FileDescriptor listener);
    /// Lets what waits in the handler go on.
    ~HttpTestServer();
    HttpTestServer(const HttpTestServer&) = delete;
    HttpTestServer& operator=(const HttpTestServer&) = delete;

    std::uint16_t port() const noexcept { return port_; }
    /// "PEER: REASON" of connections that were refused or cut, sorted.
    std::vector<std::string> cuts();
    /// "PEER TARGET STATUS" of requests that were answered, sorted.
    std::vector<std::string> answers();

  private:
    HttpEvents events();

    std::uint16_t port_ = 0;
    std::mutex mutex_;
    std::vector<std::string> cuts_{};
    std::vector<std::string> answers_{};

  public:
    PlainHandler handler{};
    /// May be ended early.
    std::unique_ptr<HttpServer> server{};
};

/// Waits until something holds, for at most two seconds; whether it does.
template <typename Condition>
bool soon(Condition holds) {
    for (int attempt = 0; attempt < 1000; ++attempt) {
        if (holds()) return true;
        std::this_thread::sleep_for(std::chrono::milliseconds(2));
    }
    return holds();
}

/// What the process has open, and how many threads.
std::size_t openDescriptors();
std::size_t runningThreads();

}  // namespace cmpihost::server::fixture

#endif
