#include "host/mof/MofTokens.h"

#include <utility>

#include "host/broker/Value.h"

namespace cmpihost::mof {

bool isWord(const Token& token, const std::string& word) {
    const bool named = token.kind == TokenKind::Identifier || token.kind == TokenKind::Pragma;
    return named && equalNames(token.text, word);
}

Tokens::Tokens(std::string_view text, const std::string& file)
    : lexer_(text, file), next_(lexer_.next()) {}

bool Tokens::peekIs(const char* punctuation) const {
    return next_.kind == TokenKind::Punctuation && next_.text == punctuation;
}

Token Tokens::take() {
    return std::exchange(next_, lexer_.next());
}

bool Tokens::accept(const char* punctuation) {
    const bool found = peekIs(punctuation);
    if (found) {
        take();
    }
    return found;
}

bool Tokens::acceptWord(const char* word) {
    const bool found = next_.kind == TokenKind::Identifier && isWord(next_, word);
    if (found) {
        take();
    }
    return found;
}

void Tokens::expect(const char* punctuation, const std::string& after) {
    if (!accept(punctuation)) {
        expected(std::string("'") + punctuation + "' after " + after);
    }
}

Token Tokens::identifier(const std::string& what) {
    if (next_.kind != TokenKind::Identifier) {
        expected(what);
    }
    return take();
}

std::string Tokens::texts(const std::string& what) {
    if (next_.kind != TokenKind::Text) {
        expected(what + " as a string");
    }
    std::string joined;
    while (next_.kind == TokenKind::Text) {
        joined += take().text;
    }
    return joined;
}

void Tokens::expected(const std::string& what) const {
    fail(next_.position, "expected " + what + ", found " + next_.described());
}

void Tokens::fail(Position position, const std::string& complaint) const {
    lexer_.fail(position, complaint);
}

}  // namespace cmpihost::mof
