#include "LineSink.h"

#include <syslog.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <cstring>
#include <utility>

#include "Patience.h"
#include "RecordLine.h"
#include "WholeWrite.h"

namespace ZBLog {

LineSink::LineSink(std::string name, Surroundings& surroundings)
    : name_(std::move(name)), surroundings_(surroundings) {}

void LineSink::write(const Record& record) noexcept {
    LineBuffer line;
    format(record, line);
    int error = ETIMEDOUT;
    {
        const auto longest = stuck_ ? std::chrono::milliseconds::zero() : patience;
        const auto lock = lockPatiently(mutex_, longest);
        if (lock.owns_lock()) error = writeLocked(record, line);
    }
    if (error == ETIMEDOUT) stuck_ = true;
    if (error != 0) drop(error);
}

void LineSink::format(const Record& record, LineBuffer& line) noexcept {
    formatLine(line, record, {surroundings_.utc(), ::getpid(), ::gettid()});
}

int LineSink::writeLocked(const Record& record, LineBuffer& line) noexcept {
    const Output ready = output(!stuck_);
    if (ready.error != 0) return ready.error;
    if (dropped_ != 0) {
        if (const int error = tellDropped(ready.descriptor, record.channel)) return error;
    }
    return writeLine(ready.descriptor, line);
}

int LineSink::writeLine(int descriptor, LineBuffer& line) noexcept {
    const WriteResult result =
        writeWhole(descriptor, torn_ ? line.lineAfterTornLine() : line.line());
    if (result.error == 0) {
        torn_ = false;
        stuck_ = false;
    } else if (result.written != 0) {
        torn_ = true;
    }
    return result.error;
}

int LineSink::tellDropped(int descriptor, Channel channel) noexcept {
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
    surroundings_.writeSystemLog(LOG_DAEMON | LOG_WARNING, text.nulTerminated());
}

}  // namespace ZBLog
