#include "host/cli/TerminalText.h"

#include <cstdint>

#include "host/mof/Utf8.h"

namespace cmpihost {

namespace {

std::string hexadecimal(std::uint32_t number, int digits) {
    constexpr char symbols[] = "0123456789abcdef";
    std::string result;
    for (int shift = (digits - 1) * 4; shift >= 0; shift -= 4) {
        result += symbols[(number >> static_cast<unsigned>(shift)) & 0xFU];
    }
    return result;
}

bool isControl(std::uint32_t code) {
    return code < 0x20 || (code >= 0x7F && code <= 0x9F);
}

bool changesLayout(std::uint32_t code) {
    return code == 0x200E || code == 0x200F || (code >= 0x2028 && code <= 0x202E) ||
           (code >= 0x2066 && code <= 0x2069);
}

std::string written(std::string_view character) {
    const std::uint32_t code = firstCodePoint(character);
    if (isControl(code)) {
        return code == '\n'   ? "\\n"
               : code == '\t' ? "\\t"
               : code == '\r' ? "\\r"
                              : "\\x" + hexadecimal(code, 2);
    }
    return changesLayout(code) ? "\\u" + hexadecimal(code, 4) : std::string(character);
}

}  // namespace

std::string terminalText(std::string_view text) {
    std::string result;
    for (std::size_t offset = 0; offset < text.size();) {
        const std::size_t length = characterLength(text, offset);
        if (length == 0) {
            result += "\\x" + hexadecimal(static_cast<unsigned char>(text[offset]), 2);
            ++offset;
        } else {
            result += written(text.substr(offset, length));
            offset += length;
        }
    }
    return result;
}

}  // namespace cmpihost
