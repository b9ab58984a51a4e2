#include "host/cli/MofText.h"

#include "host/mof/Utf8.h"

namespace cmpihost {

namespace {

/// Always four digits: with fewer, a digit that follows in the text would be taken for one more.
std::string hexadecimalEscape(std::uint32_t code) {
    constexpr char symbols[] = "0123456789ABCDEF";
    std::string result = "\\x";
    for (unsigned shift = 16; shift > 0; shift -= 4) {
        result += symbols[(code >> (shift - 4)) & 0xFU];
    }
    return result;
}

/// The escape for a character that cannot stand for itself; empty when it can.
std::string escapeFor(std::uint32_t code, char delimiter) {
    constexpr std::string_view named = "\b\t\n\f\r\\";
    constexpr std::string_view letters = "btnfr\\";
    const auto character = static_cast<char>(code < 0x80 ? code : 0);
    const std::size_t index = character == '\0' ? std::string_view::npos : named.find(character);
    if (index != std::string_view::npos) {
        return {'\\', letters[index]};
    }
    if (character != '\0' && character == delimiter) {
        return {'\\', delimiter};
    }
    return code < 0x20 || (code >= 0x7F && code <= 0x9F) ? hexadecimalEscape(code) : std::string();
}

}  // namespace

std::string mofString(std::string_view text) {
    const std::string valid = validUtf8(text);
    std::string result = "\"";
    for (std::size_t offset = 0; offset < valid.size();) {
        const std::size_t length = characterLength(valid, offset);
        const std::string_view character = std::string_view(valid).substr(offset, length);
        const std::string escape = escapeFor(firstCodePoint(character), '"');
        result += escape.empty() ? std::string(character) : escape;
        offset += length;
    }
    return result + '"';
}

std::string mofCharacter(std::uint32_t code) {
    const std::string escape = escapeFor(code, '\'');
    if (!escape.empty()) {
        return "'" + escape + "'";
    }
    return "'" + (code < 0x80 ? std::string(1, static_cast<char>(code)) : hexadecimalEscape(code)) +
           "'";
}

}  // namespace cmpihost
