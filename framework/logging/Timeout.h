#ifndef FRAMEWORK_LOGGING_TIMEOUT_H
#define FRAMEWORK_LOGGING_TIMEOUT_H

#include <chrono>
#include <mutex>

namespace ZBLog {

/// How long a request may be held up by a lock or a reader of the output that does not move.
constexpr std::chrono::milliseconds timeout{2000};
constexpr std::chrono::milliseconds noWaiting{0};

/// Waits for `mutex` no longer than `limit`. The lock is not owned when the mutex was not to be
/// had: another thread is stuck in it, or the process was forked while another thread held it.
inline std::unique_lock<std::timed_mutex> tryLockFor(std::timed_mutex& mutex,
                                                     std::chrono::milliseconds limit) {
    std::unique_lock<std::timed_mutex> lock(mutex, std::try_to_lock);
    if (lock.owns_lock() || limit == noWaiting) return lock;
#ifdef __SANITIZE_THREAD__
    // The sanitizer does not know the call that waits on the steady clock.
    static_cast<void>(lock.try_lock_until(std::chrono::system_clock::now() + limit));
#else
    static_cast<void>(lock.try_lock_for(limit));
#endif
    return lock;
}

}  // namespace ZBLog

#endif
