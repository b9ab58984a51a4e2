#ifndef BASE_ASCII_H
#define BASE_ASCII_H

#include <string>
#include <string_view>

/// Characters and names of ASCII, whatever the process's locale is. Any thread may call these.
namespace base {

constexpr bool isDigit(char c) {
    return c >= '0' && c <= '9';
}

constexpr bool isAlpha(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
}

/// An ASCII letter in lower case, any other byte as it is.
constexpr char toLower(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

/// The text with its ASCII letters in lower case, the form in which CIM names compare.
std::string toLower(std::string_view text);

/// Whether two texts are the same but for the case of ASCII letters, as CIM compares names of
/// classes, properties, keys and roles.
bool equalsIgnoreCase(std::string_view left, std::string_view right);

}  // namespace base

#endif
