// Reads object paths by hand, character by character, because a complaint is worth as much as a
// result: it points at the character where the path as the user wrote it goes wrong, also within
// references in quotes.
#include "host/cli/PathParser.h"

#include <charconv>
#include <unordered_set>
#include <utility>

#include "base/Ascii.h"
#include "base/Utf8.h"

namespace cmpihost {

namespace {

/// CIM names may hold every character beyond ASCII, in UTF-8 bytes from 0x80 on.
bool isNameStart(char c) {
    return base::isAlpha(c) || c == '_' || static_cast<unsigned char>(c) >= 0x80;
}

bool isNamePart(char c) {
    return isNameStart(c) || base::isDigit(c);
}

bool isNamespacePart(char c) {
    return isNamePart(c) || c == '-' || c == '/';
}

/// The text of a path, and for each byte of it the place where it stands in the text that the user
/// wrote: a reference in quotes is a path of its own whose escapes are already resolved.
struct Source {
    std::string text;
    std::vector<std::size_t> origins;
};

Source wholeText(const std::string& text) {
    Source source{text, {}};
    for (std::size_t offset = 0; offset <= text.size(); ++offset) source.origins.push_back(offset);
    return source;
}

class PathParser {
  public:
    /// `written` is the text of the user, for complaints.
    PathParser(const std::string& written, Source source, const ClassCatalogue* catalogue)
        : written_(written), source_(std::move(source)), catalogue_(catalogue) {}

    ObjectPathValue parse(const std::string& outerNamespace);
    std::string parseNamespace();

  private:
    [[noreturn]] void fail(std::size_t offset, const std::string& complaint) const {
        throw PathError(written_, source_.origins[offset], complaint);
    }
    bool atEnd() const { return offset_ == source_.text.size(); }
    char peek() const { return atEnd() ? '\0' : source_.text[offset_]; }
    bool accept(char c);
    std::string takeWhile(bool (*belongs)(char));

    std::string host();
    void refuseServerAddress() const;
    std::string nameSpace(const std::string& word, std::size_t start) const;
    std::string className(const std::string& word, std::size_t start) const;
    void keys(ObjectPathValue& path);
    KeyBinding key(const ClassDeclaration* declaration);
    Value value(CMPIType declared, const std::string& keyName);
    Value quotedValue(CMPIType declared);
    Value number();
    Source quotedText();

