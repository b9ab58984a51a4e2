#ifndef ZBLOG_PATIENCE_H
#define ZBLOG_PATIENCE_H

#include <chrono>
#include <mutex>

namespace ZBLog {

/// How long a request may be held up by a lock or a reader of the output that does not move.
constexpr std::chrono::milliseconds patience{2000};

/// Waits for `mutex` with patience. The lock is empty-handed when it was not to be had: another
/// thread is stuck in it, or the process was forked while another thread held it.
inline std::unique_lock<std::timed_mutex> lockPatiently(std::timed_mutex& mutex,
                                                        std::chrono::milliseconds longest) {
    std::unique_lock<std::timed_mutex> lock(mutex, std::try_to_lock);
    if (lock.owns_lock() || longest.count() == 0) return lock;
#ifdef __SANITIZE_THREAD__
    // The sanitizer does not know the call that waits on the steady clock.
    static_cast<void>(lock.try_lock_until(std::chrono::system_clock::now() + longest));
#else
    static_cast<void>(lock.try_lock_for(longest));
#endif
    return lock;
}

}  // namespace ZBLog

#endif
