// Records carry what clients say, and administrators read them on terminals: so each is checked as
// it comes.
#include "fuzz/StrictLog.h"

#include <stdexcept>
#include <string>

#include "ZBLogger.h"
#include "base/Utf8.h"
#include "framework/logging/Record.h"
#include "fuzz/Invariant.h"

namespace fuzz {
namespace {

RecordCounts counts;
std::uint64_t throwFrom = 0;

// What the log was told last, which the trace is to be told next.
struct Told {
    std::string function, file, category, text;
    int line = 0;
    int level = 0;

    bool operator==(const Told& other) const {
        return function == other.function && file == other.file && category == other.category &&
               text == other.text && line == other.line && level == other.level;
    }
};
Told last;
bool twinIsDue = false;

void expectOneLine(std::string_view line) {
    while (!line.empty()) {
        expect(base::isPrintable(base::takeUtf8(line)), "a line of the log is printable");
    }
}

// Only these records carry what a client or the host said; all others are made of literals.
bool quotesOthers(std::string_view text) {
    return text.substr(0, 10) == "VARIABLE: " || ZBLog::isFailure(text);
}

void checkLines(const ZBLog::Record& record) {
    ZBLog::LineBuffer line;
    ZBLog::formatLine(line, record, {{1, 2}, 3, 4});
    expectOneLine(line.text());
    ZBLog::LineBuffer systemLog;
    ZBLog::formatForSystemLog(systemLog, record);
    expectOneLine(systemLog.text());
}

void checkTwin(const ZBLog::Record& record) {
    const bool isLog = record.channel == ZBLog::Channel::log;
    Told told{record.function,          record.file, std::string(record.category),
              std::string(record.text), record.line, record.level};
    expect(isLog != twinIsDue, "a record goes to the log, then to the trace");
    expect(isLog || told == last, "the trace gets the record of the log");
    last = std::move(told);
    twinIsDue = isLog;
}

void count(const ZBLog::Record& record) {
    const std::string_view function = record.function;
    ++counts.all;
    if (function == "markProviderEntry") ++counts.entries;
    if (function == "markProviderExit") ++counts.exits;
    if (ZBLog::isFailure(record.text)) ++counts.messages;
}

void take(const ZBLog::Record& record) {
    expect(record.text.size() <= 511, "a record has at most 511 bytes");
    expect(record.level == 3000 || record.level == 4000, "a record is of level 3000 or 4000");
    count(record);
    if (throwFrom != 0 && counts.all >= throwFrom) {
        twinIsDue = false;
        throw std::runtime_error("from the log");
    }
    checkTwin(record);
    if (quotesOthers(record.text)) checkLines(record);
}

}  // namespace

void startRecords(std::uint64_t newThrowFrom) {
    counts = {};
    throwFrom = newThrowFrom;
    twinIsDue = false;
}

RecordCounts countedRecords() {
    return counts;
}

}  // namespace fuzz

namespace ZBLog {

void ZBLogger::logLevelMessage(const char* function, const char* file, int line,
                               const std::string& category, int level, char*, int, int,
                               const std::string& text) {
    fuzz::take({Channel::log, function, file, line, category, level, text});
}

void ZBLogger::traceLevelMessage(const char* function, const char* file, int line,
                                 const std::string& category, int level, char*, int, int,
                                 const std::string& text) {
    fuzz::take({Channel::trace, function, file, line, category, level, text});
}

}  // namespace ZBLog
