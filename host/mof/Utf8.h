#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace cmpihost {

/// Appends one code point; one that UTF-8 cannot carry becomes U+FFFD.
void appendUtf8(std::string& text, std::uint32_t codePoint);

/// Whether the byte begins a character (it is no continuation byte).
inline bool startsCharacter(char byte) {
    return (static_cast<unsigned char>(byte) & 0xC0U) != 0x80U;
}

/// The length in bytes of the well-formed UTF-8 character at that offset; 0 when there is none.
std::size_t characterLength(std::string_view text, std::size_t offset);

/// The number of characters; each byte that is no UTF-8 counts as one.
std::size_t countCharacters(std::string_view text);

/// The code point of the first character; U+FFFD when there is none.
std::uint32_t firstCodePoint(std::string_view text);

/// The text with every byte that is no UTF-8 replaced by U+FFFD.
std::string validUtf8(std::string_view text);

}  // namespace cmpihost
