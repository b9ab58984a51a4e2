#include "FileSink.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <cerrno>

namespace ZBLog {

FileSink::FileSink(const std::string& path, Surroundings& surroundings)
    : LineSink(path, surroundings) {}

LineSink::Output FileSink::output(bool) noexcept {
    if (!isCurrent()) {
        if (const int error = reopen()) return {-1, error};
    }
    return {file_.number(), 0};
}

bool FileSink::isCurrent() const noexcept {
    struct stat named {};
    return file_.isOpen() && ::lstat(name().c_str(), &named) == 0 &&
           FileIdentity::of(named) == FileIdentity::of(file_.status());
}

int FileSink::reopen() noexcept {
    constexpr int flags = O_WRONLY | O_APPEND | O_CREAT | O_NOFOLLOW;
    constexpr mode_t mode = 0640;
    if (const int error = file_.open(name().c_str(), flags, mode)) return error;
    if (!S_ISREG(file_.status().st_mode) && !S_ISCHR(file_.status().st_mode)) {
        file_.close();
        return EINVAL;
    }
    const FileIdentity opened = FileIdentity::of(file_.status());
    if (last_ != opened) startOfOutput();
    last_ = opened;
    return 0;
}

}  // namespace ZBLog