    const std::string& written_;
    Source source_;
    const ClassCatalogue* catalogue_;
    std::size_t offset_ = 0;
    std::string nameSpace_;
};

bool PathParser::accept(char c) {
    const bool found = !atEnd() && peek() == c;
    offset_ += found ? 1 : 0;
    return found;
}

std::string PathParser::takeWhile(bool (*belongs)(char)) {
    const std::size_t start = offset_;
    while (!atEnd() && belongs(peek())) ++offset_;
    return source_.text.substr(start, offset_ - start);
}

/// Other clients take the address of a server before the path, so it is what users try first.
void PathParser::refuseServerAddress() const {
    for (const char* scheme : {"http://", "https://"}) {
        const std::string start = source_.text.substr(0, std::string(scheme).size());
        if (base::equalsIgnoreCase(start, scheme)) {
            fail(0, std::string("a path begins with its namespace or class: leave out '") + scheme +
                        "...', the request stays on this machine");
        }
    }
}

std::string PathParser::host() {
    if (source_.text.compare(0, 2, "//") != 0) return {};
    offset_ = 2;
    std::string name = takeWhile([](char c) { return c != '/' && c != '"'; });
    if (name.empty()) fail(2, "expected the name of a host after '//'");
    if (!accept('/')) fail(offset_, "expected '/' and a namespace after the host '" + name + "'");
    return name;
}

std::string PathParser::nameSpace(const std::string& word, std::size_t start) const {
    // With a slash in front, a name that is missing at the start shows in the same way.
    const std::size_t doubled = ("/" + word).find("//");
    if (doubled != std::string::npos) {
        fail(start + doubled, "expected a name before '/' in the namespace");
    }
    if (word.back() == '/') fail(start + word.size(), "expected a name after '/' in the namespace");
    return word;
}

std::string PathParser::className(const std::string& word, std::size_t start) const {
    if (word.empty() || !isNameStart(word.front())) fail(start, "expected the name of a class");
    if (word.find('/') != std::string::npos) {
        fail(start + word.size(),
             "expected ':' and the name of a class after the namespace '" + word + "'");
    }
    // Taken along so far because namespaces may have it: the complaint can now point at it.
    const std::size_t dash = word.find('-');
    if (dash != std::string::npos) {
        fail(start + dash, "the name of a class holds letters, digits and '_' only");
    }
    return word;
}

ObjectPathValue PathParser::parse(const std::string& outerNamespace) {
    refuseServerAddress();
    ObjectPathValue path;
    path.hostName = host();
    path.nameSpace = outerNamespace;
    std::size_t start = offset_;
    std::string word = takeWhile(isNamespacePart);
    // Only what follows the first word shows whether it was a namespace or the class.
    if (!word.empty() && accept(':')) {
        path.nameSpace = nameSpace(word, start);
        start = offset_;
        word = takeWhile(isNamespacePart);
    }
    path.className = className(word, start);
    nameSpace_ = path.nameSpace;
    if (accept('.')) {
        keys(path);
    } else if (!atEnd()) {
        fail(offset_, "expected '.' and keys, or the end, after the class '" + word + "'");
    }
    return path;
}

std::string PathParser::parseNamespace() {
    const std::string word = takeWhile(isNamespacePart);
    if (word.empty()) fail(0, "expected the name of a namespace");
    if (!atEnd()) {
        fail(offset_, "the name of a namespace holds letters, digits, '_', '-' and '/' only");
    }
    return nameSpace(word, 0);
}

void PathParser::keys(ObjectPathValue& path) {
    const ClassDeclaration* declaration =
        catalogue_ == nullptr ? nullptr : catalogue_->find(path.className);
    std::unordered_set<std::string> seen;
    do {
        const std::size_t start = offset_;
        path.keys.push_back(key(declaration));
        if (!seen.insert(base::toLower(path.keys.back().name)).second) {
            fail(start, "the key '" + path.keys.back().name + "' stands twice");
        }
    } while (accept(','));
    if (!atEnd()) {
        fail(offset_, "expected ',' or the end after the value of '" + path.keys.back().name + "'");
    }
}

KeyBinding PathParser::key(const ClassDeclaration* declaration) {
    if (!isNameStart(peek())) fail(offset_, "expected the name of a key");
    const std::string name = takeWhile(isNamePart);
    if (!accept('=')) fail(offset_, "expected '=' after the key '" + name + "'");
    const PropertyDeclaration* property =
        declaration == nullptr ? nullptr : declaration->property(name);
    return {name, value(property == nullptr ? CMPI_string : property->type, name)};
}

Value PathParser::value(CMPIType declared, const std::string& keyName) {
    if (peek() == '"') return quotedValue(declared);
    if (base::isDigit(peek()) || peek() == '-' || peek() == '+') return number();
    const std::size_t start = offset_;
    const std::string word = takeWhile(isNamePart);
    if (base::equalsIgnoreCase(word, "TRUE") || base::equalsIgnoreCase(word, "FALSE")) {
        return Value::fromBoolean(base::equalsIgnoreCase(word, "TRUE"));
    }
    fail(start, "expected the value of '" + keyName +
                    "': a text in quotes, an integer, TRUE or FALSE (a shell keeps the quotes "
                    "when the path stands in '...')");
}

/// A key's text alone does not say whether it is a path or a datetime: the class does.
Value PathParser::quotedValue(CMPIType declared) {
    Source content = quotedText();
    if (declared == CMPI_ref) {
        PathParser inner(written_, std::move(content), catalogue_);
        return Value::fromReference(inner.parse(nameSpace_));
    }
    return Value::fromText(std::move(content.text),
                           declared == CMPI_dateTime ? CMPI_dateTime : CMPI_string);
}

Source PathParser::quotedText() {
    const std::size_t start = offset_++;
    Source content;
    while (!accept('"')) {
        const std::size_t at = offset_;
        if (accept('\\') && !atEnd() && peek() != '"' && peek() != '\\') {
            fail(at, "in a text '\\' stands before '\"' or '\\' only");
        }
        if (atEnd()) fail(start, "the text that begins here is not closed by '\"'");
        content.text += peek();
        content.origins.push_back(source_.origins[at]);
        ++offset_;
    }
    // Complaints may point behind the last character: the quote stands there.
    content.origins.push_back(source_.origins[offset_ - 1]);
    return content;
}

template <typename Number>
bool readWhole(const std::string& digits, Number& number) {
    const char* end = digits.data() + digits.size();
    const auto result = std::from_chars(digits.data(), end, number);
    return result.ec == std::errc() && result.ptr == end;
}

Value PathParser::number() {
    const std::size_t start = offset_;
    const bool negative = peek() == '-';
    offset_ += negative || peek() == '+' ? 1 : 0;
    const std::string digits = takeWhile(base::isDigit);
    if (digits.empty() || isNamePart(peek())) fail(offset_, "expected the digits of an integer");
    std::int64_t whenNegative{};
    std::uint64_t whenPositive{};
    // A sign '+' is no part of what from_chars reads, '-' is.
    const bool read =
        negative ? readWhole("-" + digits, whenNegative) : readWhole(digits, whenPositive);
    if (!read) fail(start, "the integer does not fit 64 bits");
    return whenNegative < 0 ? Value::fromSigned(whenNegative) : Value::fromUnsigned(whenPositive);
}

/// The column is counted in what is shown: escapes are longer than what was written.
std::string withCaret(const std::string& text, std::size_t offset, const std::string& complaint) {
    const std::size_t column = base::countUtf8(base::escapeForTerminal(text.substr(0, offset)));
    return base::escapeForTerminal(complaint) + "\n  " + base::escapeForTerminal(text) + "\n  " +
           std::string(column, ' ') + "^";
}

}  // namespace

PathError::PathError(const std::string& text, std::size_t offset, const std::string& complaint)
    : UsageError(withCaret(text, offset, complaint)), offset_(offset), complaint_(complaint) {}

ObjectPathValue parsePath(const std::string& text, const ClassCatalogue* catalogue) {
    return PathParser(text, wholeText(text), catalogue).parse(defaultNamespace);
}

std::string parseNamespace(const std::string& text) {
    return PathParser(text, wholeText(text), nullptr).parseNamespace();
}

}  // namespace cmpihost
