#ifndef TESTS_SUPPORT_RECORDING_LOG_H
#define TESTS_SUPPORT_RECORDING_LOG_H

#include <functional>
#include <string>
#include <vector>

/// Stands in for ZBLog::ZBLogger in a test program: whatever writes records in the process, the
/// program's own code or a library that it loads, they end here.
namespace recording {

/// One call of one of the two channels, with all its arguments.
struct Record {
    std::string channel;  ///< "log" or "trace"
    std::string function;
    std::string file;
    int line;
    std::string category;
    int level;
    bool reservedIsNull;
    int reserved1;
    int reserved2;
    std::string text;
};

bool sameArguments(const Record& left, const Record& right);

/// The records written since the last call, in order; forgets them. Any thread may write.
std::vector<Record> take();

/// Forgets the records.
void clear();

/// Called with each record, on the writer's thread, before it is kept; what it throws reaches the
/// writer. An empty function removes it.
void setHook(std::function<void(const Record&)> hook);

/// When off, records are neither kept nor shown to the hook. On at the start.
void setRecording(bool on);

/// One line a record, or one for a record and its twin in the other channel that follows it at
/// once:
///
///     both FUNCTION FILE:LINE CATEGORY LEVEL null 0 0 | TEXT
///
/// Source lines and addresses are masked as # and 0x*, but not the lines of include/Trace.h.
std::string rendered(const std::vector<Record>& records);

/// rendered(take())
std::string takeRendered();

}  // namespace recording

#endif
