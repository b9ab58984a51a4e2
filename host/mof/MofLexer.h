#ifndef HOST_MOF_MOF_LEXER_H
#define HOST_MOF_MOF_LEXER_H

#include <string>
#include <string_view>

#include "host/mof/MofAst.h"

namespace cmpihost::mof {

enum class TokenKind { End, Identifier, Alias, Pragma, Number, Text, Character, Punctuation };

struct Token {
    TokenKind kind = TokenKind::End;
    Position position;
    /// The token as it is written; for a text its content without quotes and escapes.
    std::string text;
    /// The value of a number or a character; NULL for every other kind.
    Scalar value;

    /// The token in words, for "found ...": "'}'", "the string \"x\"", "the end of the file".
    std::string described() const;
};

/// Cuts a MOF text into tokens; comments and blanks fall out. Throws MofError.
class Lexer {
  public:
    /// text must outlive the lexer; file is only named in errors.
    Lexer(std::string_view text, std::string file);

    /// The next token; after the last one End, again and again.
    Token next();

    [[noreturn]] void fail(Position position, const std::string& complaint) const;

  private:
    char peek(std::size_t ahead = 0) const;
    char take();
    /// Takes so many bytes, none of them the end of a line.
    std::string_view takeWithinLine(std::size_t length);
    bool atEnd() const { return offset_ >= text_.size(); }
    void skipBlanksAndComments();
    void skipBlockComment();
    Token word(TokenKind kind, Position start);
    Token number(Position start);
    std::string quoted(Position start, char delimiter, const char* what);
    Token character(Position start);
    void appendEscape(std::string& to, const char* within);
    std::uint32_t hexadecimalEscape();

    std::string_view text_;
    std::string file_;
    std::size_t offset_ = 0;
    Position position_;
};

/// Reads a number as MOF writes it: decimal, octal (leading 0), hexadecimal (0x), binary (trailing
/// b) or real, each with an optional sign. Returns false with a complaint when it is none of these
/// or does not fit 64 bits.
bool parseNumber(const std::string& written, Scalar& value, std::string& complaint);

/// The text as a string constant of MOF, quotes included. Control characters become escapes; bytes
/// that are no UTF-8 become U+FFFD.
std::string stringLiteral(std::string_view text);

/// The code point as a character constant of MOF, with its quotes; one that is no printable ASCII
/// character as an escape.
std::string characterLiteral(char32_t code);

/// A finite real number, written in the fewest digits, as a real constant of MOF: that always has a
/// point with a digit after it.
std::string realLiteral(std::string number);

}  // namespace cmpihost::mof

#endif
