#ifndef FRAMEWORK_LOGGING_LINE_BUFFER_H
#define FRAMEWORK_LOGGING_LINE_BUFFER_H

#include <array>
#include <cstddef>
#include <string_view>

#include "base/Utf8.h"

namespace ZBLog {

/// One line of output in the making, in a fixed place: nothing is allocated, and what does not fit
/// is left out. Lives on the stack of the thread that writes.
class LineBuffer {
  public:
    /// Most bytes that are written at once: what a pipe takes whole.
    static constexpr std::size_t capacity = 4096;

    /// Empty. The bytes are left as they are found: clearing them would cost more than most lines.
    LineBuffer() noexcept { bytes_[0] = '\n'; }

    /// Appends as it is; stops at the end of the buffer.
    void put(char character) noexcept;
    void put(std::string_view text) noexcept;

    /// Appends `value` in decimal, filled up with leading zeros to `digits`.
    void putNumber(long long value, std::size_t digits = 1) noexcept;

    /// Appends `text` so that it stays on one line and does nothing to a terminal, escaped as
    /// `style` says. At most `room` bytes are appended; a text that is longer is cut between two
    /// characters and ends in the mark \...
    void putEscaped(std::string_view text, std::size_t room = capacity,
                    base::EscapeStyle style = base::EscapeStyle::logText) noexcept;

    /// What was appended, without an end of line; valid until the next change.
    std::string_view text() const noexcept;

    /// The same, with a NUL after it.
    const char* nulTerminated() noexcept;

    /// The whole line with its newline. The second form begins with a newline, too: it is for a
    /// file whose last line was left unfinished. Both are valid until the next change.
    std::string_view line() noexcept;
    std::string_view lineAfterTornLine() noexcept;

  private:
    static constexpr std::size_t contentLimit = capacity - 2;

    std::size_t free() const noexcept { return contentLimit - size_; }

    std::array<char, capacity> bytes_;  // a newline, then the content
    std::size_t size_ = 0;
};

}  // namespace ZBLog

#endif
