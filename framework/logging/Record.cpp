// Lines are for people and for grep: one record, one line, the same fields in the same places
// whatever a client managed to get into a text. The time is UTC and computed without the C library,
// whose conversions would touch the time zone of the process.
#include "Record.h"

#include <syslog.h>

#include "base/CivilTime.h"

namespace ZBLog {

namespace {

constexpr std::size_t nameRoom = 256;
constexpr int coarseLevel = 3000;

void putUtc(LineBuffer& line, const timespec& instant) {
    const base::CivilTime time = base::civilFromSeconds(instant.tv_sec);
    const struct {
        long long value;
        std::size_t digits;
        char end;
    } fields[] = {{time.year, 4, '-'},
                  {time.month, 2, '-'},
                  {time.day, 2, 'T'},
                  {time.hour, 2, ':'},
                  {time.minute, 2, ':'},
                  {time.second, 2, '.'},
                  {instant.tv_nsec / 1000000, 3, 'Z'}};
    for (const auto& field : fields) {
        line.putNumber(field.value, field.digits);
        line.put(field.end);
    }
}

void putName(LineBuffer& line, std::string_view name) {
    if (name.empty()) {
        line.put('-');
    } else {
        line.putEscaped(name, nameRoom, base::EscapeStyle::logField);
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
