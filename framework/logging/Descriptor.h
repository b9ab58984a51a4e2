#ifndef ZBLOG_DESCRIPTOR_H
#define ZBLOG_DESCRIPTOR_H

#include <sys/stat.h>
#include <sys/types.h>

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
class Descriptor {
  public:
    /// Nothing open.
    Descriptor() = default;
    ~Descriptor() { close(); }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;

    /// Closes what is open and opens `path`, never as one of the descriptors 0 to 2, never
    /// inherited by a child process, and without waiting for anybody. Returns 0 or an error number.
    int open(const char* path, int flags, mode_t mode = 0) noexcept;

    void close() noexcept;

    /// True while the descriptor holds the file that was opened.
    bool isOpen() const noexcept;

    /// The number, meaningful while isOpen.
    int number() const noexcept { return number_; }

    /// The status of the file at opening; meaningful after open returned 0.
    const struct stat& status() const noexcept { return status_; }

  private:
    int number_ = -1;
    struct stat status_ {};
};

}  // namespace ZBLog

#endif
