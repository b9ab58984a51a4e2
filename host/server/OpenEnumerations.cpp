// Results wait as the text that clients get: what it takes of memory is known to the byte, and a
// piece costs no more than its copy.
#include "host/server/OpenEnumerations.h"

#include "host/server/CimError.h"

#include <sys/random.h>

#include <algorithm>
#include <array>
#include <utility>

namespace cmpihost::server {

namespace {

/// 128 random bits in hexadecimal: nobody guesses it.
std::string randomContext() {
    std::array<unsigned char, 16> bytes{};
    // So few bytes come whole, unless the system has no such call.
    if (getrandom(bytes.data(), bytes.size(), 0) != static_cast<ssize_t>(bytes.size()))
        throw CimError(cimFailed, "the system gives no random numbers");
    std::string text;
    for (const unsigned char byte : bytes) {
        text += "0123456789abcdef"[byte >> 4];
        text += "0123456789abcdef"[byte & 15];
    }
    return text;
}

/// Takes up to `count` elements from the one at `given` on.
std::string nextElements(const WrittenResults& results, std::size_t& given, std::size_t count) {
    const std::size_t end = given + std::min(count, results.ends.size() - given);
    const std::size_t from = given == 0 ? 0 : results.ends[given - 1];
    const std::size_t to = end == 0 ? 0 : results.ends[end - 1];
    given = end;
    return results.xml.substr(from, to - from);
}

std::size_t bytesOf(const WrittenResults& results) {
    return results.xml.capacity() + results.ends.capacity() * sizeof results.ends.front();
}

}  // namespace

Piece OpenEnumerations::open(const EnumerationOwner& owner, PulledKind kind, WrittenResults results,
                             std::size_t count, std::chrono::seconds timeout) {
    if (count >= results.ends.size()) return {std::move(results.xml), ""};
    Piece piece;
    std::size_t given = 0;
    piece.xml = nextElements(results, given, count);
    results.xml.shrink_to_fit();
    results.ends.shrink_to_fit();
    const std::size_t size = bytesOf(results);
    piece.context = randomContext();

    const std::lock_guard<std::mutex> lock(mutex_);
    dropExpired();
    if (contexts_.size() >= most)
        throw CimError(cimServerLimitsExceeded, "too many enumerations are open");
    if (size > mostBytes - bytes_)
        throw CimError(cimServerLimitsExceeded,
                       "the results that wait to be pulled take too much memory");
    contexts_.emplace(piece.context, Enumeration{owner, kind, std::move(results), timeout,
                                                 now_() + timeout, given});
    bytes_ += size;
    return piece;
}

Piece OpenEnumerations::pull(const std::string& context, const EnumerationOwner& owner,
                             PulledKind kind, std::size_t count) {
    const std::lock_guard<std::mutex> lock(mutex_);
    const Contexts::iterator at = find(context, owner);
    Enumeration& enumeration = at->second;
    if (enumeration.kind != kind)
        throw CimError(cimInvalidEnumerationContext,
                       "this enumeration yields something else: pull it by another operation");
    Piece piece{nextElements(enumeration.results, enumeration.given, count), context};
    enumeration.expiry = now_() + enumeration.timeout;
    if (enumeration.given == enumeration.results.ends.size()) {
        forget(at);
        piece.context.clear();
    }
    return piece;
}

void OpenEnumerations::close(const std::string& context, const EnumerationOwner& owner) {
    const std::lock_guard<std::mutex> lock(mutex_);
    forget(find(context, owner));
}

std::size_t OpenEnumerations::size() {
    const std::lock_guard<std::mutex> lock(mutex_);
    dropExpired();
    return contexts_.size();
}

void OpenEnumerations::dropExpired() {
    const Clock::time_point now = now_();
    for (auto each = contexts_.begin(); each != contexts_.end();) {
        const auto at = each++;
        if (at->second.expiry <= now) forget(at);
    }
}

/// One of somebody else is answered like one that is not there.
OpenEnumerations::Contexts::iterator OpenEnumerations::find(const std::string& context,
                                                            const EnumerationOwner& owner) {
    dropExpired();
    const auto found = contexts_.find(context);
    if (found == contexts_.end() || !(found->second.owner == owner))
        throw CimError(cimInvalidEnumerationContext,
                       "no such enumeration is open; it may have ended or been left for too long");
    return found;
}

void OpenEnumerations::forget(Contexts::iterator at) {
    bytes_ -= bytesOf(at->second.results);
    contexts_.erase(at);
}

}  // namespace cmpihost::server
