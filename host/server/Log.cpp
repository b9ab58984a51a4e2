#include "host/server/Log.h"

#include <poll.h>
#include <unistd.h>

#include <climits>

#include "base/Utf8.h"

namespace cmpihost::server {

namespace {

constexpr std::size_t longestText = 1000;

}  // namespace

Log::Log(int file, LogLevel level, bool priorities)
    : file_(file), level_(level), priorities_(priorities) {}

void Log::write(Priority priority, std::string_view text) {
    const bool cut = text.size() > longestText;
    const std::string shown = base::escape(text.substr(0, longestText), base::EscapeStyle::logText);
    writeClean(priority, cut ? shown + "..." : shown);
}

void Log::writeClean(Priority priority, std::string_view text) {
    std::string line = lead(priority);
    line += text;
    line += '\n';
    const std::lock_guard<std::mutex> lock(mutex_);
    if (untold_ > 0 && put(lead(Priority::Warning) + std::to_string(untold_) +
                           " lines of this log were lost: nobody read them in time\n"))
        untold_ = 0;
    if (put(line)) return;
    ++lost_;
    ++untold_;
}

std::string Log::lead(Priority priority) const {
    const std::string number = std::to_string(static_cast<int>(priority));
    return (priorities_ ? "<" + number + ">" : "") + "cmpihost-serve: ";
}

bool Log::put(std::string_view line) {
    static_assert(4 * longestText + 64 <= PIPE_BUF, "a pipe takes a line whole or not at all");
    pollfd file = {file_, POLLOUT, 0};
    return poll(&file, 1, 0) == 1 && (file.revents & POLLOUT) != 0 &&
           ::write(file_, line.data(), line.size()) == static_cast<ssize_t>(line.size());
}

std::uint64_t Log::lost() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return lost_;
}

}  // namespace cmpihost::server
