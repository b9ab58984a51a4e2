#ifndef FRAMEWORK_INSTRUMENTATION_LINUX_FILES_H
#define FRAMEWORK_INSTRUMENTATION_LINUX_FILES_H

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Kernel.h"

/// The files of a host: read, and what was made of them kept from one request to the next.
namespace VA::Linux {

/// A time since the epoch, UTC.
struct FileTime {
    std::int64_t seconds = 0;
    std::uint32_t nanoseconds = 0;
};

/// What identifies a file and its state: two looks that give equal states found the same file with
/// the same content, unless it was changed twice within the grain of its clock.
struct FileState {
    enum class Kind { Regular, Directory, Other };

    Kind kind = Kind::Other;
    std::uint64_t device = 0;
    std::uint64_t inode = 0;
    std::uint64_t size = 0;
    FileTime modified;  ///< the content
    FileTime changed;   ///< the content, or anything else that is kept about the file
    std::optional<std::int64_t> birth;  ///< seconds; nullopt if the file system does not know
};

/// The birth does not count: it says nothing about a change.
bool operator==(const FileState& one, const FileState& other);

/// What was read from a file that could be opened.
struct FileContent {
    std::string text;    ///< empty unless whole
    bool whole = false;  ///< false after a read error, and for more than HostFiles::maxBytes
    FileState state;     ///< as it was before the first byte was read
};

/// Read access to the files below a root directory. Paths are relative to it; symbolic links are
/// followed wherever they lead. Returns nullopt for what cannot be had; only std::bad_alloc is
/// thrown. Any number of threads may read. Tests derive from it to count, or to replace answers.
class HostFiles {
  public:
    using NameVisitor = std::function<void(std::string_view name)>;

    static constexpr std::size_t maxBytes = 1024 * 1024;

    /// An empty root, or "/", is the root directory.
    explicit HostFiles(std::string root);
    virtual ~HostFiles() = default;

    /// A look at a file or directory, without opening it; the empty path is the root. Where it
    /// gives nullopt, errno says why.
    virtual std::optional<FileState> state(const std::string& path) const;

    /// The content of a regular file, which the files of proc are too; nullopt if there is none,
    /// or if it cannot be opened: errno says which. Anything else at the path is opened and
    /// left, without waiting and without reading: where that could matter, look at its state first.
    virtual std::optional<FileContent> read(const std::string& path) const;

    /// The content if it is whole, else nullopt.
    std::optional<std::string> text(const std::string& path) const;

    /// Visits the names in a directory, without "." and "..", in no order; passes the state of the
    /// directory before the first one. Returns nullopt if not all of them could be read, so that
    /// those that were visited are not to be used.
    virtual std::optional<FileState> forEachName(const std::string& path,
                                                 const NameVisitor& visit) const;

    /// The path as the kernel takes it.
    std::string absolute(const std::string& path) const;

  private:
    std::string root_;  // with one slash at its end
};

/// The files that a value is made of: reads them, and says later whether the value still holds.
/// Each is looked at before it is opened; only what is a regular file, or a directory, is opened.
/// One thread makes the value; then any number of threads may ask.
class TrackedFiles {
  public:
    /// So many files may a value be made of that is to be kept.
    static constexpr std::size_t maxFiles = 256;

    /// `now` is the time in seconds since the epoch, not later than the first read. The files
    /// outlive this object.
    TrackedFiles(const HostFiles& files, std::int64_t now);

    std::optional<FileContent> read(const std::string& path);
    std::optional<std::vector<std::string>> names(const std::string& directory);

    /// True when a file or directory that was not simply missing could not be looked at, opened or
    /// read whole.
    bool failed() const { return failed_; }

    /// True when a later look can tell whether the value still holds: every file was read whole and
    /// none was changed so short a time before that another change could bear the same time.
    bool isCacheable() const;

    /// True when every file is as it was, those that were not there included. Takes one look each.
    bool areUnchanged() const;

  private:
    struct Look {
        std::string path;
        std::optional<FileState> state;
    };

    std::optional<FileState> lookAt(const std::string& path);

    const HostFiles* files_;
    std::int64_t now_;
    bool readWhole_ = true;
    bool failed_ = false;
    std::vector<Look> looks_;
};

/// What one request leaves for the next. Any number of threads may use it; none waits for another:
/// one that finds it in another's hands gets nothing and leaves nothing. So does, for good, a child
/// of a process that was forked at that moment.
template <class T>
class CacheSlot {
  public:
    /// What was left last; null where nothing was.
    std::shared_ptr<const T> get() {
        const Lock lock(mutex_, std::try_to_lock);
        return lock ? value_ : nullptr;
    }

    void put(std::shared_ptr<const T> value) {
        const Lock lock(mutex_, std::try_to_lock);
        if (lock) value_.swap(value);
    }

  private:
    using Lock = std::unique_lock<std::mutex>;

    std::mutex mutex_;
    std::shared_ptr<const T> value_;
};

/// A value made of files, kept from one request to the next while the files stay as they are. Any
/// number of threads may ask.
template <class T>
class FileCache {
  public:
    /// The value that `make(TrackedFiles&)` makes of the files as they are now. It is called only
    /// where the value kept does not hold any more. `files` are the same ones in every call, and
    /// outlive this object.
    template <class Make>
    std::shared_ptr<const T> get(const HostFiles& files, const Kernel& kernel, Make make) {
        if (auto kept = slot_.get(); kept && kept->sources.areUnchanged()) {
            return {kept, &kept->value};
        }
        TrackedFiles sources(files, kernel.now());
        T value = make(sources);
        auto made = std::make_shared<const Entry>(Entry{std::move(value), std::move(sources)});
        if (made->sources.isCacheable()) slot_.put(made);
        return {made, &made->value};
    }

  private:
    struct Entry {
        T value;
        TrackedFiles sources;
    };

    CacheSlot<Entry> slot_;
};

}  // namespace VA::Linux

#endif
