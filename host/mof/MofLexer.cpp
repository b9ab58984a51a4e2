#include "host/mof/MofLexer.h"

#include <utility>

#include "host/mof/MofNumber.h"
#include "host/mof/Utf8.h"

namespace cmpihost::mof {

namespace {

bool isDigit(char c) {
    return c >= '0' && c <= '9';
}

bool isLetter(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_' ||
           static_cast<unsigned char>(c) >= 0x80;
}

bool isWordPart(char c) {
    return isLetter(c) || isDigit(c);
}

int hexDigit(char c) {
    if (isDigit(c)) {
        return c - '0';
    }
    const int lower = c | 0x20;
    return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

constexpr std::string_view punctuation = "()[]{},;:=";
constexpr std::string_view byteOrderMark = "\xEF\xBB\xBF";

}  // namespace

std::string Token::described() const {
    constexpr std::size_t most = 40;
    const std::string shown = text.size() > most ? text.substr(0, most) + "..." : text;
    switch (kind) {
        case TokenKind::End:
            return "the end of the file";
        case TokenKind::Text:
            return "the string \"" + shown + "\"";
        default:
            return "'" + shown + "'";
    }
}

Lexer::Lexer(std::string_view text, std::string file) : text_(text), file_(std::move(file)) {
    if (text_.substr(0, byteOrderMark.size()) == byteOrderMark) {
        offset_ = byteOrderMark.size();
    }
}

void Lexer::fail(Position position, const std::string& complaint) const {
    throw MofError(file_, position, complaint);
}

char Lexer::peek(std::size_t ahead) const {
    return offset_ + ahead < text_.size() ? text_[offset_ + ahead] : '\0';
}

char Lexer::take() {
    const char c = text_[offset_++];
    if (c == '\n') {
        ++position_.line;
        position_.column = 1;
    } else if (startsCharacter(c)) {
        ++position_.column;
    }
    return c;
}

void Lexer::skipBlockComment() {
    const Position start = position_;
    take();
    take();
    while (!(peek() == '*' && peek(1) == '/')) {
        if (atEnd()) {
            fail(start, "the comment that begins here is never closed by '*/'");
        }
        take();
    }
    take();
    take();
}

void Lexer::skipBlanksAndComments() {
    while (!atEnd()) {
        const char c = peek();
        if (c == ' ' || c == '\t' || c == '\r' || c == '\n' || c == '\f' || c == '\v') {
            take();
        } else if (c == '/' && peek(1) == '/') {
            while (!atEnd() && peek() != '\n') {
                take();
            }
        } else if (c == '/' && peek(1) == '*') {
            skipBlockComment();
        } else {
            return;
        }
    }
}

Token Lexer::next() {
    skipBlanksAndComments();
    const Position start = position_;
    if (atEnd()) {
        return {TokenKind::End, start, {}, {}};
    }
    const char c = peek();
    if (c == '"') {
        return quotedText(start);
    }
    if (c == '\'') {
        return character(start);
    }
    if (c == '#' || c == '$') {
        return word(c == '#' ? TokenKind::Pragma : TokenKind::Alias, start);
    }
    if (isLetter(c)) {
        return word(TokenKind::Identifier, start);
    }
    if (isDigit(c) || c == '+' || c == '-' || c == '.') {
        return number(start);
    }
    if (punctuation.find(c) != std::string_view::npos) {
        return {TokenKind::Punctuation, start, std::string(1, take()), {}};
    }
    fail(start, "the character '" + validUtf8(std::string(1, c)) + "' has no meaning here");
}

Token Lexer::word(TokenKind kind, Position start) {
    std::string text(1, take());
    while (isWordPart(peek())) {
        text += take();
    }
    return {kind, start, std::move(text), {}};
}

Token Lexer::number(Position start) {
    std::string text(1, take());
    bool hexadecimal = false;
    const auto inExponent = [&] {
        return !hexadecimal && (text.back() == 'e' || text.back() == 'E') &&
               (peek() == '+' || peek() == '-');
    };
    while (isWordPart(peek()) || peek() == '.' || inExponent()) {
        text += take();
        hexadecimal = hexadecimal || text.back() == 'x' || text.back() == 'X';
    }
    Token token{TokenKind::Number, start, text, {}};
    std::string complaint;
    if (!readNumber(text, token.value, complaint)) {
        fail(start, complaint);
    }
    return token;
}

std::uint32_t Lexer::hexadecimalEscape() {
    const Position start = position_;
    std::uint32_t code = 0;
    int digits = 0;
    for (; digits < 4 && hexDigit(peek()) >= 0; ++digits) {
        code = code * 16 + static_cast<std::uint32_t>(hexDigit(take()));
    }
    if (digits == 0) {
        fail(start, "expected one to four hexadecimal digits after '\\x'");
    }
    return code;
}

void Lexer::appendEscape(std::string& to, char delimiter) {
    constexpr std::string_view letters = "btnfr\"'\\";
    constexpr std::string_view meanings = "\b\t\n\f\r\"'\\";
    const Position start = position_;
    take();
    const char c = atEnd() ? '\0' : take();
    if (c == 'x' || c == 'X') {
        appendUtf8(to, hexadecimalEscape());
        return;
    }
    const std::size_t index = letters.find(c);
    if (index == std::string_view::npos) {
        fail(start, std::string("expected one of \\b \\t \\n \\f \\r \\\" \\' \\\\ \\x in the ") +
                        (delimiter == '"' ? "string" : "character"));
    }
    to += meanings[index];
}

Token Lexer::quotedText(Position start) {
    take();
    std::string content;
    while (peek() != '"') {
        if (atEnd() || peek() == '\n') {
            fail(start, "the string that begins here is not closed by '\"' on its line");
        }
        if (peek() == '\\') {
            appendEscape(content, '"');
        } else {
            content += take();
        }
    }
    take();
    return {TokenKind::Text, start, std::move(content), {}};
}

Token Lexer::character(Position start) {
    take();
    std::string content;
    while (peek() != '\'') {
        if (atEnd() || peek() == '\n') {
            fail(start, "the character that begins here is not closed by ' on its line");
        }
        if (peek() == '\\') {
            appendEscape(content, '\'');
        } else {
            content += take();
        }
    }
    take();
    if (countCharacters(content) != 1) {
        fail(start, "expected exactly one character between two '");
    }
    return {TokenKind::Character, start, content, Character{firstCodePoint(content)}};
}

}  // namespace cmpihost::mof
