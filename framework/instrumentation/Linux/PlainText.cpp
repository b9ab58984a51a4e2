#include "PlainText.h"

#include <cstddef>
#include <cstdint>
#include <optional>

namespace VA::Linux {

namespace {

constexpr std::size_t mostCharacters = 256;

// A form of UTF-8: how its first byte is recognised, and the least character that may be written
// so.
struct Form {
    std::uint8_t mask;
    std::uint8_t lead;
    std::size_t length;
    char32_t least;
};

constexpr Form forms[] = {
    {0x80, 0x00, 1, 0},
    {0xe0, 0xc0, 2, 0x80},
    {0xf0, 0xe0, 3, 0x800},
    {0xf8, 0xf0, 4, 0x10000},
};

std::uint8_t byteAt(std::string_view text, std::size_t index) {
    return static_cast<std::uint8_t>(text[index]);
}

std::optional<char32_t> decode(std::string_view text, const Form& form) {
    if (text.size() < form.length) return std::nullopt;
    char32_t character = byteAt(text, 0) & static_cast<std::uint8_t>(~form.mask);
    for (std::size_t i = 1; i < form.length; ++i) {
        if ((byteAt(text, i) & 0xc0) != 0x80) return std::nullopt;
        character = character << 6 | (byteAt(text, i) & 0x3f);
    }
    const bool surrogate = character >= 0xd800 && character <= 0xdfff;
    if (character < form.least || character > 0x10ffff || surrogate) return std::nullopt;
    return character;
}

// Takes one character off the front; nothing, with `text` untouched, where it is not UTF-8.
std::optional<char32_t> takeCharacter(std::string_view& text) {
    for (const Form& form : forms) {
        if ((byteAt(text, 0) & form.mask) != form.lead) continue;
        const auto character = decode(text, form);
        if (character) text.remove_prefix(form.length);
        return character;
    }
    return std::nullopt;
}

bool isControl(char32_t character) {
    return character < 0x20 || (character >= 0x7f && character < 0xa0);
}

}  // namespace

bool isPlainText(std::string_view text) {
    bool blank = true;
    for (std::size_t count = 0; !text.empty(); ++count) {
        const auto character = takeCharacter(text);
        if (!character || isControl(*character) || count == mostCharacters) return false;
        blank = blank && *character == ' ';
    }
    return !blank;
}

}  // namespace VA::Linux
