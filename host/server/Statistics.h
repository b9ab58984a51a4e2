#ifndef HOST_SERVER_STATISTICS_H
#define HOST_SERVER_STATISTICS_H

#include <atomic>
#include <chrono>
#include <cstdint>

namespace cmpihost::server {

/// What the server did since it started. Any threads may count and read.
class Statistics {
  public:
    using Clock = std::chrono::steady_clock;

    /// Counts an operation or method that was answered; `failed`: with a CIM status other than OK.
    void countOperation(std::chrono::nanoseconds took, bool failed) noexcept {
        operations_.fetch_add(1, std::memory_order_relaxed);
        if (failed) failures_.fetch_add(1, std::memory_order_relaxed);
        nanoseconds_.fetch_add(static_cast<std::uint64_t>(took.count()), std::memory_order_relaxed);
    }
    /// Counts a request that was answered with an HTTP status other than 200.
    void countRefusal() noexcept { refusals_.fetch_add(1, std::memory_order_relaxed); }

    /// Counts a connection that was refused, or cut with a request under way.
    void countCut() noexcept { cuts_.fetch_add(1, std::memory_order_relaxed); }

    std::uint64_t operations() const noexcept { return operations_; }
    std::uint64_t failures() const noexcept { return failures_; }
    std::uint64_t refusals() const noexcept { return refusals_; }
    std::uint64_t cuts() const noexcept { return cuts_; }
    /// The time that operations took, in sum.
    std::chrono::nanoseconds busyTime() const noexcept {
        return std::chrono::nanoseconds(nanoseconds_.load());
    }
    std::chrono::nanoseconds upTime() const noexcept { return Clock::now() - start_; }

  private:
    const Clock::time_point start_ = Clock::now();
    std::atomic<std::uint64_t> operations_ = 0;
    std::atomic<std::uint64_t> failures_ = 0;
    std::atomic<std::uint64_t> refusals_ = 0;
    std::atomic<std::uint64_t> cuts_ = 0;
    std::atomic<std::uint64_t> nanoseconds_ = 0;
};

}  // namespace cmpihost::server

#endif
