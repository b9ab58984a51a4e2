// What was due is put in words only when it is not there: a schema has a million tokens.
#include "host/mof/TokenReader.h"

#include <utility>

#include "base/Ascii.h"

namespace cmpihost::mof {

namespace {

/// What an error is about: "property" and "Size" give "property 'Size'".
std::string named(const char* what, const std::string& name) {
    return name.empty() ? what : std::string(what) + " '" + name + "'";
}

}  // namespace

TokenReader::TokenReader(std::string_view text, const std::string& file)
    : lexer_(text, file), next_(lexer_.next()) {}

bool TokenReader::peekIs(char punctuation) const {
    return next_.kind == TokenKind::Punctuation && next_.text.front() == punctuation;
}

Token TokenReader::take() {
    return std::exchange(next_, lexer_.next());
}

bool TokenReader::accept(char punctuation) {
    const bool found = peekIs(punctuation);
    if (found) next_ = lexer_.next();
    return found;
}

bool TokenReader::acceptWord(const char* word) {
    const bool found =
        next_.kind == TokenKind::Identifier && base::equalsIgnoreCase(next_.text, word);
    if (found) next_ = lexer_.next();
    return found;
}

void TokenReader::expect(char punctuation, const char* after, const std::string& name) {
    if (accept(punctuation)) return;
    expected(std::string("'") + punctuation + "' after " + named(after, name));
}

Token TokenReader::identifier(const char* what, const std::string& name) {
    if (next_.kind != TokenKind::Identifier) expected(named(what, name));
    return take();
}

std::string TokenReader::joinedTexts(const char* what) {
    if (next_.kind != TokenKind::Text) expected(std::string(what) + " as a string");
    std::string joined = take().text;
    while (next_.kind == TokenKind::Text) joined += take().text;
    return joined;
}

void TokenReader::expected(const std::string& what) const {
    fail(next_.position, "expected " + what + ", found " + next_.described());
}

Scalar TokenReader::scalar() {
    switch (next_.kind) {
        case TokenKind::Text:
            return joinedTexts("a value");
        case TokenKind::Number:
        case TokenKind::Character:
            return take().value;
        default:
            break;
    }
    if (acceptWord("null")) return std::monostate();
    if (acceptWord("true")) return true;
    if (acceptWord("false")) return false;
    expected("a value (a string, a number, a character, TRUE, FALSE or NULL)");
}

Initializer TokenReader::list() {
    Initializer result{true, {}};
    expect('{', "'='");
    if (accept('}')) return result;
    do {
        result.items.push_back(scalar());
    } while (accept(','));
    expect('}', "the list of values");
    return result;
}

Initializer TokenReader::listOrNull() {
    return acceptWord("null") ? Initializer{false, {Scalar()}} : list();
}

Initializer TokenReader::initializer() {
    return peekIs('{') ? list() : Initializer{false, {scalar()}};
}

}  // namespace cmpihost::mof
