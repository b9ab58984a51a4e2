#include "SourceFiles.h"

#include <algorithm>
#include <cerrno>

namespace VA::Linux {

namespace {

// The coarsest clock of a file system in use, that of FAT.
constexpr std::int64_t grainSeconds = 2;

}  // namespace

SourceFiles::SourceFiles(const HostFiles& files, std::int64_t now) : files_(&files), now_(now) {}

std::optional<FileContent> SourceFiles::read(const std::string& path) {
    const auto state = lookAt(path);
    if (!state || state->kind != FileState::Kind::Regular) return std::nullopt;
    auto content = files_->read(path);
    metFailure_ = metFailure_ || (content ? !content->whole : errno != ENOENT);
    // A size that is not that of the content, as in proc, goes with times that tell nothing.
    readWhole_ = readWhole_ && content && content->whole && content->text.size() == state->size &&
                 content->state == *state;
    return content;
}

std::optional<std::vector<std::string>> SourceFiles::names(const std::string& folder) {
    const auto state = lookAt(folder);
    if (!state || state->kind != FileState::Kind::Folder) return std::nullopt;
    std::vector<std::string> names;
    const auto listed =
        files_->forEachName(folder, [&](std::string_view name) { names.emplace_back(name); });
    metFailure_ = metFailure_ || !listed;
    readWhole_ = readWhole_ && listed == state;
    if (!listed) return std::nullopt;
    return names;
}

std::optional<FileState> SourceFiles::lookAt(const std::string& path) {
    auto state = files_->state(path);
    metFailure_ = metFailure_ || (!state && errno != ENOENT);
    looks_.push_back({path, state});
    return state;
}

bool SourceFiles::canBeKept() const {
    if (!readWhole_ || looks_.size() > mostFiles || now_ < grainSeconds) return false;
    return std::all_of(looks_.begin(), looks_.end(), [this](const Look& look) {
        if (!look.state) return true;
        return std::max(look.state->modified.seconds, look.state->changed.seconds) <
               now_ - grainSeconds;
    });
}

bool SourceFiles::areUnchanged() const {
    return std::all_of(looks_.begin(), looks_.end(),
                       [this](const Look& look) { return files_->state(look.path) == look.state; });
}

}  // namespace VA::Linux
