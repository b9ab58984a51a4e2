#ifndef FRAMEWORK_LOGGING_RECORD_H
#define FRAMEWORK_LOGGING_RECORD_H

#include <array>
#include <cstddef>
#include <ctime>
#include <string_view>

#include "LineBuffer.h"

namespace ZBLog {

/// The two ways that a record takes.
enum class Channel : std::size_t { log, trace };
constexpr std::array allChannels{Channel::log, Channel::trace};
constexpr std::size_t channelCount = allChannels.size();

constexpr std::size_t indexOf(Channel channel) {
    return static_cast<std::size_t>(channel);
}

/// One call of the logging library, as the sinks see it. It refers to the caller's texts and is
/// valid only while that call lasts. Null names count as empty.
struct Record {
    Channel channel;
    const char* function;
    const char* file;
    int line;
    std::string_view category;
    int level;
    std::string_view text;
};

/// True for the text of a message record: the kind that reports a failure.
inline bool isFailure(std::string_view text) {
    constexpr std::string_view start = "MESSAGE [";
    return text.substr(0, start.size()) == start;
}

/// The name by which this software calls itself in lines that it shares with others.
constexpr const char* programName = "korva-osstatus";

/// Who writes a line, and when.
struct Origin {
    timespec instant;
    int process;
    int thread;
};

/// Formats the line of a file: fields that blanks separate, then the text, which may hold blanks:
///
///     TIME PROCESS THREAD CHANNEL LEVEL CATEGORY FUNCTION FILE:LINE TEXT
///
/// TIME is UTC with milliseconds ("2024-02-29T23:59:59.123Z"), CHANNEL "log" or "trace". A name
/// that is empty is "-"; a blank in a name is \x20; names are cut after 256 bytes, the text where
/// the line is full (see LineBuffer).
void formatLine(LineBuffer& line, const Record& record, const Origin& origin) noexcept;

/// Formats the text for the system's log, which adds time and process by itself:
///
///     korva-osstatus: CHANNEL LEVEL CATEGORY FUNCTION FILE:LINE TEXT
void formatForSystemLog(LineBuffer& line, const Record& record) noexcept;

/// Priority and facility for the system's log. A message record is an error when its level is 3000
/// or coarser, else a warning; any other record is a piece of information, or of debugging.
int systemLogPriority(const Record& record) noexcept;

}  // namespace ZBLog

#endif
