// Neither the locale nor its functions are used to tell what a terminal shows: the locale belongs
// to the whole process, and so to the provider in it.
#include "host/cli/Terminal.h"

#include <sys/ioctl.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdio>
#include <cstdlib>

#include "base/Ascii.h"
#include "base/Utf8.h"

namespace cmpihost {

namespace {

constexpr std::size_t usualWidth = 80;
/// With less room a text would become a column of words.
constexpr std::size_t leastRoom = 20;

struct WidthRange {
    char32_t low, high;
    std::size_t columns;
};

/// The characters that take more or less than a column, in ascending order: marks, and the scripts
/// and symbols that East Asian fonts draw wide.
constexpr WidthRange unusualWidths[] = {
    {0x0300, 0x036F, 0},   {0x0483, 0x0489, 0},   {0x0591, 0x05BD, 0},   {0x064B, 0x065F, 0},
    {0x1100, 0x115F, 2},   {0x1AB0, 0x1AFF, 0},   {0x1DC0, 0x1DFF, 0},   {0x200B, 0x200F, 0},
    {0x2060, 0x2064, 0},   {0x20D0, 0x20FF, 0},   {0x2E80, 0x303E, 2},   {0x3041, 0xA4CF, 2},
    {0xAC00, 0xD7A3, 2},   {0xF900, 0xFAFF, 2},   {0xFE00, 0xFE0F, 0},   {0xFE20, 0xFE2F, 0},
    {0xFE30, 0xFE6F, 2},   {0xFEFF, 0xFEFF, 0},   {0xFF01, 0xFF60, 2},   {0xFFE0, 0xFFE6, 2},
    {0x1F300, 0x1F64F, 2}, {0x1F680, 0x1F6FF, 2}, {0x1F900, 0x1F9FF, 2}, {0x20000, 0x3FFFD, 2},
};

std::size_t columnsOfCharacter(char32_t codePoint) {
    for (const WidthRange& range : unusualWidths) {
        if (codePoint < range.low) break;
        if (codePoint <= range.high) return range.columns;
    }
    return 1;
}

std::string_view environment(const char* name) {
    const char* const value = std::getenv(name);
    return value == nullptr ? std::string_view() : value;
}

bool localeHasUtf8() {
    for (const char* name : {"LC_ALL", "LC_CTYPE", "LANG"}) {
        const std::string locale = base::toLower(environment(name));
        if (locale.empty()) continue;
        return locale.find("utf-8") != std::string::npos ||
               locale.find("utf8") != std::string::npos;
    }
    return false;
}

std::size_t widthOf(int descriptor) {
    if (::isatty(descriptor) == 0) return 0;
    winsize size{};
    if (::ioctl(descriptor, TIOCGWINSZ, &size) == 0 && size.ws_col > 0) return size.ws_col;
    const std::string_view text = environment("COLUMNS");
    std::size_t columns = 0;
    std::from_chars(text.data(), text.data() + text.size(), columns);
    return columns > 0 ? columns : usualWidth;
}

std::string escapeOf(char32_t codePoint) {
    std::array<char, 16> text{};
    const char* const form = codePoint > 0xFFFF ? "\\U%08lx" : "\\u%04lx";
    std::snprintf(text.data(), text.size(), form, static_cast<unsigned long>(codePoint));
    return text.data();
}

}  // namespace

std::string Terminal::shown(std::string_view text) const {
    std::string safe = base::escapeForTerminal(text);
    if (utf8 || width == 0) return safe;
    std::string result;
    for (std::string_view rest = safe; !rest.empty();) {
        const char32_t codePoint = base::takeUtf8(rest).codePoint;
        result +=
            codePoint < 0x80 ? std::string(1, static_cast<char>(codePoint)) : escapeOf(codePoint);
    }
    return result;
}

Terminal terminalOf(int descriptor) {
    return {widthOf(descriptor), localeHasUtf8()};
}

std::size_t columnsOf(std::string_view text) {
    std::size_t columns = 0;
    while (!text.empty()) columns += columnsOfCharacter(base::takeUtf8(text).codePoint);
    return columns;
}

std::string wrap(std::string_view text, std::size_t width, std::size_t indent) {
    if (width < indent + leastRoom) return std::string(text);
    const std::string lineEnd = '\n' + std::string(indent, ' ');
    std::string result;
    std::size_t used = 0;
    char separator = '\0';
    while (true) {
        const std::size_t end = std::min(text.find_first_of(" \n"), text.size());
        const std::size_t columns = columnsOf(text.substr(0, end));
        const bool fits = indent + used + 1 + columns <= width;
        if (separator == '\n' || (separator == ' ' && !fits)) {
            result += lineEnd;
            used = 0;
        } else if (separator == ' ') {
            result += ' ';
            ++used;
        }
        result += text.substr(0, end);
        used += columns;
        if (end == text.size()) return result;
        separator = text[end];
        text.remove_prefix(end + 1);
    }
}

}  // namespace cmpihost
