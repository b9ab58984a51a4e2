#ifndef ZBLOG_TEXT_UNIT_H
#define ZBLOG_TEXT_UNIT_H

#include <cstddef>
#include <string_view>

namespace ZBLog {

/// What a text begins with: one character of UTF-8, or one byte that is none.
struct TextUnit {
    std::size_t bytes;  ///< length, 1 to 4
    bool printable;     ///< false for what must not reach a terminal or a line of a log as it is
};

/// The first unit of `text`, which must not be empty. Not printable are control characters (C0,
/// DEL, C1), the line and paragraph separators, the characters that turn the direction of writing
/// around, invisible ones (of no width, joiners, the byte order mark), and bytes that are not
/// well-formed UTF-8 (overlong forms, surrogates, beyond U+10FFFF).
TextUnit firstUnit(std::string_view text) noexcept;

}  // namespace ZBLog

#endif
