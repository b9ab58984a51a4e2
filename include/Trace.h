#ifndef VA_TRACE_H
#define VA_TRACE_H

#include <cstdio>
#include <cstring>
#include <string>

#include "ZBLogger.h"
#include "ZBMessageBuffer.h"

/// The records that every unit writes: their texts, and the one way in which they are written.
///
/// Each formatting function owns one static buffer of 512 bytes that all its callers share, on
/// whatever thread: no lock is taken, so threads that format the same kind of record at the same
/// moment may see each other's text. A text that does not fit is cut at 511 characters; nothing is
/// ever written past a buffer. The pointer that is returned is never null and names the text until
/// the function's next call.
namespace VA {

/// Levels of records, as the logging library counts them: a higher one is a finer one.
constexpr int recordLevel = 4000;           ///< plain entering, exiting, method, variable records
constexpr int parameterRecordLevel = 3000;  ///< records with a parameter list, and messages

/// Kind of a record.
enum MessageType : unsigned int { Entering = 0, Exiting = 1, Method = 2, Message = 3 };

/// The text of a record of kind `type`. `text` names a function, except for Message, where it is
/// free. A type that is none gives the empty text.
inline const char* trace(const char* file, const char* text, unsigned int line, MessageType type) {
    static char messageBuffer[512];
    std::memset(messageBuffer, 0, sizeof messageBuffer);
    const int at = static_cast<int>(line);
    switch (type) {
        case Entering:
            std::snprintf(messageBuffer, sizeof messageBuffer, "ENTERING: %s() in %s [Line: %d]",
                          text, file, at);
            break;
        case Exiting:
            std::snprintf(messageBuffer, sizeof messageBuffer, "EXITING: %s() in %s [Line: %d]",
                          text, file, at);
            break;
        case Method:
            std::snprintf(messageBuffer, sizeof messageBuffer,
                          "METHOD: %s() was invoked in %s [Line: %d]", text, file, at);
            break;
        case Message:
            std::snprintf(messageBuffer, sizeof messageBuffer, "MESSAGE [File: %s, Line: %d]: %s",
                          file, at, text);
            break;
    }
    return messageBuffer;
}

/// The text of a variable record. It names the file last.
inline const char* trace(const char* name, const char* file, unsigned int line, const char* value) {
    static char messageBuffer[512];
    std::memset(messageBuffer, 0, sizeof messageBuffer);
    std::snprintf(messageBuffer, sizeof messageBuffer,
                  "VARIABLE: '%s' has Value '%s' at line %d in %s", name, value,
                  static_cast<int>(line), file);
    return messageBuffer;
}

/// The same for a number, which is printed as a signed one.
inline const char* trace(const char* name, const char* file, unsigned int line,
                         unsigned int value) {
    static char messageBuffer[512];
    std::memset(messageBuffer, 0, sizeof messageBuffer);
    std::snprintf(messageBuffer, sizeof messageBuffer,
                  "VARIABLE: '%s' has Value '%d' at line %d in %s", name, static_cast<int>(value),
                  static_cast<int>(line), file);
    return messageBuffer;
}

/// The text of a record with a parameter list. No blank follows the comma before the list.
inline const char* tracepara(const char* file, const char* function, unsigned int line,
                             const char* parameters, MessageType type) {
    static char messageBuffer[512];
    std::memset(messageBuffer, 0, sizeof messageBuffer);
    const int at = static_cast<int>(line);
    switch (type) {
        case Entering:
            std::snprintf(messageBuffer, sizeof messageBuffer,
                          "ENTERING: %s() in %s [Line: %d],Parameters List: %s", function, file, at,
                          parameters);
            break;
        case Exiting:
            std::snprintf(messageBuffer, sizeof messageBuffer,
                          "EXITING: %s() in %s [Line: %d],Parameters List: %s", function, file, at,
                          parameters);
            break;
        case Method:
            std::snprintf(messageBuffer, sizeof messageBuffer,
                          "METHOD: %s() was invoked in %s [Line: %d],Parameters List: %s", function,
                          file, at, parameters);
            break;
        case Message:
            std::snprintf(messageBuffer, sizeof messageBuffer,
                          "MESSAGE [File: %s, Line: %d]: %s,Parameters List: %s", file, at,
                          function, parameters);
            break;
    }
    return messageBuffer;
}

/// Writes one record to the log and then to the trace, with the same arguments. `format` returns
/// the text; it is asked once for each channel, since the buffer behind it is shared.
template <class Format>
inline void writeRecord(const char* function, const char* file, unsigned int line,
                        const std::string& logger, int level, Format format) {
    const int at = static_cast<int>(line);
    ZBLog::ZBMessageBuffer buffer;
    ZBLog::ZBLogger::logLevelMessage(function, file, at, logger, level, nullptr, 0, 0,
                                     buffer.str(buffer << format()));
    ZBLog::ZBLogger::traceLevelMessage(function, file, at, logger, level, nullptr, 0, 0,
                                       buffer.str(buffer << format()));
}

namespace markers {

constexpr const char* file = "include/Trace.h";
constexpr const char* banner =
    "==============================================================================";

// Filters in the field know the markers' records by these lines: they stay, wherever the code
// moves.
constexpr unsigned int entryBannerLine = 336;
constexpr unsigned int enteringLine = 337;
constexpr unsigned int exitingLine = 348;
constexpr unsigned int exitBannerLine = 349;

}  // namespace markers

/// Opens a request's records: the banner, then an entering record that names the request's handler.
inline void markProviderEntry(const std::string& logger, const char* file, const char* function,
                              unsigned int line) {
    writeRecord("markProviderEntry", markers::file, markers::entryBannerLine, logger, recordLevel,
                [] { return markers::banner; });
    writeRecord("markProviderEntry", markers::file, markers::enteringLine, logger, recordLevel,
                [&] { return trace(file, function, line, Entering); });
}

/// Closes a request's records: an exiting record that names the request's handler, then the banner.
inline void markProviderExit(const std::string& logger, const char* file, const char* function,
                             unsigned int line) {
    writeRecord("markProviderExit", markers::file, markers::exitingLine, logger, recordLevel,
                [&] { return trace(file, function, line, Exiting); });
    writeRecord("markProviderExit", markers::file, markers::exitBannerLine, logger, recordLevel,
                [] { return markers::banner; });
}

}  // namespace VA

#endif
