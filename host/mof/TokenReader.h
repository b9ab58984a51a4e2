#ifndef HOST_MOF_TOKEN_READER_H
#define HOST_MOF_TOKEN_READER_H

#include <string>
#include <string_view>

#include "host/mof/MofAst.h"
#include "host/mof/MofLexer.h"

namespace cmpihost::mof {

/// The tokens of a text with one token of lookahead, and the constants, which stand in every
/// production. Throws MofError for what is not as it is asked for.
class TokenReader {
  public:
    /// text must outlive the reader; file is only named in errors.
    TokenReader(std::string_view text, const std::string& file);

    const Token& next() const { return next_; }
    bool atEnd() const { return next_.kind == TokenKind::End; }
    /// Whether the next token is that punctuation.
    bool peekIs(char punctuation) const;
    /// The next token, and steps past it.
    Token take();
    /// Steps past the next token if it is that punctuation, or that name or keyword in any case;
    /// says whether it did.
    bool accept(char punctuation);
    bool acceptWord(const char* word);
    /// Steps past that punctuation; otherwise fails with "expected ';' after " and `after`.
    void expect(char punctuation, const char* after, const std::string& name = {});
    /// Takes a name; otherwise fails with "expected " and `what`.
    Token identifier(const char* what, const std::string& name = {});
    /// Takes one string or several that stand side by side, joined.
    std::string joinedTexts(const char* what);

    Scalar scalar();
    Initializer list();
    /// A list, or NULL: an array that is not there, not one with a null in it.
    Initializer listOrNull();
    /// A constant or a list. Some writers put the list of a qualifier in parentheses, where a
    /// single constant belongs.
    Initializer initializer();

    /// Fails at the next token: "expected WHAT, found ...".
    [[noreturn]] void expected(const std::string& what) const;
    [[noreturn]] void fail(Position position, const std::string& complaint) const {
        lexer_.fail(position, complaint);
    }

  private:
    Lexer lexer_;
    Token next_;
};

}  // namespace cmpihost::mof

#endif
