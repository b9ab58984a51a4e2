#include "HostFiles.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <memory>
#include <tuple>
#include <utility>

namespace VA::Linux {

namespace {

class Descriptor {
  public:
    explicit Descriptor(int number) : number_(number) {}
    ~Descriptor() {
        if (number_ >= 0) ::close(number_);
    }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;
    int number() const { return number_; }

  private:
    int number_;
};

template <class Call>
auto retried(Call call) {
    auto result = call();
    while (result == -1 && errno == EINTR) result = call();
    return result;
}

FileState::Kind kindOf(mode_t mode) {
    if (S_ISREG(mode)) return FileState::Kind::Regular;
    return S_ISDIR(mode) ? FileState::Kind::Folder : FileState::Kind::Other;
}

Instant instantOf(const struct statx_timestamp& time) {
    return {time.tv_sec, time.tv_nsec};
}

// Of the file at `path` or, where that is empty and AT_EMPTY_PATH is among the flags, of the open
// file `file`. A file system on the network is asked anew: what it told before may be outdated.
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
    state.modified = instantOf(info.stx_mtime);
    state.changed = instantOf(info.stx_ctime);
    if (info.stx_mask & STATX_BTIME) state.birth = info.stx_btime.tv_sec;
    return state;
}

// Reads to the end, or past `HostFiles::mostBytes`. The end is told by a read that gives less than
// it could, without another that gives nothing, unless the file is larger than that: files of proc,
// whose size is 0, come in one piece.
std::optional<std::string> readAll(const Descriptor& file, std::uint64_t size) {
    std::string text;
    char part[4096];
    for (;;) {
        const auto count = retried([&] { return ::read(file.number(), part, sizeof part); });
        if (count < 0) return std::nullopt;
        const auto length = static_cast<std::size_t>(count);
        text.append(part, length);
        const bool ended = length == 0 || (length < sizeof part && text.size() >= size);
        if (ended || text.size() > HostFiles::mostBytes) return text;
    }
}

struct CloseFolder {
    void operator()(DIR* folder) const { ::closedir(folder); }
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
    const std::string name = absolute(path);
    const Descriptor file(retried(
        [&] { return ::open(name.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY); }));
    if (file.number() < 0) return std::nullopt;
    const auto state = stateAt(file.number(), "", AT_EMPTY_PATH);
    if (!state || state->kind != FileState::Kind::Regular) return std::nullopt;
    auto text = readAll(file, state->size);
    if (!text || text->size() > mostBytes) return FileContent{"", false, *state};
    return FileContent{*std::move(text), true, *state};
}

std::optional<std::string> HostFiles::text(const std::string& path) const {
    auto content = read(path);
    if (!content || !content->whole) return std::nullopt;
    return std::move(content->text);
}

std::optional<FileState> HostFiles::forEachName(const std::string& path,
                                                const NameVisitor& visit) const {
    // opendir sets O_CLOEXEC and opens nothing but folders.
    const std::unique_ptr<DIR, CloseFolder> folder(::opendir(absolute(path).c_str()));
    if (!folder) return std::nullopt;
    const auto state = stateAt(::dirfd(folder.get()), "", AT_EMPTY_PATH);
    for (;;) {
        errno = 0;
        const struct dirent* entry = ::readdir(folder.get());
        if (!entry) return errno == 0 ? state : std::nullopt;
        const std::string_view name = entry->d_name;
        if (name != "." && name != "..") visit(name);
    }
}

}  // namespace VA::Linux
