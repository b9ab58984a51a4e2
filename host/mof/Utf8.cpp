#include "host/mof/Utf8.h"

namespace cmpihost {

namespace {

constexpr std::uint32_t replacement = 0xFFFD;

bool isContinuation(unsigned char byte, unsigned char least, unsigned char most) {
    return byte >= least && byte <= most;
}

}  // namespace

void appendUtf8(std::string& text, std::uint32_t codePoint) {
    const bool surrogate = codePoint >= 0xD800 && codePoint <= 0xDFFF;
    const std::uint32_t code = surrogate || codePoint > 0x10FFFF ? replacement : codePoint;
    const auto tail = [&text, code](unsigned shift) {
        text += static_cast<char>(0x80U | ((code >> shift) & 0x3FU));
    };
    if (code < 0x80) {
        text += static_cast<char>(code);
    } else if (code < 0x800) {
        text += static_cast<char>(0xC0U | (code >> 6U));
        tail(0);
    } else if (code < 0x10000) {
        text += static_cast<char>(0xE0U | (code >> 12U));
        tail(6);
        tail(0);
    } else {
        text += static_cast<char>(0xF0U | (code >> 18U));
        tail(12);
        tail(6);
        tail(0);
    }
}

std::size_t characterLength(std::string_view text, std::size_t offset) {
    const auto byte = [text, offset](std::size_t index) {
        return offset + index < text.size() ? static_cast<unsigned char>(text[offset + index])
                                            : static_cast<unsigned char>(0);
    };
    const unsigned char first = byte(0);
    if (offset >= text.size()) {
        return 0;
    }
    if (first < 0x80) {
        return 1;
    }
    const std::size_t length = first >= 0xC2 && first <= 0xDF   ? 2
                               : first >= 0xE0 && first <= 0xEF ? 3
                               : first >= 0xF0 && first <= 0xF4 ? 4
                                                                : 0;
    // The second byte's range rules out overlong forms, surrogates and numbers past U+10FFFF.
    const unsigned char least = first == 0xE0 ? 0xA0 : first == 0xF0 ? 0x90 : 0x80;
    const unsigned char most = first == 0xED ? 0x9F : first == 0xF4 ? 0x8F : 0xBF;
    if (length == 0 || !isContinuation(byte(1), least, most)) {
        return 0;
    }
    for (std::size_t index = 2; index < length; ++index) {
        if (!isContinuation(byte(index), 0x80, 0xBF)) {
            return 0;
        }
    }
    return length;
}

std::size_t countCharacters(std::string_view text) {
    std::size_t count = 0;
    for (std::size_t offset = 0; offset < text.size(); ++count) {
        const std::size_t length = characterLength(text, offset);
        offset += length == 0 ? 1 : length;
    }
    return count;
}

std::uint32_t firstCodePoint(std::string_view text) {
    const std::size_t length = characterLength(text, 0);
    if (length == 0) {
        return replacement;
    }
    const auto first = static_cast<unsigned char>(text[0]);
    std::uint32_t code = length == 1 ? first : first & (0x7FU >> length);
    for (std::size_t index = 1; index < length; ++index) {
        code = (code << 6U) | (static_cast<unsigned char>(text[index]) & 0x3FU);
    }
    return code;
}

std::string validUtf8(std::string_view text) {
    std::string result;
    for (std::size_t offset = 0; offset < text.size();) {
        const std::size_t length = characterLength(text, offset);
        if (length == 0) {
            appendUtf8(result, replacement);
            ++offset;
        } else {
            result += text.substr(offset, length);
            offset += length;
        }
    }
    return result;
}

}  // namespace cmpihost
