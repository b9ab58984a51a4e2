// Records are the provider's other interface. Here they are kept with all nine arguments, and
// rendered so that only what may differ from build to build is masked.
#include "support/RecordingLog.h"

#include <algorithm>
#include <atomic>
#include <mutex>
#include <sstream>
#include <utility>

#include "ZBLogger.h"

namespace recording {
namespace {

std::mutex mutex;
std::vector<Record> kept;
std::function<void(const Record&)> hook;
std::atomic<bool> recording{true};

void keep(Record record) {
    if (!recording) return;
    std::function<void(const Record&)> current;
    {
        const std::lock_guard<std::mutex> lock(mutex);
        current = hook;
    }
    if (current) current(record);
    const std::lock_guard<std::mutex> lock(mutex);
    kept.push_back(std::move(record));
}

// Replaces each run of `characters` that follows `prefix` by `mask`.
std::string masked(const std::string& text, const std::string& prefix, const char* characters,
                   const char* mask) {
    std::string result;
    std::size_t from = 0;
    for (std::size_t at = text.find(prefix); at != std::string::npos;
         at = text.find(prefix, from)) {
        const std::size_t begin = at + prefix.size();
        const std::size_t end = std::min(text.find_first_not_of(characters, begin), text.size());
        result.append(text, from, begin - from);
        if (end > begin) result += mask;
        from = end;
    }
    return result.append(text, from, std::string::npos);
}

std::string masked(const std::string& text) {
    const char* const digits = "0123456789";
    return masked(masked(masked(text, "Line: ", digits, "#"), "at line ", digits, "#"), "0x",
                  "0123456789abcdef", "*");
}

void render(std::ostream& out, const std::string& channel, const Record& record) {
    out << channel << ' ' << record.function << ' ' << record.file << ':';
    if (record.file == "include/Trace.h")
        out << record.line;
    else
        out << '#';
    out << ' ' << record.category << ' ' << record.level << ' '
        << (record.reservedIsNull ? "null" : "not-null") << ' ' << record.reserved1 << ' '
        << record.reserved2 << " | " << masked(record.text) << '\n';
}

}  // namespace

bool sameArguments(const Record& left, const Record& right) {
    return left.function == right.function && left.file == right.file && left.line == right.line &&
           left.category == right.category && left.level == right.level &&
           left.reservedIsNull == right.reservedIsNull && left.reserved1 == right.reserved1 &&
           left.reserved2 == right.reserved2 && left.text == right.text;
}

std::vector<Record> take() {
    const std::lock_guard<std::mutex> lock(mutex);
    return std::exchange(kept, {});
}

void clear() {
    take();
}

void setHook(std::function<void(const Record&)> newHook) {
    const std::lock_guard<std::mutex> lock(mutex);
    hook = std::move(newHook);
}

void setRecording(bool on) {
    recording = on;
}

std::string rendered(const std::vector<Record>& records) {
    std::ostringstream out;
    for (std::size_t index = 0; index < records.size(); ++index) {
        const bool twin = index + 1 < records.size() && records[index].channel == "log" &&
                          records[index + 1].channel == "trace" &&
                          sameArguments(records[index], records[index + 1]);
        render(out, twin ? "both" : records[index].channel, records[index]);
        if (twin) ++index;
    }
    return out.str();
}

std::string takeRendered() {
    return rendered(take());
}

}  // namespace recording

namespace ZBLog {

void ZBLogger::logLevelMessage(const char* function, const char* file, int line,
                               const std::string& category, int level, char* reserved,
                               int reserved1, int reserved2, const std::string& text) {
    recording::keep({"log", function, file, line, category, level, reserved == nullptr, reserved1,
                     reserved2, text});
}

void ZBLogger::traceLevelMessage(const char* function, const char* file, int line,
                                 const std::string& category, int level, char* reserved,
                                 int reserved1, int reserved2, const std::string& text) {
    recording::keep({"trace", function, file, line, category, level, reserved == nullptr, reserved1,
                     reserved2, text});
}

}  // namespace ZBLog
