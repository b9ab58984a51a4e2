#ifndef VA_TRACE_H
#define VA_TRACE_H

#include <cstddef>
#include <cstring>
#include <limits>
#include <string>
#include <string_view>

// In angle brackets: another logging layer's headers may come first in the order of folders.
#include <ZBLogger.h>
#include <ZBMessageBuffer.h>

/// The records that every unit writes: their texts, and the one way in which they are written. The
/// functions called `trace` only make a text; writeRecord() is what writes it.
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

namespace detail {

using namespace std::string_view_literals;

constexpr std::size_t messageBufferSize = 512;

/// Puts a record together in a message buffer: what does not fit is cut. Records are most of what a
/// request costs by itself, so their parts are copied; no format string is read for each.
class RecordText {
  public:
    /// Zeroes the buffer, the last character included: the text always ends.
    explicit RecordText(char (&buffer)[messageBufferSize])
        : next_(buffer), end_(buffer + messageBufferSize - 1) {
        std::memset(buffer, 0, messageBufferSize);
    }

    RecordText& operator<<(const char* text) {
        return *this << (text == nullptr ? std::string_view("(null)") : std::string_view(text));
    }
    /// The length of a constant is known, and copying it takes a few moves.
    RecordText& operator<<(std::string_view text) {
        const auto room = static_cast<std::size_t>(end_ - next_);
        if (text.size() > room) return *this = cut(text, next_, end_);
        std::memcpy(next_, text.data(), text.size());
        next_ += text.size();
        return *this;
    }
    RecordText& operator<<(int number) {
        char digits[std::numeric_limits<int>::digits10 + 2];
        char* const end = digits + sizeof digits;
        char* begin = end;
        const bool negative = number < 0;
        unsigned int rest =
            negative ? 0U - static_cast<unsigned int>(number) : static_cast<unsigned int>(number);
        do {
            *--begin = static_cast<char>('0' + rest % 10);
            rest /= 10;
        } while (rest != 0);
        if (negative) *--begin = '-';
        return *this << std::string_view(begin, static_cast<std::size_t>(end - begin));
    }
    RecordText& operator<<(unsigned int number) { return *this << static_cast<int>(number); }

  private:
    RecordText(char* next, char* end) : next_(next), end_(end) {}

    // Out of line, and without an object, so that what fits is put together in registers.
    [[gnu::noinline]] static RecordText cut(std::string_view text, char* next, char* end) {
        std::memcpy(next, text.data(), static_cast<std::size_t>(end - next));
        return {end, end};
    }

    char* next_;
    char* end_;
};

/// Adds the text of a record of kind `type`; a type that is none adds nothing.
inline RecordText describe(RecordText record, const char* file, const char* text, unsigned int line,
                           MessageType type) {
    switch (type) {
        case Entering:
            record << "ENTERING: "sv << text << "() in "sv << file << " [Line: "sv << line << "]"sv;
            break;
        case Exiting:
            record << "EXITING: "sv << text << "() in "sv << file << " [Line: "sv << line << "]"sv;
            break;
        case Method:
            record << "METHOD: "sv << text << "() was invoked in "sv << file << " [Line: "sv << line
                   << "]"sv;
            break;
        case Message:
            record << "MESSAGE [File: "sv << file << ", Line: "sv << line << "]: "sv << text;
            break;
    }
    return record;
}

template <class Value>
void describeVariable(RecordText record, const char* name, const char* file, unsigned int line,
                      Value value) {
    record << "VARIABLE: '"sv << name << "' has Value '"sv << value << "' at line "sv << line
           << " in "sv << file;
}

}  // namespace detail

/// The text of a record of kind `type`. `text` names a function, except for Message, where it is
/// free. A type that is none gives the empty text.
inline const char* trace(const char* file, const char* text, unsigned int line, MessageType type) {
    static char messageBuffer[detail::messageBufferSize];
    detail::describe(detail::RecordText(messageBuffer), file, text, line, type);
    return messageBuffer;
}

/// The text of a variable record. It names the file last.
inline const char* trace(const char* name, const char* file, unsigned int line, const char* value) {
    static char messageBuffer[detail::messageBufferSize];
    detail::describeVariable(detail::RecordText(messageBuffer), name, file, line, value);
    return messageBuffer;
}

/// The same for a number, which is printed as a signed one.
inline const char* trace(const char* name, const char* file, unsigned int line,
                         unsigned int value) {
    static char messageBuffer[detail::messageBufferSize];
    detail::describeVariable(detail::RecordText(messageBuffer), name, file, line, value);
    return messageBuffer;
}

/// The text of a record with a parameter list. No blank follows the comma before the list.
inline const char* tracepara(const char* file, const char* function, unsigned int line,
                             const char* parameters, MessageType type) {
    static char messageBuffer[detail::messageBufferSize];
    detail::RecordText record(messageBuffer);
    if (type <= Message)
        detail::describe(record, file, function, line, type)
            << std::string_view(",Parameters List: ") << parameters;
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
