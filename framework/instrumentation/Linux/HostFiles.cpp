#include "HostFiles.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <memory>
#include <string_view>
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

bool isRegular(const std::string& path) {
    struct stat info;
    return ::stat(path.c_str(), &info) == 0 && S_ISREG(info.st_mode);
}

bool isRegular(const Descriptor& file) {
    struct stat info;
    return ::fstat(file.number(), &info) == 0 && S_ISREG(info.st_mode);
}

// Reads to the end, or to `limit` bytes.
std::optional<std::string> readAll(const Descriptor& file, std::size_t limit) {
    std::string text;
    std::size_t length = 0;
    while (length < limit) {
        // Most files of proc fit into the first read, so that their lines belong together.
        text.resize(std::min(limit, std::max<std::size_t>(16 * 1024, 2 * length)));
        const auto count =
            retried([&] { return ::read(file.number(), &text[length], text.size() - length); });
        if (count < 0) return std::nullopt;
        if (count == 0) break;
        length += static_cast<std::size_t>(count);
    }
    text.resize(length);
    return text;
}

struct CloseFolder {
    void operator()(DIR* folder) const { ::closedir(folder); }
};

}  // namespace

HostFiles::HostFiles(std::string root) : root_(std::move(root)) {
    root_.erase(root_.find_last_not_of('/') + 1);
}

std::string HostFiles::absolute(const std::string& path) const {
    return root_ + '/' + path;
}

std::optional<FileContent> HostFiles::read(const std::string& path) const {
    const std::string name = absolute(path);
    // Looked at before it is opened, as opening alone can have effects on a device; and after, as
    // it may have been replaced in between.
    if (!isRegular(name)) return std::nullopt;
    const Descriptor file(retried(
        [&] { return ::open(name.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY); }));
    if (file.number() < 0 || !isRegular(file)) return std::nullopt;
    auto text = readAll(file, mostBytes + 1);
    if (!text || text->size() > mostBytes) return FileContent{};
    return FileContent{*std::move(text), true};
}

std::optional<std::string> HostFiles::text(const std::string& path) const {
    auto content = read(path);
    if (!content || !content->whole) return std::nullopt;
    return std::move(content->text);
}

std::optional<std::vector<std::string>> HostFiles::names(const std::string& path) const {
    // opendir sets O_CLOEXEC and opens nothing but folders.
    const std::unique_ptr<DIR, CloseFolder> folder(::opendir(absolute(path).c_str()));
    if (!folder) return std::nullopt;
    std::vector<std::string> names;
    for (;;) {
        errno = 0;
        const struct dirent* entry = ::readdir(folder.get());
        if (!entry) break;
        const std::string_view name = entry->d_name;
        if (name != "." && name != "..") names.emplace_back(name);
    }
    if (errno != 0) return std::nullopt;
    return names;
}

std::optional<FileDates> HostFiles::dates(const std::string& path) const {
    struct statx info;
    constexpr unsigned int wanted = STATX_BTIME | STATX_CTIME;
    const int result = ::statx(AT_FDCWD, absolute(path).c_str(), AT_NO_AUTOMOUNT, wanted, &info);
    if (result != 0 || !(info.stx_mask & STATX_CTIME)) return std::nullopt;
    FileDates dates;
    if (info.stx_mask & STATX_BTIME) dates.birth = info.stx_btime.tv_sec;
    dates.change = info.stx_ctime.tv_sec;
    return dates;
}

bool HostFiles::isFolder(const std::string& path) const {
    struct stat info;
    return ::stat(absolute(path).c_str(), &info) == 0 && S_ISDIR(info.st_mode);
}

}  // namespace VA::Linux
