// One way to open files for all libraries that live in processes of others: such a process may fork
// and exec at any moment, and a file that makes it wait holds up all that it serves.
#include "base/FileDescriptor.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <utility>

namespace base {

FileDescriptor FileDescriptor::open(const char* path, int flags, mode_t mode) noexcept {
    int number = -1;
    do {
        number = ::open(path, flags | O_CLOEXEC | O_NONBLOCK | O_NOCTTY, mode);
    } while (number == -1 && errno == EINTR);
    return FileDescriptor(number);
}

int FileDescriptor::release() noexcept {
    return std::exchange(number_, -1);
}

void FileDescriptor::reset(int number) noexcept {
    const int closed = std::exchange(number_, number);
    if (closed < 0) return;
    const int error = errno;
    ::close(closed);
    errno = error;
}

}  // namespace base
