// Files in a process that belongs to somebody else: it may close our descriptors, dies of signals
// that we cause, and expects its standard streams where it left them.
#include "PosixFile.h"

#include <fcntl.h>
#include <signal.h>
#include <unistd.h>

#include <cerrno>
#include <ctime>

namespace ZBLog {

namespace {

/// The same file under a number above those of the standard streams; errno says why not.
base::FileDescriptor beyondStandardStreams(base::FileDescriptor opened) {
    if (!opened.isOpen() || opened.number() > STDERR_FILENO) return opened;
    return base::FileDescriptor(::fcntl(opened.number(), F_DUPFD_CLOEXEC, STDERR_FILENO + 1));
}

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

int PosixFile::open(const char* path, int flags, mode_t mode) noexcept {
    close();
    descriptor_ = beyondStandardStreams(base::FileDescriptor::open(path, flags, mode));
    return descriptor_.isOpen() && ::fstat(number(), &status_) == 0 ? 0 : errno;
}

void PosixFile::close() noexcept {
    if (!isOpen()) static_cast<void>(descriptor_.release());
    descriptor_.reset();
}

bool PosixFile::isOpen() const noexcept {
    struct stat now {};
    return descriptor_.isOpen() && ::fstat(number(), &now) == 0 &&
           FileIdentity::of(now) == FileIdentity::of(status_);
}

WriteResult writeFully(int descriptor, std::string_view bytes) noexcept {
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
