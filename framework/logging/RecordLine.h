#ifndef ZBLOG_RECORD_LINE_H
#define ZBLOG_RECORD_LINE_H

#include <ctime>

#include "LineBuffer.h"
#include "Record.h"

namespace ZBLog {

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
/// TIME is UTC with milliseconds, CHANNEL "log" or "trace". A name that is empty is "-"; a blank in
/// a name is \x20; names are cut after 256 bytes, the text where the line is full (see LineBuffer).
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
