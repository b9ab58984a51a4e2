// A host's files may hold anything: a text that is not wholly what it should be gives no value,
// rather than a part of one that looks like another.
#include "Parsing.h"

#include <algorithm>
#include <charconv>
#include <utility>

#include "base/Ascii.h"
#include "base/Utf8.h"

namespace VA::Linux {

namespace {

constexpr std::size_t maxCharacters = 256;

bool isBlank(char c) {
    return c == ' ' || c == '\t' || c == '\r';
}

void skipBlanks(std::string_view& text) {
    while (!text.empty() && isBlank(text.front())) text.remove_prefix(1);
}

// What may follow a closing quote.
bool isEmptyOrComment(std::string_view text) {
    const bool separated = !text.empty() && isBlank(text.front());
    skipBlanks(text);
    return text.empty() || (separated && text.front() == '#');
}

bool isEscapedInDoubleQuotes(char c) {
    return c == '$' || c == '"' || c == '\\' || c == '`';
}

std::optional<std::string> singleQuoted(std::string_view text) {
    const auto end = text.find('\'');
    if (end == std::string_view::npos || !isEmptyOrComment(text.substr(end + 1))) {
        return std::nullopt;
    }
    return std::string(text.substr(0, end));
}

std::optional<std::string> doubleQuoted(std::string_view text) {
    std::string value;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool hasNext = i + 1 < text.size();
        if (text[i] == '"') {
            if (!isEmptyOrComment(text.substr(i + 1))) return std::nullopt;
            return value;
        }
        if (text[i] == '\\' && hasNext && isEscapedInDoubleQuotes(text[i + 1])) ++i;
        value += text[i];
    }
    return std::nullopt;
}

std::optional<std::string> bare(std::string_view text) {
    std::string value;
    std::size_t kept = 0;  // length of the value without the blanks at its end
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '"' || text[i] == '\'') return std::nullopt;
        if (text[i] == '#' && kept < value.size()) break;
        const bool escaped = text[i] == '\\';
        if (escaped && ++i == text.size()) return std::nullopt;
        value += text[i];
        if (escaped || !isBlank(text[i])) kept = value.size();
    }
    value.resize(kept);
    return value;
}

// The value behind the equals sign.
std::optional<std::string> unquoted(std::string_view text) {
    if (text.empty() || isBlank(text.front())) {
        return isEmptyOrComment(text) ? std::optional<std::string>("") : std::nullopt;
    }
    if (text.front() == '\'') return singleQuoted(text.substr(1));
    if (text.front() == '"') return doubleQuoted(text.substr(1));
    return bare(text);
}

}  // namespace

bool isAllDigits(std::string_view text) {
    return !text.empty() && std::all_of(text.begin(), text.end(), base::isDigit);
}

std::optional<std::uint64_t> parseDecimal(std::string_view text) {
    if (!isAllDigits(text)) return std::nullopt;
    std::uint64_t value = 0;
    const auto result = std::from_chars(text.data(), text.data() + text.size(), value);
    if (result.ec != std::errc()) return std::nullopt;
    return value;
}

bool isPlainText(std::string_view text) {
    bool blank = true;
    for (std::size_t count = 0; !text.empty(); ++count) {
        const base::Utf8Char character = base::takeUtf8(text);
        const bool isControl = base::classOf(character.codePoint) == base::CharClass::control;
        if (!character.valid || isControl || count == maxCharacters) return false;
        blank = blank && character.codePoint == ' ';
    }
    return !blank;
}

std::optional<std::string> envFileValue(std::string_view text, std::string_view name) {
    std::optional<std::string> value;
    forEachLine(text, [&](std::string_view line, bool) {
        skipBlanks(line);
        if (line.size() <= name.size() || line.substr(0, name.size()) != name) return;
        if (line[name.size()] != '=') return;
        if (auto assigned = unquoted(line.substr(name.size() + 1))) value = std::move(assigned);
    });
    return value;
}

}  // namespace VA::Linux
