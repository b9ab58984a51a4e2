#include "WholeWrite.h"

#include <signal.h>
#include <unistd.h>

#include <cerrno>
#include <ctime>

namespace ZBLog {

namespace {

/// Keeps the signals of failing writes off this thread while it lives.
class WriteSignals {
  public:
    WriteSignals() noexcept {
        ::sigemptyset(&set_);
        ::sigaddset(&set_, SIGPIPE);
        ::sigaddset(&set_, SIGXFSZ);
        ::pthread_sigmask(SIG_BLOCK, &set_, &former_);
        // Only a signal that was blocked before can have been pending before.
        ::sigemptyset(&pending_);
        if (::sigismember(&former_, SIGPIPE) == 1 || ::sigismember(&former_, SIGXFSZ) == 1) {
            ::sigpending(&pending_);
        }
    }
    ~WriteSignals() { ::pthread_sigmask(SIG_SETMASK, &former_, nullptr); }
    WriteSignals(const WriteSignals&) = delete;
    WriteSignals& operator=(const WriteSignals&) = delete;

    /// Takes back the signal that a write raised with this error; one that was pending before
    /// stays.
    void discardSignalOf(int error) const noexcept {
        if (error == EPIPE) discard(SIGPIPE);
        if (error == EFBIG) discard(SIGXFSZ);
    }

  private:
    void discard(int signal) const noexcept {
        if (::sigismember(&pending_, signal) == 1) return;
        sigset_t raised;
        ::sigemptyset(&raised);
        ::sigaddset(&raised, signal);
        const timespec noWait{};
        ::sigtimedwait(&raised, nullptr, &noWait);
    }

    sigset_t set_{};
    sigset_t former_{};
    sigset_t pending_{};
};

}  // namespace

WriteResult writeWhole(int descriptor, std::string_view bytes) noexcept {
    const WriteSignals signals;
    std::size_t written = 0;
    while (written < bytes.size()) {
        const ssize_t count = ::write(descriptor, bytes.data() + written, bytes.size() - written);
        if (count > 0) {
            written += static_cast<std::size_t>(count);
            continue;
        }
        const int error = count == 0 ? EIO : errno;
        if (error == EINTR) continue;
        signals.discardSignalOf(error);
        return {error, written};
    }
    return {0, written};
}

}  // namespace ZBLog
