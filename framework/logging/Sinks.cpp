// Logging must never become the outage: a full disk, a pipe that nobody reads or a folder that is
// gone costs records, which are counted, and not the request that wrote them.
#include "Sinks.h"

#include <fcntl.h>
#include <poll.h>
#include <syslog.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <cstring>
#include <utility>

#include "Timeout.h"

namespace ZBLog {

void SystemLogSink::write(const Record& record) noexcept {
    LineBuffer line;
    formatForSystemLog(line, record);
    environment_.writeSystemLog(systemLogPriority(record), line.nulTerminated());
}

LineSink::LineSink(std::string name, Environment& environment)
    : name_(std::move(name)), environment_(environment) {}

void LineSink::write(const Record& record) noexcept {
    LineBuffer line;
    format(record, line);
    int error = ETIMEDOUT;
    {
        const auto lock = tryLockFor(mutex_, stuck_ ? noWaiting : timeout);
        if (lock.owns_lock()) error = writeLocked(record, line);
    }
    if (error == ETIMEDOUT) stuck_ = true;
    if (error != 0) drop(error);
}

void LineSink::format(const Record& record, LineBuffer& line) noexcept {
    formatLine(line, record, {environment_.utc(), ::getpid(), ::gettid()});
}

int LineSink::writeLocked(const Record& record, LineBuffer& line) noexcept {
    const Output ready = output(!stuck_);
    if (ready.error != 0) return ready.error;
    if (dropped_ != 0) {
        if (const int error = writeDropped(ready.descriptor, record.channel)) return error;
    }
    return writeLine(ready.descriptor, line);
}

int LineSink::writeLine(int descriptor, LineBuffer& line) noexcept {
    const WriteResult result =
        writeFully(descriptor, torn_ ? line.lineAfterTornLine() : line.line());
    if (result.error == 0) {
        torn_ = false;
        stuck_ = false;
    } else if (result.written != 0) {
        torn_ = true;
    }
    return result.error;
}

int LineSink::writeDropped(int descriptor, Channel channel) noexcept {
    const unsigned long count = dropped_;
    LineBuffer text;
    text.putNumber(static_cast<long long>(count));
    text.put(count == 1 ? " record was dropped: " : " records were dropped: ");
    text.put(::strerrordesc_np(reason_));

    LineBuffer line;
    format({channel, nullptr, nullptr, 0, "ZBLog", 0, text.text()}, line);
    const int error = writeLine(descriptor, line);
    if (error == 0) dropped_ -= count;
    return error;
}

void LineSink::drop(int error) noexcept {
    reason_ = error;
    if (dropped_.fetch_add(1) != 0) return;
    LineBuffer text;
    text.put(programName);
    text.put(": ");
    text.putEscaped(name_);
    text.put(": ");
    text.put(::strerrordesc_np(error));
    text.put("; records are dropped until it can be written again");
    environment_.writeSystemLog(LOG_DAEMON | LOG_WARNING, text.nulTerminated());
}

FileSink::FileSink(const std::string& path, Environment& environment)
    : LineSink(path, environment) {}

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

StandardErrorSink::StandardErrorSink(Environment& environment)
    : LineSink("standard error", environment) {}

LineSink::Output StandardErrorSink::output(bool wait) noexcept {
    using Clock = std::chrono::steady_clock;
    const auto deadline = Clock::now() + (wait ? timeout : noWaiting);
    for (;;) {
        const auto rest =
            std::chrono::duration_cast<std::chrono::milliseconds>(deadline - Clock::now()).count();
        pollfd output{STDERR_FILENO, POLLOUT, 0};
        const int ready = ::poll(&output, 1, rest > 0 ? static_cast<int>(rest) : 0);
        // A stream in error is written to all the same: the write names the reason.
        if (ready > 0) return {STDERR_FILENO, 0};
        if (ready == 0) return {-1, ETIMEDOUT};
        if (errno != EINTR) return {-1, errno};
    }
}

}  // namespace ZBLog
