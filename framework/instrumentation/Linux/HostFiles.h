#ifndef VA_LINUX_HOST_FILES_H
#define VA_LINUX_HOST_FILES_H

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace VA::Linux {

/// Dates of a file, in seconds since the epoch, UTC.
struct FileDates {
    std::optional<std::int64_t> birth;  ///< nothing where the file system keeps none
    std::int64_t change = 0;            ///< of the inode
};

/// What was read from a file that could be opened.
struct FileContent {
    std::string text;    ///< empty unless whole
    bool whole = false;  ///< false after a read error, and for more than HostFiles::mostBytes
};

/// Read access to the files below a root folder. Paths are relative to it; symbolic links are
/// followed wherever they lead. What cannot be had is nothing; only std::bad_alloc is thrown. Any
/// number of threads may read. Tests derive from it to count, or to replace answers.
class HostFiles {
  public:
    static constexpr std::size_t mostBytes = 1024 * 1024;

    /// An empty root, or "/", is the root folder.
    explicit HostFiles(std::string root);
    virtual ~HostFiles() = default;

    /// The content of a regular file, which the files of proc are too; nothing where it cannot be
    /// opened. Never blocks on a FIFO or a device: those are not opened.
    virtual std::optional<FileContent> read(const std::string& path) const;

    /// The content where it is whole, else nothing.
    std::optional<std::string> text(const std::string& path) const;

    /// The names in a folder, without "." and "..", in no order.
    virtual std::optional<std::vector<std::string>> names(const std::string& path) const;

    /// The dates of a file or folder; the empty path is the root.
    virtual std::optional<FileDates> dates(const std::string& path) const;

    virtual bool isFolder(const std::string& path) const;

    /// The path as the kernel takes it.
    std::string absolute(const std::string& path) const;

  private:
    std::string root_;  // without a slash at its end
};

}  // namespace VA::Linux

#endif
