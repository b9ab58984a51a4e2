#include "host/server/HttpConnections.h"

#include <sys/socket.h>

#include <algorithm>
#include <exception>

namespace cmpihost::server {

namespace {

using Phase = HttpConnection::Phase;

bool awaitsRequest(Phase phase) {
    return phase == Phase::Opening || phase == Phase::Idle;
}

const char* lateness(Phase phase) {
    switch (phase) {
        case Phase::Opening:
            return "no request came in time";
        case Phase::Header:
            return "the header was not complete in time";
        case Phase::Body:
            return "the body was not complete in time";
        default:
            return "the response was not taken in time";
    }
}

void cutConnection(HttpConnection& connection) {
    connection.cut = true;
    ::shutdown(connection.socket, SHUT_RDWR);
}

}  // namespace

HttpConnection* HttpConnections::admit(int socket, const std::string& peer) {
    const std::lock_guard lock(mutex_);
    if (ending_) return nullptr;
    // Those that were cut are on their way out.
    std::size_t all = 0;
    std::size_t ofPeer = 0;
    for (const auto& [number, each] : connections_) {
        if (each->cut) continue;
        ++all;
        if (each->peer == peer) ++ofPeer;
    }
    const bool peerFull = peer != "unix" && ofPeer >= limits_.connectionsOfAnAddress;
    if ((peerFull || all >= limits_.connections) && !makeRoom(peer, peerFull)) return nullptr;
    auto& place = connections_[socket];
    place = std::make_unique<HttpConnection>(socket, peer);
    return place.get();
}

/// Cuts the connection that has waited longest for a request; one that has a request is never cut.
bool HttpConnections::makeRoom(const std::string& peer, bool ofThatPeer) {
    HttpConnection* longest = nullptr;
    for (const auto& [number, each] : connections_) {
        if (each->cut || !awaitsRequest(each->phase)) continue;
        if (ofThatPeer && each->peer != peer) continue;
        if (longest == nullptr || each->since.load() < longest->since.load()) longest = each.get();
    }
    if (longest == nullptr) return false;
    cutConnection(*longest);
    return true;
}

HttpConnection* HttpConnections::find(int socket) {
    const std::lock_guard lock(mutex_);
    const auto found = connections_.find(socket);
    return found == connections_.end() ? nullptr : found->second.get();
}

void HttpConnections::remove(int socket) {
    const std::lock_guard lock(mutex_);
    connections_.erase(socket);
    removed_.notify_all();
}

std::chrono::nanoseconds HttpConnections::allowance(Phase phase) const {
    if (phase == Phase::Answer) return std::chrono::nanoseconds::max();
    if (ending_ && phase != Phase::Response) return std::chrono::nanoseconds(-1);
    return phase == Phase::Idle ? limits_.idle : limits_.transfer;
}

void HttpConnections::cutLate() {
    const std::lock_guard lock(mutex_);
    for (const auto& [number, each] : connections_) {
        if (each->cut) continue;
        // `since` first: it is written first, so a phase is never older than its time.
        const auto since = each->since.load();
        const Phase phase = each->phase;
        if (HttpConnection::Clock::now().time_since_epoch() - since <= allowance(phase)) continue;
        cutConnection(*each);
        if (!ending_ && phase != Phase::Idle && events_.cut)
            events_.cut(each->peer, lateness(phase));
    }
}

void HttpConnections::awaitNone() {
    std::unique_lock lock(mutex_);
    removed_.wait(lock, [this] { return connections_.empty(); });
}

bool HttpConnections::none() {
    const std::lock_guard lock(mutex_);
    return connections_.empty();
}

}  // namespace cmpihost::server
