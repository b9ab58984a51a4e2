#include "TextUnit.h"

#include <cstdint>

namespace ZBLog {

namespace {

/// Well-formed sequences of more than one byte, by their first byte. The second byte has a range of
/// its own, which keeps out overlong forms and surrogates; all further ones are continuations.
struct Sequence {
    std::uint8_t firstLow, firstHigh;
    std::uint8_t secondLow, secondHigh;
    std::size_t bytes;
};

constexpr Sequence sequences[] = {
    {0xC2, 0xDF, 0x80, 0xBF, 2}, {0xE0, 0xE0, 0xA0, 0xBF, 3}, {0xE1, 0xEC, 0x80, 0xBF, 3},
    {0xED, 0xED, 0x80, 0x9F, 3}, {0xEE, 0xEF, 0x80, 0xBF, 3}, {0xF0, 0xF0, 0x90, 0xBF, 4},
    {0xF1, 0xF3, 0x80, 0xBF, 4}, {0xF4, 0xF4, 0x80, 0x8F, 4},
};

struct CodePoints {
    std::uint32_t low, high;
};

constexpr CodePoints notPrintable[] = {
    {0x0080, 0x009F},  // C1 controls
    {0x200B, 0x200F},  // blanks and joiners of no width, marks of direction
    {0x2028, 0x202E},  // line and paragraph separator, embeddings and overrides of direction
    {0x2060, 0x2064},  // word joiner, invisible operators
    {0x2066, 0x2069},  // isolates of direction
    {0xFEFF, 0xFEFF},  // byte order mark
};

std::uint8_t byteAt(std::string_view text, std::size_t index) {
    return static_cast<std::uint8_t>(text[index]);
}

bool isWellFormed(const Sequence& sequence, std::string_view text) {
    if (text.size() < sequence.bytes) return false;
    const std::uint8_t second = byteAt(text, 1);
    if (second < sequence.secondLow || second > sequence.secondHigh) return false;
    for (std::size_t index = 2; index < sequence.bytes; ++index) {
        if ((byteAt(text, index) & 0xC0) != 0x80) return false;
    }
    return true;
}

std::uint32_t codePoint(std::string_view text, std::size_t bytes) {
    std::uint32_t value = byteAt(text, 0) & (0xFFu >> (bytes + 1));
    for (std::size_t index = 1; index < bytes; ++index) {
        value = (value << 6) | (byteAt(text, index) & 0x3Fu);
    }
    return value;
}

bool isPrintable(std::uint32_t value) {
    for (const CodePoints& range : notPrintable) {
        if (value >= range.low && value <= range.high) return false;
    }
    return true;
}

}  // namespace

TextUnit firstUnit(std::string_view text) noexcept {
    const std::uint8_t first = byteAt(text, 0);
    if (first < 0x80) return {1, first >= 0x20 && first != 0x7F};
    for (const Sequence& sequence : sequences) {
        if (first < sequence.firstLow || first > sequence.firstHigh) continue;
        if (!isWellFormed(sequence, text)) break;
        return {sequence.bytes, isPrintable(codePoint(text, sequence.bytes))};
    }
    return {1, false};
}

}  // namespace ZBLog
