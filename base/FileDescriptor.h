#ifndef BASE_FILE_DESCRIPTOR_H
#define BASE_FILE_DESCRIPTOR_H

#include <sys/types.h>

namespace base {

/// Owns an open file of the process and closes it at the end of its life. Serves one thread at a
/// time.
class FileDescriptor {
  public:
    /// Nothing open.
    FileDescriptor() = default;
    /// Takes a descriptor over; -1, which system calls return when they fail, is no descriptor.
    explicit FileDescriptor(int number) noexcept : number_(number) {}
    ~FileDescriptor() { reset(); }
    FileDescriptor(FileDescriptor&& other) noexcept : number_(other.release()) {}
    FileDescriptor& operator=(FileDescriptor&& other) noexcept {
        reset(other.release());
        return *this;
    }

    /// Opens a file with the flags and mode of open(2); no child process inherits it, it does not
    /// become the controlling terminal, and nobody is waited for (a FIFO without a reader, a
    /// device). Where it is not open afterwards, errno says why.
    static FileDescriptor open(const char* path, int flags, mode_t mode = 0) noexcept;

    bool isOpen() const noexcept { return number_ >= 0; }

    /// The number, negative when nothing is open. It stays this object's.
    int number() const noexcept { return number_; }

    /// Gives the descriptor away without closing it.
    int release() noexcept;

    /// Closes what is open and takes over `number`. errno is left alone.
    void reset(int number = -1) noexcept;

  private:
    int number_ = -1;
};

}  // namespace base

#endif
