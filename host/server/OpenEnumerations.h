#ifndef HOST_SERVER_OPEN_ENUMERATIONS_H
#define HOST_SERVER_OPEN_ENUMERATIONS_H

#include <chrono>
#include <cstddef>
#include <functional>
#include <map>
#include <mutex>
#include <optional>
#include <string>
#include <utility>
#include <vector>

/// Enumerations that clients pull piece by piece.
namespace cmpihost::server {

/// The results of an enumeration as elements of a response, one after the other.
struct WrittenResults {
    std::string xml{};
    /// Where each element ends in it.
    std::vector<std::size_t> ends{};
};

/// What the results are, and so which operation pulls them.
enum class PulledKind { InstancesWithPath, InstancePaths, Instances };

/// Whose enumeration it is: only the same user pulls it, in the namespace in which it was opened.
struct EnumerationOwner {
    std::optional<std::string> user{};
    std::string nameSpace{};

    bool operator==(const EnumerationOwner& other) const {
        return user == other.user && nameSpace == other.nameSpace;
    }
};

/// What a client gets in one piece.
struct Piece {
    std::string xml{};
    /// By which the next piece is pulled; empty: this was the last one.
    std::string context{};
};

/// The enumerations that are open. Each is forgotten when nobody asked for it for as long as its
/// time-out says; that is seen to whenever anybody asks for any. Any threads may call.
class OpenEnumerations {
  public:
    using Clock = std::chrono::steady_clock;

    /// So many are open at once, and so many bytes of results wait in all of them together.
    static constexpr std::size_t most = 64;
    static constexpr std::size_t mostBytes = 16 * 1024 * 1024;

    /// `now` tells the time, on any thread.
    explicit OpenEnumerations(std::function<Clock::time_point()> now = Clock::now)
        : now_(std::move(now)) {}

    /// Gives the first `count` results. The rest, if any, waits. Throws CimError with
    /// cimServerLimitsExceeded where there is no room for it.
    Piece open(const EnumerationOwner& owner, PulledKind kind, WrittenResults results,
               std::size_t count, std::chrono::seconds timeout);

    /// Gives the next `count` results, none for 0. Throws CimError with
    /// cimInvalidEnumerationContext for one that is not open, or not this owner's, or of another
    /// kind.
    Piece pull(const std::string& context, const EnumerationOwner& owner, PulledKind kind,
               std::size_t count);

    /// Forgets what is left, of any kind. Throws as pull() does.
    void close(const std::string& context, const EnumerationOwner& owner);

    /// How many are open.
    std::size_t size();

  private:
    struct Enumeration {
        EnumerationOwner owner;
        PulledKind kind;
        WrittenResults results;
        std::chrono::seconds timeout;
        Clock::time_point expiry;
        /// How many have been given.
        std::size_t given = 0;
    };
    using Contexts = std::map<std::string, Enumeration>;

    void dropExpired();
    Contexts::iterator find(const std::string& context, const EnumerationOwner& owner);
    void forget(Contexts::iterator at);

    const std::function<Clock::time_point()> now_;
    std::mutex mutex_;
    Contexts contexts_;
    std::size_t bytes_ = 0;
};

}  // namespace cmpihost::server

#endif
