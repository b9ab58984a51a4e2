#pragma once

#include <string>
#include <string_view>

#include "host/mof/MofLexer.h"

namespace cmpihost::mof {

/// Whether the token is that word (a name, a keyword or a pragma), without case.
bool isWord(const Token& token, const std::string& word);

/// The tokens of a text with one token of foresight, and the complaints when another was due.
/// Every operation throws MofError when the text cannot be cut into tokens.
class Tokens {
  public:
    Tokens(std::string_view text, const std::string& file);

    const Token& peek() const { return next_; }
    bool atEnd() const { return next_.kind == TokenKind::End; }
    bool peekIs(const char* punctuation) const;

    /// The token that peek() shows, and steps past it.
    Token take();

    /// Steps past the token if it is that punctuation or word; says whether it did.
    bool accept(const char* punctuation);
    bool acceptWord(const char* word);

    /// Steps past that punctuation; otherwise fails with "expected ';' after " and `after`.
    void expect(const char* punctuation, const std::string& after);

    /// Takes a name; otherwise fails with "expected " and `what`.
    Token identifier(const std::string& what);

    /// Takes one string or several that stand side by side, joined.
    std::string texts(const std::string& what);

    /// Fails at the token that peek() shows: "expected WHAT, found ...".
    [[noreturn]] void expected(const std::string& what) const;

    [[noreturn]] void fail(Position position, const std::string& complaint) const;

  private:
    Lexer lexer_;
    Token next_;
};

}  // namespace cmpihost::mof
