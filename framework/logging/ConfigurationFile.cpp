// The configuration is followed without anybody telling us: a provider in an object manager has no
// signal and no command of its own. So its file is looked at again and again, and looking must cost
// one stat.
#include "ConfigurationFile.h"

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <utility>

#include "PosixFile.h"

namespace ZBLog {

namespace {

/// Appends up to `limit` bytes from the start of an open file; 0 or an error number.
int readUpTo(std::size_t limit, int descriptor, std::string& text) {
    char block[4096];
    while (text.size() < limit) {
        const ssize_t count =
            ::pread(descriptor, block, std::min(sizeof block, limit - text.size()),
                    static_cast<off_t>(text.size()));
        if (count < 0 && errno == EINTR) continue;
        if (count < 0) return errno;
        if (count == 0) return 0;
        text.append(block, static_cast<std::size_t>(count));
    }
    return 0;
}

}  // namespace

ConfigurationFile::ConfigurationFile(ConfigurationSource source, Environment& environment)
    : source_(std::move(source)), environment_(environment) {}

bool ConfigurationFile::Stamp::operator==(const Stamp& other) const {
    return error == other.error && FileIdentity::of(status) == FileIdentity::of(other.status) &&
           status.st_size == other.status.st_size &&
           status.st_ctim.tv_sec == other.status.st_ctim.tv_sec &&
           status.st_ctim.tv_nsec == other.status.st_ctim.tv_nsec;
}

std::optional<ParsedConfiguration> ConfigurationFile::readIfChanged() {
    if (source_.path.empty()) {
        return std::exchange(content_, Content{}) ? std::nullopt
                                                  : std::optional(ParsedConfiguration{});
    }
    const Stamp found = stamp();
    if (stamp_ && *stamp_ == found) return std::nullopt;

    Content content = read();
    stamp_ = isSettled(found) ? std::optional(found) : std::nullopt;
    if (content_ && content.text == content_->text && content.problem == content_->problem) {
        return std::nullopt;
    }
    ParsedConfiguration parsed = parseConfiguration(content.text);
    if (!content.problem.empty()) parsed.errors.push_back({0, content.problem});
    content_ = std::move(content);
    return parsed;
}

ConfigurationFile::Stamp ConfigurationFile::stamp() const {
    Stamp stamp{};
    if (::stat(source_.path.c_str(), &stamp.status) != 0) stamp.error = errno;
    return stamp;
}

/// A file that was changed a moment ago may be changed again with no trace in its stamp, since file
/// times advance in steps. Its content is then looked at once more.
bool ConfigurationFile::isSettled(const Stamp& stamp) const {
    constexpr int settlingSeconds = 2;
    const auto age = environment_.utc().tv_sec - stamp.status.st_ctim.tv_sec;
    return age < 0 || age > settlingSeconds;
}

ConfigurationFile::Content ConfigurationFile::read() const {
    PosixFile file;
    if (const int error = file.open(source_.path.c_str(), O_RDONLY)) return failure(error);
    if (!S_ISREG(file.status().st_mode)) return {"", "not a regular file"};
    Content content;
    // One byte more than allowed shows that the file is too long.
    const int error = readUpTo(configurationSizeLimit + 1, file.number(), content.text);
    return error == 0 ? content : failure(error);
}

ConfigurationFile::Content ConfigurationFile::failure(int error) const {
    const bool missing = error == ENOENT || error == ENOTDIR;
    if (missing && !source_.required) return {};
    return {"", std::string("cannot be read: ") + ::strerrordesc_np(error)};
}

}  // namespace ZBLog
