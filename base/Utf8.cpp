// One decoder and one escaper, because what a log, a terminal and a schema hold to be a character
// must not differ. The logging calls both with nothing but its stack, so they work on one character
// at a time in a fixed place.
#include "base/Utf8.h"

#include <algorithm>
#include <cstdint>

namespace base {

namespace {

/// Well-formed sequences of more than one byte, by their first byte. The second byte has a range of
/// its own, which keeps out overlong forms and surrogates; all further ones are continuations.
struct Sequence {
    std::uint8_t firstLow, firstHigh;
    std::uint8_t secondLow, secondHigh;
    std::size_t length;
};

constexpr Sequence sequences[] = {
    {0xC2, 0xDF, 0x80, 0xBF, 2}, {0xE0, 0xE0, 0xA0, 0xBF, 3}, {0xE1, 0xEC, 0x80, 0xBF, 3},
    {0xED, 0xED, 0x80, 0x9F, 3}, {0xEE, 0xEF, 0x80, 0xBF, 3}, {0xF0, 0xF0, 0x90, 0xBF, 4},
    {0xF1, 0xF3, 0x80, 0xBF, 4}, {0xF4, 0xF4, 0x80, 0x8F, 4},
};

constexpr struct {
    char32_t low, high;
    CharClass itsClass;
} notPrintable[] = {
    {0x0000, 0x001F, CharClass::control},   {0x007F, 0x009F, CharClass::control},
    {0x200B, 0x200D, CharClass::invisible},  // blanks and joiners of no width
    {0x200E, 0x200F, CharClass::layout},     // marks of direction
    {0x2028, 0x202E, CharClass::layout},     // separators, embeddings and overrides of direction
    {0x2060, 0x2064, CharClass::invisible},  // word joiner, invisible operators
    {0x2066, 0x2069, CharClass::layout},     // isolates of direction
    {0xFEFF, 0xFEFF, CharClass::invisible},  // byte order mark
};

constexpr Utf8Char noCharacter{1, replacementCharacter, false};

std::uint8_t byteAt(std::string_view text, std::size_t index) {
    return static_cast<std::uint8_t>(text[index]);
}

Utf8Char decodeSequence(const Sequence& sequence, std::string_view text) {
    if (text.size() < sequence.length) return noCharacter;
    const std::uint8_t second = byteAt(text, 1);
    if (second < sequence.secondLow || second > sequence.secondHigh) return noCharacter;
    char32_t codePoint = byteAt(text, 0) & (0xFFU >> (sequence.length + 1));
    for (std::size_t index = 1; index < sequence.length; ++index) {
        if (startsUtf8(text[index])) return noCharacter;
        codePoint = (codePoint << 6U) | (byteAt(text, index) & 0x3FU);
    }
    return {sequence.length, codePoint, true};
}

bool standsForItself(const Utf8Char& character, EscapeStyle style) {
    switch (style) {
        case EscapeStyle::logText:
            return character.codePoint != '\\' && isPrintable(character);
        case EscapeStyle::logField:
            return character.codePoint != ' ' && standsForItself(character, EscapeStyle::logText);
        case EscapeStyle::terminal: {
            const CharClass itsClass = classOf(character.codePoint);
            return character.valid &&
                   (itsClass == CharClass::printable || itsClass == CharClass::invisible);
        }
        case EscapeStyle::ascii:
            return character.codePoint >= ' ' && character.codePoint <= '~';
    }
    return false;
}

}  // namespace

Utf8Char decodeUtf8(std::string_view text) noexcept {
    const std::uint8_t first = byteAt(text, 0);
    if (first < 0x80) return {1, first, true};
    for (const Sequence& sequence : sequences) {
        if (first >= sequence.firstLow && first <= sequence.firstHigh) {
            return decodeSequence(sequence, text);
        }
    }
    return noCharacter;
}

Utf8Char takeUtf8(std::string_view& text) noexcept {
    const Utf8Char character = decodeUtf8(text);
    text.remove_prefix(character.length);
    return character;
}

std::size_t countUtf8(std::string_view text) noexcept {
    std::size_t count = 0;
    for (; !text.empty(); ++count) takeUtf8(text);
    return count;
}

void appendUtf8(std::string& text, char32_t codePoint) {
    const bool surrogate = codePoint >= 0xD800 && codePoint <= 0xDFFF;
    const char32_t code = surrogate || codePoint > 0x10FFFF ? replacementCharacter : codePoint;
    const auto append = [&text](char32_t byte) { text += static_cast<char>(byte); };
    const auto appendTail = [&](unsigned shift) { append(0x80U | ((code >> shift) & 0x3FU)); };
    if (code < 0x80) {
        append(code);
    } else if (code < 0x800) {
        append(0xC0U | (code >> 6U));
        appendTail(0);
    } else if (code < 0x10000) {
        append(0xE0U | (code >> 12U));
        appendTail(6);
        appendTail(0);
    } else {
        append(0xF0U | (code >> 18U));
        appendTail(12);
        appendTail(6);
        appendTail(0);
    }
}

std::string toValidUtf8(std::string_view text) {
    std::string result;
    while (!text.empty()) appendUtf8(result, takeUtf8(text).codePoint);
    return result;
}

CharClass classOf(char32_t codePoint) noexcept {
    for (const auto& range : notPrintable) {
        if (codePoint < range.low) break;  // the ranges ascend
        if (codePoint <= range.high) return range.itsClass;
    }
    return CharClass::printable;
}

bool isPrintable(const Utf8Char& character) noexcept {
    return character.valid && classOf(character.codePoint) == CharClass::printable;
}

EscapedChar::EscapedChar(std::string_view text, EscapeStyle style) noexcept {
    const Utf8Char character = decodeUtf8(text);
    source_ = text.substr(0, character.length);
    if (standsForItself(character, style)) return;
    if (style == EscapeStyle::terminal && character.valid) {
        appendForTerminal(character.codePoint);
    } else if (character.codePoint == '\\') {
        append("\\\\");
    } else {
        const Digits form = style == EscapeStyle::terminal ? Digits::lower : Digits::upper;
        for (const char byte : source_) {
            append("\\x");
            appendHex(static_cast<std::uint8_t>(byte), 2, form);
        }
    }
}

void EscapedChar::append(std::string_view part) noexcept {
    std::copy(part.begin(), part.end(), escape_.begin() + size_);
    size_ += part.size();
}

void EscapedChar::appendHex(char32_t number, unsigned digits, Digits form) noexcept {
    const char* const symbols = form == Digits::upper ? "0123456789ABCDEF" : "0123456789abcdef";
    while (digits-- > 0) escape_[size_++] = symbols[(number >> (4 * digits)) & 0xFU];
}

void EscapedChar::appendForTerminal(char32_t codePoint) noexcept {
    if (codePoint == '\n') return append("\\n");
    if (codePoint == '\t') return append("\\t");
    if (codePoint == '\r') return append("\\r");
    const bool control = classOf(codePoint) == CharClass::control;
    append(control ? "\\x" : "\\u");
    appendHex(codePoint, control ? 2 : 4, Digits::lower);
}

std::string escape(std::string_view text, EscapeStyle style) {
    std::string result;
    while (!text.empty()) {
        const EscapedChar character(text, style);
        result += character.written();
        text.remove_prefix(character.length());
    }
    return result;
}

}  // namespace base
