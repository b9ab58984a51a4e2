#include "host/server/HttpConnections.h"

#include <sys/socket.h>

#include <algorithm>
#include <exception>
#include <utility>
#include <vector>

namespace cmpihost::server {

namespace {

using std::chrono::nanoseconds;
using Phase = HttpConnection::Phase;

constexpr const char* newerTookItsPlace = "a newer connection took its place";

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

}  // namespace

bool HttpConnections::admit(int socket, const std::string& peer) {
    std::string replacedPeer;
    {
        const std::lock_guard lock(mutex_);
        std::size_t all = 0;
        std::size_t ofPeer = 0;
        for (const auto& [number, each] : connections_) {
            if (each->cut) continue;
            ++all;
            if (each->peer == peer) ++ofPeer;
        }
        const bool peerFull = peer != "unix" && ofPeer >= limits_.connectionsOfAnAddress;
        if (peerFull || all >= limits_.connections) {
            HttpConnection* const replaced = replaceable(peer, peerFull);
            if (replaced == nullptr) return false;
            replacedPeer = replaced->peer;
            cut(*replaced);
        }
        connections_[socket] = std::make_unique<HttpConnection>(socket, peer);
    }
    if (!replacedPeer.empty()) tellCut(replacedPeer, newerTookItsPlace);
    return true;
}

bool HttpConnections::makeRoom() {
    std::string replacedPeer;
    {
        const std::lock_guard lock(mutex_);
        // One at a time: what it had is free a little later.
        if (std::any_of(connections_.begin(), connections_.end(),
                        [](const auto& each) { return each.second->cut.load(); })) {
            return true;
        }
        HttpConnection* const replaced = replaceable("", false);
        if (replaced == nullptr) return false;
        replacedPeer = replaced->peer;
        cut(*replaced);
    }
    tellCut(replacedPeer, newerTookItsPlace);
    return true;
}

/// The connection that has waited longest for a delayed response, else for a request; null for
/// none. An address that is kept waiting gains nothing by connections of its own.
HttpConnection* HttpConnections::replaceable(const std::string& peer, bool ofThatPeer) const {
    HttpConnection* delayed = nullptr;
    HttpConnection* waiting = nullptr;
    for (const auto& [number, each] : connections_) {
        const bool samePeer = each->peer == peer;
        if (each->cut || (ofThatPeer && !samePeer)) continue;
        const Phase phase = each->phase;
        const bool waits = phase == Phase::Opening || phase == Phase::Idle;
        if (!waits && (phase != Phase::Delay || samePeer)) continue;
        HttpConnection*& longest = waits ? waiting : delayed;
        if (longest == nullptr || each->since.load() < longest->since.load()) longest = each.get();
    }
    return delayed != nullptr ? delayed : waiting;
}

void HttpConnections::cut(HttpConnection& connection) {
    connection.cut = true;
    ::shutdown(connection.socket, SHUT_RDWR);
    changed_.notify_all();
}

void HttpConnections::delay(HttpConnection& connection, std::chrono::milliseconds time) {
    std::unique_lock lock(mutex_);
    connection.enter(Phase::Delay);
    changed_.wait_for(lock, time, [&] { return connection.cut || ending_; });
}

void HttpConnections::end() {
    const std::lock_guard lock(mutex_);
    ending_ = true;
    changed_.notify_all();
}

HttpConnection* HttpConnections::find(int socket) {
    const std::lock_guard lock(mutex_);
    const auto found = connections_.find(socket);
    return found == connections_.end() ? nullptr : found->second.get();
}

void HttpConnections::remove(int socket) {
    const std::lock_guard lock(mutex_);
    connections_.erase(socket);
}

bool HttpConnections::none() {
    const std::lock_guard lock(mutex_);
    return connections_.empty();
}

bool HttpConnections::crowded() {
    constexpr std::size_t mostEnding = 16;
    const std::lock_guard lock(mutex_);
    return connections_.size() >= limits_.connections + mostEnding;
}

nanoseconds HttpConnections::allowance(Phase phase) const {
    if (phase == Phase::Answer || phase == Phase::Delay) return nanoseconds::max();
    // Less for the last responses: whoever waits for the end does not wait as long as for a client.
    if (ending_) return phase == Phase::Response ? limits_.transfer / 2 : nanoseconds(-1);
    return phase == Phase::Idle ? limits_.idle : limits_.transfer;
}

void HttpConnections::cutLate() {
    std::vector<std::pair<std::string, const char*>> late;
    {
        const std::lock_guard lock(mutex_);
        for (const auto& [number, each] : connections_) {
            if (each->cut) continue;
            // In this order: no phase is taken for older than it is.
            const Phase phase = each->phase;
            const auto since = each->since.load();
            if (HttpConnection::Clock::now().time_since_epoch() - since <= allowance(phase))
                continue;
            cut(*each);
            if (!ending_ && phase != Phase::Idle) late.emplace_back(each->peer, lateness(phase));
        }
    }
    for (const auto& [peer, reason] : late) tellCut(peer, reason);
}

void HttpConnections::tellCut(const std::string& peer, const char* reason) const noexcept {
    try {
        if (events_.cut) events_.cut(peer, reason);
    } catch (const std::exception&) {
        // Whoever keeps the log has lost a line of it.
    }
}

}  // namespace cmpihost::server
