#ifndef FRAMEWORK_LOGGING_POSIX_FILE_H
#define FRAMEWORK_LOGGING_POSIX_FILE_H

#include <sys/stat.h>
#include <sys/types.h>

#include <cstddef>
#include <string_view>

#include "base/FileDescriptor.h"

namespace ZBLog {

/// Which file it is, whatever its name.
struct FileIdentity {
    dev_t device;
    ino_t inode;

    static FileIdentity of(const struct stat& status) { return {status.st_dev, status.st_ino}; }
    bool operator==(const FileIdentity& other) const {
        return device == other.device && inode == other.inode;
    }
    bool operator!=(const FileIdentity& other) const { return !(*this == other); }
};

/// An open file, closed at the end of this object's life. Serves one thread at a time.
///
/// A process may close descriptors that it does not know (a daemon that detaches does), and use the
/// number for something else. So an object that was opened knows which file it holds, and neither
/// names nor closes a descriptor that has become another file.
class PosixFile {
  public:
    /// Nothing open.
    PosixFile() = default;
    ~PosixFile() { close(); }
    PosixFile(const PosixFile&) = delete;
    PosixFile& operator=(const PosixFile&) = delete;

    /// Closes what is open and opens `path`, never as one of the descriptors 0 to 2, otherwise like
    /// base::FileDescriptor. Returns 0 or an error number.
    int open(const char* path, int flags, mode_t mode = 0) noexcept;

    void close() noexcept;

    /// True while the descriptor holds the file that was opened.
    bool isOpen() const noexcept;

    /// The number, meaningful while isOpen.
    int number() const noexcept { return descriptor_.number(); }

    /// The status of the file at opening; meaningful after open returned 0.
    const struct stat& status() const noexcept { return status_; }

  private:
    base::FileDescriptor descriptor_;
    struct stat status_ {};
};

struct WriteResult {
    int error;            ///< 0: everything was written; else the error number
    std::size_t written;  ///< bytes that were written in either case
};

/// Writes `bytes` with one write(2); goes on only where the system took a part of them. No signal
/// reaches the process by it: neither SIGPIPE (nobody reads the pipe any more) nor SIGXFSZ (the
/// file has reached the limit of the process), both of which would end a process that does not
/// expect them. Signal handlers are not touched, and the thread's mask is as it was afterwards.
/// Any thread may call.
WriteResult writeFully(int descriptor, std::string_view bytes) noexcept;

}  // namespace ZBLog

#endif
