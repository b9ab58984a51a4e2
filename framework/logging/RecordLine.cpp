#include "RecordLine.h"

#include <syslog.h>

#include "UtcTime.h"

namespace ZBLog {

namespace {

constexpr std::size_t nameRoom = 256;
constexpr int coarseLevel = 3000;

void putName(LineBuffer& line, std::string_view name) {
    if (name.empty()) {
        line.put('-');
    } else {
        line.putEscaped(name, nameRoom, LineBuffer::Blanks::escaped);
    }
}

std::string_view viewOf(const char* text) {
    return text == nullptr ? std::string_view() : text;
}

void putRecord(LineBuffer& line, const Record& record) {
    line.put(record.channel == Channel::log ? "log " : "trace ");
    line.putNumber(record.level);
    line.put(' ');
    putName(line, record.category);
    line.put(' ');
    putName(line, viewOf(record.function));
    line.put(' ');
    putName(line, viewOf(record.file));
    line.put(':');
    line.putNumber(record.line);
    line.put(' ');
    line.putEscaped(record.text);
}

}  // namespace

void formatLine(LineBuffer& line, const Record& record, const Origin& origin) noexcept {
    putUtc(line, origin.instant);
    line.put(' ');
    line.putNumber(origin.process);
    line.put(' ');
    line.putNumber(origin.thread);
    line.put(' ');
    putRecord(line, record);
}

void formatForSystemLog(LineBuffer& line, const Record& record) noexcept {
    line.put(programName);
    line.put(": ");
    putRecord(line, record);
}

int systemLogPriority(const Record& record) noexcept {
    const bool coarse = record.level <= coarseLevel;
    if (isFailure(record.text)) return LOG_DAEMON | (coarse ? LOG_ERR : LOG_WARNING);
    return LOG_DAEMON | (coarse ? LOG_INFO : LOG_DEBUG);
}

}  // namespace ZBLog
