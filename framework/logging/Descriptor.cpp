#include "Descriptor.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>

namespace ZBLog {

namespace {

/// The same file under a number that is none of the standard streams'; -1 with errno if that fails.
int beyondStandardStreams(int number) {
    if (number == -1 || number > STDERR_FILENO) return number;
    const int moved = ::fcntl(number, F_DUPFD_CLOEXEC, STDERR_FILENO + 1);
    const int error = errno;
    ::close(number);
    errno = error;
    return moved;
}

}  // namespace

int Descriptor::open(const char* path, int flags, mode_t mode) noexcept {
    close();
    number_ = beyondStandardStreams(::open(path, flags | O_CLOEXEC | O_NONBLOCK | O_NOCTTY, mode));
    return number_ != -1 && ::fstat(number_, &status_) == 0 ? 0 : errno;
}

void Descriptor::close() noexcept {
    if (isOpen()) ::close(number_);
    number_ = -1;
}

bool Descriptor::isOpen() const noexcept {
    struct stat now {};
    return number_ != -1 && ::fstat(number_, &now) == 0 &&
           FileIdentity::of(now) == FileIdentity::of(status_);
}

}  // namespace ZBLog
