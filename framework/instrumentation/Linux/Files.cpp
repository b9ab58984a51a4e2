// Requests come by the second, and most of a host's files stay as they are for months: a look costs
// one system call where reading costs four. So what was made of files is kept with the states that
// tell whether it still holds.
#include "Files.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <memory>
#include <tuple>
#include <utility>

#include "base/FileDescriptor.h"

namespace VA::Linux {

namespace {

// The coarsest clock of a file system in use, that of FAT.
constexpr std::int64_t grainSeconds = 2;

FileState::Kind kindOf(mode_t mode) {
    if (S_ISREG(mode)) return FileState::Kind::Regular;
    return S_ISDIR(mode) ? FileState::Kind::Directory : FileState::Kind::Other;
}

FileTime timeOf(const struct statx_timestamp& time) {
    return {time.tv_sec, time.tv_nsec};
}

// Of the file at `path` or, where that is empty and AT_EMPTY_PATH is among the flags, of the open
// file `file`. A file system on the network is asked anew: what it gave before may be outdated.
std::optional<FileState> stateAt(int file, const char* path, int flags) {
    struct statx info;
    constexpr unsigned int needed = STATX_TYPE | STATX_INO | STATX_SIZE | STATX_MTIME | STATX_CTIME;
    const int result = ::statx(file, path, flags | AT_NO_AUTOMOUNT | AT_STATX_FORCE_SYNC,
                               needed | STATX_BTIME, &info);
    if (result != 0 || (info.stx_mask & needed) != needed) return std::nullopt;
    FileState state;
    state.kind = kindOf(info.stx_mode);
    state.device = std::uint64_t{info.stx_dev_major} << 32 | info.stx_dev_minor;
    state.inode = info.stx_ino;
    state.size = info.stx_size;
    state.modified = timeOf(info.stx_mtime);
    state.changed = timeOf(info.stx_ctime);
    if (info.stx_mask & STATX_BTIME) state.birth = info.stx_btime.tv_sec;
    return state;
}

// Reads to the end, or past `HostFiles::maxBytes`. The end shows as a read that gives less than
// it could, without another that gives nothing, unless the file is larger than that: files of proc,
// whose size is 0, come in one piece.
std::optional<std::string> readAll(const base::FileDescriptor& file, std::uint64_t size) {
    std::string text;
    char part[4096];
    for (;;) {
        const auto count = ::read(file.number(), part, sizeof part);
        if (count < 0 && errno == EINTR) continue;
        if (count < 0) return std::nullopt;
        const auto length = static_cast<std::size_t>(count);
        text.append(part, length);
        const bool ended = length == 0 || (length < sizeof part && text.size() >= size);
        if (ended || text.size() > HostFiles::maxBytes) return text;
    }
}

struct CloseDirectory {
    void operator()(DIR* directory) const { ::closedir(directory); }
};

}  // namespace

bool operator==(const FileState& one, const FileState& other) {
    const auto parts = [](const FileState& state) {
        return std::tie(state.kind, state.device, state.inode, state.size, state.modified.seconds,
                        state.modified.nanoseconds, state.changed.seconds,
                        state.changed.nanoseconds);
    };
    return parts(one) == parts(other);
}

HostFiles::HostFiles(std::string root) : root_(std::move(root)) {
    root_.erase(root_.find_last_not_of('/') + 1);
    root_ += '/';
}

std::string HostFiles::absolute(const std::string& path) const {
    return root_ + path;
}

std::optional<FileState> HostFiles::state(const std::string& path) const {
    return stateAt(AT_FDCWD, absolute(path).c_str(), 0);
}

std::optional<FileContent> HostFiles::read(const std::string& path) const {
    const auto file = base::FileDescriptor::open(absolute(path).c_str(), O_RDONLY);
    if (!file.isOpen()) return std::nullopt;
    const auto state = stateAt(file.number(), "", AT_EMPTY_PATH);
    if (!state || state->kind != FileState::Kind::Regular) return std::nullopt;
    auto text = readAll(file, state->size);
    if (!text || text->size() > maxBytes) return FileContent{"", false, *state};
    return FileContent{*std::move(text), true, *state};
}

std::optional<std::string> HostFiles::text(const std::string& path) const {
    auto content = read(path);
    if (!content || !content->whole) return std::nullopt;
    return std::move(content->text);
}

std::optional<FileState> HostFiles::forEachName(const std::string& path,
                                                const NameVisitor& visit) const {
    // opendir sets O_CLOEXEC and opens nothing but directories.
    const std::unique_ptr<DIR, CloseDirectory> directory(::opendir(absolute(path).c_str()));
    if (!directory) return std::nullopt;
    const auto state = stateAt(::dirfd(directory.get()), "", AT_EMPTY_PATH);
    for (;;) {
        errno = 0;
        const struct dirent* entry = ::readdir(directory.get());
        if (!entry) return errno == 0 ? state : std::nullopt;
        const std::string_view name = entry->d_name;
        if (name != "." && name != "..") visit(name);
    }
}

TrackedFiles::TrackedFiles(const HostFiles& files, std::int64_t now) : files_(&files), now_(now) {}

std::optional<FileContent> TrackedFiles::read(const std::string& path) {
    const auto state = lookAt(path);
    if (!state || state->kind != FileState::Kind::Regular) return std::nullopt;
    auto content = files_->read(path);
    failed_ = failed_ || (content ? !content->whole : errno != ENOENT);
    // A size that is not that of the content, as in proc, goes with times that mean nothing.
    readWhole_ = readWhole_ && content && content->whole && content->text.size() == state->size &&
                 content->state == *state;
    return content;
}

std::optional<std::vector<std::string>> TrackedFiles::names(const std::string& directory) {
    const auto state = lookAt(directory);
    if (!state || state->kind != FileState::Kind::Directory) return std::nullopt;
    std::vector<std::string> names;
    const auto listed =
        files_->forEachName(directory, [&](std::string_view name) { names.emplace_back(name); });
    failed_ = failed_ || !listed;
    readWhole_ = readWhole_ && listed == state;
    if (!listed) return std::nullopt;
    return names;
}

std::optional<FileState> TrackedFiles::lookAt(const std::string& path) {
    auto state = files_->state(path);
    failed_ = failed_ || (!state && errno != ENOENT);
    looks_.push_back({path, state});
    return state;
}

bool TrackedFiles::isCacheable() const {
    if (!readWhole_ || looks_.size() > maxFiles || now_ < grainSeconds) return false;
    return std::all_of(looks_.begin(), looks_.end(), [this](const Look& look) {
        if (!look.state) return true;
        return std::max(look.state->modified.seconds, look.state->changed.seconds) <
               now_ - grainSeconds;
    });
}

bool TrackedFiles::areUnchanged() const {
    return std::all_of(looks_.begin(), looks_.end(),
                       [this](const Look& look) { return files_->state(look.path) == look.state; });
}

}  // namespace VA::Linux
