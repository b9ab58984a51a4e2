#ifndef VA_LINUX_HOST_FILES_H
#define VA_LINUX_HOST_FILES_H

#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <string_view>

namespace VA::Linux {

/// A time since the epoch, UTC.
struct Instant {
    std::int64_t seconds = 0;
    std::uint32_t nanoseconds = 0;
};

/// What tells a file, and a change of it: two looks that give equal states found the same file with
/// the same content, unless it was changed twice within the grain of its clock.
struct FileState {
    enum class Kind { Regular, Folder, Other };

    Kind kind = Kind::Other;
    std::uint64_t device = 0;
    std::uint64_t inode = 0;
    std::uint64_t size = 0;
    Instant modified;  ///< the content
    Instant changed;   ///< the content, or anything else that is kept about the file
    std::optional<std::int64_t> birth;  ///< seconds; nothing where the file system does not know
};

bool operator==(const FileState& one, const FileState& other);

/// What was read from a file that could be opened.
struct FileContent {
    std::string text;    ///< empty unless whole
    bool whole = false;  ///< false after a read error, and for more than HostFiles::mostBytes
    FileState state;     ///< as it was before the first byte was read
};

/// Read access to the files below a root folder. Paths are relative to it; symbolic links are
/// followed wherever they lead. What cannot be had is nothing; only std::bad_alloc is thrown. Any
/// number of threads may read. Tests derive from it to count, or to replace answers.
class HostFiles {
  public:
    using NameVisitor = std::function<void(std::string_view name)>;

    static constexpr std::size_t mostBytes = 1024 * 1024;

    /// An empty root, or "/", is the root folder.
    explicit HostFiles(std::string root);
    virtual ~HostFiles() = default;

    /// A look at a file or folder, without opening it; the empty path is the root. Where it gives
    /// nothing, errno tells why.
    virtual std::optional<FileState> state(const std::string& path) const;

    /// The content of a regular file, which the files of proc are too; nothing where there is none,
    /// or where it cannot be opened: errno tells which. Anything else at the path is opened and
    /// left, without waiting and without reading: where that could matter, look at its state first.
    virtual std::optional<FileContent> read(const std::string& path) const;

    /// The content where it is whole, else nothing.
    std::optional<std::string> text(const std::string& path) const;

    /// Visits the names in a folder, without "." and "..", in no order; tells the state of the
    /// folder before the first one. Nothing where not all of them could be read, so that those that
    /// were visited are not to be used.
    virtual std::optional<FileState> forEachName(const std::string& path,
                                                 const NameVisitor& visit) const;

    /// The path as the kernel takes it.
    std::string absolute(const std::string& path) const;

  private:
    std::string root_;  // with one slash at its end
};

}  // namespace VA::Linux

#endif
