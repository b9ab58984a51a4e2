#ifndef BASE_UTF8_H
#define BASE_UTF8_H

#include <array>
#include <cstddef>
#include <string>
#include <string_view>

/// UTF-8, and texts of unknown origin written out so that they harm nobody. What is noexcept
/// allocates nothing; the rest throws std::bad_alloc only. Any thread may call these.
namespace base {

/// Stands for what is no character.
constexpr char32_t replacementCharacter = 0xFFFD;

/// What a text begins with: one character, or one byte that is none.
struct Utf8Char {
    std::size_t length;  ///< in bytes, 1 to 4; 1 for a byte that is no character
    char32_t codePoint;  ///< replacementCharacter for a byte that is no character
    bool valid;          ///< whether it is a well-formed character
};

/// The first character of `text`, which must not be empty. Overlong forms, surrogates, numbers
/// beyond U+10FFFF and characters that are cut off are not well-formed.
Utf8Char decodeUtf8(std::string_view text) noexcept;

/// The same, taken off the front of `text`.
Utf8Char takeUtf8(std::string_view& text) noexcept;

/// Whether the byte may begin a character: it is no continuation byte.
constexpr bool startsUtf8(char byte) noexcept {
    return (static_cast<unsigned char>(byte) & 0xC0U) != 0x80U;
}

/// The number of characters; each byte that is none counts as one.
std::size_t countUtf8(std::string_view text) noexcept;

/// Appends a code point; one that UTF-8 cannot carry becomes replacementCharacter.
void appendUtf8(std::string& text, char32_t codePoint);

/// The text with replacementCharacter for every byte that is no character.
std::string toValidUtf8(std::string_view text);

enum class CharClass {
    printable,
    control,    ///< C0, DEL and C1
    layout,     ///< separates lines or paragraphs, or turns the direction of writing around
    invisible,  ///< has no width: blanks, joiners, operators, the byte order mark
};

CharClass classOf(char32_t codePoint) noexcept;

/// Whether it is a character that everybody can see and that changes nothing around it.
bool isPrintable(const Utf8Char& character) noexcept;

/// What is written out, and how. Digits of logText, logField and ascii are in upper case.
enum class EscapeStyle {
    /// All that is not printable: each of its bytes as \xNN. A backslash becomes two, so that the
    /// text can be restored.
    logText,
    /// The same, and blanks as \x20: for a field that a blank ends.
    logField,
    /// What could steer a terminal: control characters as \n, \t, \r or \x1b, layout as \u202e,
    /// bytes that are no characters as \xff. For people: backslashes stay as they are.
    terminal,
    /// Each byte that is no printable ASCII character as \xNN. Backslashes stay as they are.
    ascii,
};

/// One character, written out.
class EscapedChar {
  public:
    /// The first character of `text`, which must not be empty and must outlive this object.
    EscapedChar(std::string_view text, EscapeStyle style) noexcept;

    /// The bytes of the text that it stands for.
    std::size_t length() const noexcept { return source_.size(); }

    /// Valid as long as this object.
    std::string_view written() const noexcept {
        return size_ == 0 ? source_ : std::string_view(escape_.data(), size_);
    }

  private:
    enum class Digits { upper, lower };

    void append(std::string_view part) noexcept;
    void appendHex(char32_t number, unsigned digits, Digits form) noexcept;
    void appendForTerminal(char32_t codePoint) noexcept;

    std::string_view source_;
    std::size_t size_ = 0;         // of the escape; none for what stands for itself
    std::array<char, 16> escape_;  // four bytes of \xNN
};

/// A whole text, written out.
std::string escape(std::string_view text, EscapeStyle style);

inline std::string escapeForTerminal(std::string_view text) {
    return escape(text, EscapeStyle::terminal);
}

}  // namespace base

#endif
