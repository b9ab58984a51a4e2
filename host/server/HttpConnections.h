#ifndef HOST_SERVER_HTTP_CONNECTIONS_H
#define HOST_SERVER_HTTP_CONNECTIONS_H

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <map>
#include <memory>
#include <mutex>
#include <string>

#include "host/server/HttpServer.h"

/// The connections of an HTTP server: how many there may be and how long each may take.
namespace cmpihost::server {

/// One connection. But for what is atomic it is its own thread's alone.
struct HttpConnection {
    using Clock = std::chrono::steady_clock;

    /// What it is at; Opening and Idle wait for a request line.
    enum class Phase { Opening, Idle, Header, Body, Answer, Delay, Response };

    HttpConnection(int socketNumber, std::string peerAddress)
        : socket(socketNumber), peer(std::move(peerAddress)) {}

    void enter(Phase next) noexcept {
        since = Clock::now().time_since_epoch();
        phase = next;
    }

    const int socket;
    const std::string peer;
    std::atomic<Phase> phase = Phase::Opening;
    std::atomic<Clock::duration> since = Clock::now().time_since_epoch();
    /// It is ending, for a reason that has been told.
    std::atomic<bool> cut = false;

    /// The request that is being read or answered, and its response.
    HttpRequest request{};
    HttpResponse response{};
    /// The header has been looked at.
    bool begun = false;
    /// There is a response, and since when it was worked on.
    bool answered = false;
    Clock::time_point asked{};
};

/// Any threads may call it.
class HttpConnections {
  public:
    HttpConnections(const HttpLimits& limits, const HttpEvents& events)
        : limits_(limits), events_(events) {}

    /// Takes a new connection in; false where there are too many.
    bool admit(int socket, const std::string& peer);
    /// Has the connection that has waited longest give way where descriptors or memory are short;
    /// false where none is ending then.
    bool makeRoom();
    /// The connection with that socket, null for none; it is there until remove().
    HttpConnection* find(int socket);
    /// Forgets a connection, before its socket is closed.
    void remove(int socket);

    /// Lets the time pass, or less where the connection is cut or all of them end. A client that
    /// leaves does not shorten it.
    void delay(HttpConnection& connection, std::chrono::milliseconds time);

    /// Shuts the sockets of those that take too long, which makes their threads end them.
    void cutLate();
    /// From now on those that wait for a request or are reading one are late, responses have half
    /// of their time, and none is delayed.
    void end();
    bool ending() const noexcept { return ending_; }
    bool none();
    /// Whether many that were cut have not ended yet.
    bool crowded();

    /// Tells why a connection is refused or cut.
    void tellCut(const std::string& peer, const char* reason) const noexcept;

  private:
    std::chrono::nanoseconds allowance(HttpConnection::Phase phase) const;
    HttpConnection* replaceable(const std::string& peer, bool ofThatPeer) const;
    void cut(HttpConnection& connection);

    const HttpLimits& limits_;
    const HttpEvents& events_;
    std::atomic<bool> ending_ = false;
    std::mutex mutex_;
    std::condition_variable changed_;
    std::map<int, std::unique_ptr<HttpConnection>> connections_;
};

}  // namespace cmpihost::server

#endif
