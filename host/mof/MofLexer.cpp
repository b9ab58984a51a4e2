// Cuts MOF into tokens by hand, byte by byte: names may hold any character beyond ASCII, and
// positions count characters, which no generated scanner would give for free.
#include "host/mof/MofLexer.h"

#include <algorithm>
#include <charconv>
#include <limits>
#include <utility>

#include "base/Ascii.h"
#include "base/Utf8.h"

namespace cmpihost::mof {

namespace {

bool isLetter(char c) {
    return base::isAlpha(c) || c == '_' || static_cast<unsigned char>(c) >= 0x80;
}

bool isWordPart(char c) {
    return isLetter(c) || base::isDigit(c);
}

int hexDigit(char c) {
    if (base::isDigit(c)) return c - '0';
    const char lower = base::toLower(c);
    return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

/// The escapes of strings and characters, and what they stand for.
constexpr std::string_view escapeLetters = "btnfr\"'\\";
constexpr std::string_view escapedCharacters = "\b\t\n\f\r\"'\\";
constexpr std::string_view punctuation = "()[]{},;:=";
constexpr std::string_view byteOrderMark = "\xEF\xBB\xBF";

}  // namespace

std::string Token::described() const {
    // Descriptions in a schema are pages long.
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
    if (text_.substr(0, byteOrderMark.size()) == byteOrderMark) offset_ = byteOrderMark.size();
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
    } else if (base::startsUtf8(c)) {
        // Columns are what an editor shows: a character of several bytes is one.
        ++position_.column;
    }
    return c;
}

std::string_view Lexer::takeWithinLine(std::size_t length) {
    const std::string_view taken = text_.substr(offset_, length);
    for (const char c : taken) position_.column += base::startsUtf8(c) ? 1 : 0;
    offset_ += length;
    return taken;
}

void Lexer::skipBlockComment() {
    const Position start = position_;
    // Both marks go at once, for "/*/" does not end what it begins.
    take();
    take();
    while (!(peek() == '*' && peek(1) == '/')) {
        if (atEnd()) fail(start, "the comment that begins here is never closed by '*/'");
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
            while (!atEnd() && peek() != '\n') take();
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
    if (atEnd()) return {TokenKind::End, start, {}, {}};
    const char c = peek();
    if (c == '"') return {TokenKind::Text, start, quoted(start, '"', "string"), {}};
    if (c == '\'') return character(start);
    if (c == '#' || c == '$') return word(c == '#' ? TokenKind::Pragma : TokenKind::Alias, start);
    if (isLetter(c)) return word(TokenKind::Identifier, start);
    if (base::isDigit(c) || c == '+' || c == '-' || c == '.') return number(start);
    if (punctuation.find(c) != std::string_view::npos) {
        return {TokenKind::Punctuation, start, std::string(1, take()), {}};
    }
    fail(start, "the character '" + base::toValidUtf8(std::string(1, c)) + "' has no meaning here");
}

Token Lexer::word(TokenKind kind, Position start) {
    std::size_t length = 1;
    while (isWordPart(peek(length))) ++length;
    return {kind, start, std::string(takeWithinLine(length)), {}};
}

Token Lexer::number(Position start) {
    std::string text(1, take());
    bool hexadecimal = false;
    // "0x1e+2" is a number, a sign and a number: only decimals have exponents.
    const auto inExponent = [&] {
        return !hexadecimal && (text.back() == 'e' || text.back() == 'E') &&
               (peek() == '+' || peek() == '-');
    };
    // With the letters behind it, so that "12x" is one wrong number, not a number and a name.
    while (isWordPart(peek()) || peek() == '.' || inExponent()) {
        text += take();
        hexadecimal = hexadecimal || text.back() == 'x' || text.back() == 'X';
    }
    Token token{TokenKind::Number, start, text, {}};
    std::string complaint;
    if (!parseNumber(text, token.value, complaint)) fail(start, complaint);
    return token;
}

std::uint32_t Lexer::hexadecimalEscape() {
    const Position start = position_;
    std::uint32_t code = 0;
    int digits = 0;
    for (; digits < 4 && hexDigit(peek()) >= 0; ++digits) {
        code = code * 16 + static_cast<std::uint32_t>(hexDigit(take()));
    }
    if (digits == 0) fail(start, "expected one to four hexadecimal digits after '\\x'");
    return code;
}

void Lexer::appendEscape(std::string& to, const char* within) {
    const Position start = position_;
    take();
    const char c = atEnd() ? '\0' : take();
    if (c == 'x' || c == 'X') {
        base::appendUtf8(to, hexadecimalEscape());
        return;
    }
    const std::size_t index = escapeLetters.find(c);
    if (index == std::string_view::npos) {
        fail(start,
             std::string("expected one of \\b \\t \\n \\f \\r \\\" \\' \\\\ \\x in the ") + within);
    }
    to += escapedCharacters[index];
}

std::string Lexer::quoted(Position start, char delimiter, const char* what) {
    take();
    std::string content;
    // Most of a schema is the insides of strings: what stands for itself is taken at once.
    const auto takeRun = [&] {
        const std::string_view rest = text_.substr(offset_);
        std::size_t length = 0;
        while (length < rest.size() && rest[length] != delimiter && rest[length] != '\\' &&
               rest[length] != '\n')
            ++length;
        content += takeWithinLine(length);
    };
    for (takeRun(); peek() != delimiter; takeRun()) {
        // A quote that is missing is reported on its line, not at the end of the file.
        if (atEnd() || peek() == '\n')
            fail(start, std::string("the ") + what + " that begins here is not closed by " +
                            (delimiter == '"' ? "'\"'" : "'") + " on its line");
        appendEscape(content, what);
    }
    take();
    return content;
}

Token Lexer::character(Position start) {
    const std::string content = quoted(start, '\'', "character");
    if (base::countUtf8(content) != 1) fail(start, "expected exactly one character between two '");
    return {TokenKind::Character, start, content, Character{base::decodeUtf8(content).codePoint}};
}

namespace {

struct Digits {
    std::string_view text;
    int base;
};

/// A lone 0 is read as octal, where it is the same number.
Digits split(std::string_view unsignedText) {
    const std::string_view start = unsignedText.substr(0, 2);
    if (start == "0x" || start == "0X") return {unsignedText.substr(2), 16};
    if (!unsignedText.empty() && (unsignedText.back() == 'b' || unsignedText.back() == 'B')) {
        return {unsignedText.substr(0, unsignedText.size() - 1), 2};
    }
    return {unsignedText, start.substr(0, 1) == "0" ? 8 : 10};
}

bool isReal(std::string_view unsignedText) {
    return unsignedText.find('.') != std::string_view::npos;
}

template <typename Number, typename... Base>
std::errc convert(std::string_view text, Number& number, Base... base) {
    const char* end = text.data() + text.size();
    const auto result = std::from_chars(text.data(), end, number, base...);
    return result.ec == std::errc() && result.ptr != end ? std::errc::invalid_argument : result.ec;
}

std::errc readInteger(std::string_view unsignedText, bool negative, Scalar& value) {
    const Digits digits = split(unsignedText);
    std::uint64_t magnitude{};
    const std::errc error = convert(digits.text, magnitude, digits.base);
    if (error != std::errc()) return error;
    constexpr std::uint64_t mostNegative = std::uint64_t{1} << 63U;
    if (!negative) {
        value = magnitude;
    } else if (magnitude > mostNegative) {
        return std::errc::result_out_of_range;
        // This number has no positive counterpart that could be negated.
    } else if (magnitude == mostNegative) {
        value = std::numeric_limits<std::int64_t>::min();
    } else {
        value = -static_cast<std::int64_t>(magnitude);
    }
    return {};
}

std::errc readReal(std::string_view unsignedText, bool negative, Scalar& value) {
    double number{};
    const std::errc error = convert(unsignedText, number);
    value = negative ? -number : number;
    return error;
}

}  // namespace

bool parseNumber(const std::string& written, Scalar& value, std::string& complaint) {
    std::string_view text = written;
    const std::string_view sign = text.substr(0, 1);
    const bool negative = sign == "-";
    if (negative || sign == "+") text.remove_prefix(1);
    const std::errc error =
        isReal(text) ? readReal(text, negative, value) : readInteger(text, negative, value);
    if (error == std::errc::result_out_of_range) {
        complaint = "the number " + written + " does not fit 64 bits";
    } else if (error != std::errc()) {
        complaint = "expected a number, found '" + written + "'";
    }
    return error == std::errc();
}

namespace {

/// Always four digits: with fewer, a digit that follows in the text would be taken for one more.
std::string hexadecimalEscape(char32_t code) {
    constexpr char symbols[] = "0123456789ABCDEF";
    std::string result = "\\x";
    for (unsigned shift = 16; shift > 0; shift -= 4)
        result += symbols[(code >> (shift - 4)) & 0xFU];
    return result;
}

/// The character as it stands between two delimiters; one beyond ASCII stands for itself.
std::string literalPart(char32_t code, char delimiter) {
    const auto character = static_cast<char>(code < 0x80 ? code : 0);
    const std::size_t index = escapedCharacters.find(character);
    const bool otherDelimiter = character != delimiter && (character == '"' || character == '\'');
    if (index != std::string_view::npos && !otherDelimiter) return {'\\', escapeLetters[index]};
    if (base::classOf(code) == base::CharClass::control) return hexadecimalEscape(code);
    std::string result;
    base::appendUtf8(result, code);
    return result;
}

}  // namespace

std::string stringLiteral(std::string_view text) {
    std::string result = "\"";
    while (!text.empty()) result += literalPart(base::takeUtf8(text).codePoint, '"');
    return result + '"';
}

std::string characterLiteral(char32_t code) {
    return "'" + (code < 0x80 ? literalPart(code, '\'') : hexadecimalEscape(code)) + "'";
}

std::string realLiteral(std::string number) {
    if (number.find('.') == std::string::npos)
        number.insert(std::min(number.find('e'), number.size()), ".0");
    return number;
}

}  // namespace cmpihost::mof
