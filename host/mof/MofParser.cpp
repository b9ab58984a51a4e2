// Reads MOF by recursive descent with one token of lookahead, one function for each production of
// the grammar, so that every complaint can name what was due at its place.
#include "host/mof/MofParser.h"

#include <unordered_set>
#include <utility>

#include "base/Ascii.h"
#include "host/mof/MofLexer.h"

namespace cmpihost::mof {

namespace {

/// Names seen so far; CIM compares them without case.
using NameSet = std::unordered_set<std::string>;

class Parser {
  public:
    Parser(std::string_view text, const std::string& file)
        : lexer_(text, file), next_(lexer_.next()), file_(file) {}

    Document document() {
        Document result;
        while (next_.kind != TokenKind::End) production(result);
        return result;
    }
    Initializer onlyInitializer() {
        Initializer result = initializer();
        if (next_.kind != TokenKind::End) expected("nothing after the value");
        return result;
    }

  private:
    void production(Document& to);
    void pragma(Document& to);
    Class classDeclaration(std::vector<Qualifier> qualifiers);
    void member(Class& to, NameSet& seen);
    Feature feature();
    Method method(Feature result);
    std::vector<Feature> parameters();
    void arraySuffix(Feature& to);
    void defaultValue(Feature& to);
    std::vector<Qualifier> qualifierList();
    Qualifier qualifier();
    void qualifierDeclaration();
    void nameList(const char* what);
    void instanceDeclaration();
    void alias();
    Scalar scalar();
    Initializer list();
    Initializer listOrNull();
    Initializer initializer();

    /// Whether the next token is that punctuation, or that name or keyword in any case.
    bool peekIs(const char* punctuation) const;
    bool peekIsWord(const char* word) const;
    /// The next token, and steps past it.
    Token take() { return std::exchange(next_, lexer_.next()); }
    /// Steps past the next token if it is that punctuation or word; says whether it did.
    bool accept(const char* punctuation);
    bool acceptWord(const char* word);
    /// Steps past that punctuation; otherwise fails with "expected ';' after " and `after`.
    void expect(const char* punctuation, const std::string& after);
    /// Takes a name; otherwise fails with "expected " and `what`.
    Token identifier(const std::string& what);
    /// Takes one string or several that stand side by side, joined.
    std::string joinedTexts(const std::string& what);
    /// Fails at the next token: "expected WHAT, found ...".
    [[noreturn]] void expected(const std::string& what) const;
    [[noreturn]] void fail(Position position, const std::string& complaint) const {
        lexer_.fail(position, complaint);
    }

    Lexer lexer_;
    Token next_;
    std::string file_;
};

bool Parser::peekIs(const char* punctuation) const {
    return next_.kind == TokenKind::Punctuation && next_.text == punctuation;
}

bool Parser::peekIsWord(const char* word) const {
    return next_.kind == TokenKind::Identifier && base::equalsIgnoreCase(next_.text, word);
}

bool Parser::accept(const char* punctuation) {
    const bool found = peekIs(punctuation);
    if (found) take();
    return found;
}

bool Parser::acceptWord(const char* word) {
    const bool found = peekIsWord(word);
    if (found) take();
    return found;
}

void Parser::expect(const char* punctuation, const std::string& after) {
    if (!accept(punctuation)) expected(std::string("'") + punctuation + "' after " + after);
}

Token Parser::identifier(const std::string& what) {
    if (next_.kind != TokenKind::Identifier) expected(what);
    return take();
}

std::string Parser::joinedTexts(const std::string& what) {
    if (next_.kind != TokenKind::Text) expected(what + " as a string");
    std::string joined;
    while (next_.kind == TokenKind::Text) joined += take().text;
    return joined;
}

void Parser::expected(const std::string& what) const {
    fail(next_.position, "expected " + what + ", found " + next_.described());
}

void Parser::production(Document& to) {
    if (next_.kind == TokenKind::Pragma) {
        pragma(to);
        return;
    }
    std::vector<Qualifier> qualifiers = qualifierList();
    if (acceptWord("class")) {
        to.classes.push_back(classDeclaration(std::move(qualifiers)));
    } else if (acceptWord("instance")) {
        instanceDeclaration();
    } else if (qualifiers.empty() && acceptWord("qualifier")) {
        qualifierDeclaration();
    } else {
        expected(qualifiers.empty() ? "'class', 'instance', 'qualifier' or '#pragma'"
                                    : "'class' or 'instance' after the qualifiers");
    }
}

void Parser::pragma(Document& to) {
    const Token token = take();
    if (!base::equalsIgnoreCase(token.text, "#pragma"))
        fail(token.position, "expected '#pragma', found '" + token.text + "'");
    const std::string name = identifier("the name of the pragma").text;
    expect("(", "the name of the pragma");
    const std::string parameter = joinedTexts("the parameter of the pragma");
    expect(")", "the parameter of the pragma");
    // The others (locale, namespace) do not matter to who asks for classes.
    if (base::equalsIgnoreCase(name, "include")) to.includes.push_back(parameter);
}

Class Parser::classDeclaration(std::vector<Qualifier> qualifiers) {
    const Token name = identifier("the name of the class");
    Class result;
    result.name = name.text;
    result.position = name.position;
    result.file = file_;
    result.qualifiers = std::move(qualifiers);
    alias();
    if (accept(":")) result.superclass = identifier("the name of the superclass").text;
    expect("{", "the head of class '" + result.name + "'");
    NameSet seen;
    while (!accept("}")) member(result, seen);
    expect(";", "class '" + result.name + "'");
    return result;
}

void Parser::member(Class& to, NameSet& seen) {
    // Only the parenthesis tells a method from a property, so both begin alike.
    Feature head = feature();
    if (accept("(")) {
        to.methods.push_back(method(std::move(head)));
        return;
    }
    arraySuffix(head);
    defaultValue(head);
    expect(";", "property '" + head.name + "'");
    if (!seen.insert(base::toLower(head.name)).second) {
        fail(head.position,
             "property '" + head.name + "' is declared twice in class '" + to.name + "'");
    }
    to.properties.push_back(std::move(head));
}

Feature Parser::feature() {
    Feature result;
    result.qualifiers = qualifierList();
    const Token type =
        identifier(result.qualifiers.empty() ? "a type, a class, qualifiers or '}'"
                                             : "a type or a class after the qualifiers");
    if (acceptWord("ref")) {
        result.type = Type::Reference;
        result.referenceClass = type.text;
    } else if (const std::optional<Type> known = typeNamed(type.text)) {
        result.type = *known;
    } else {
        fail(type.position, "'" + type.text + "' is no type, and no REF follows it");
    }
    const Token name = identifier("a name after the type '" + type.text + "'");
    result.name = name.text;
    result.position = name.position;
    return result;
}

Method Parser::method(Feature result) {
    Method declaration{std::move(result), parameters()};
    expect(")", "the parameters of method '" + declaration.result.name + "'");
    expect(";", "method '" + declaration.result.name + "'");
    return declaration;
}

std::vector<Feature> Parser::parameters() {
    std::vector<Feature> result;
    if (peekIs(")")) {
        return result;
    }
    do {
        Feature parameter = feature();
        arraySuffix(parameter);
        result.push_back(std::move(parameter));
    } while (accept(","));
    return result;
}

void Parser::arraySuffix(Feature& to) {
    if (!accept("[")) return;
    // The size has to be right and is then forgotten: nothing here is stored in arrays.
    if (next_.kind == TokenKind::Number) {
        const Token size = take();
        if (!fits(size.value, Type::UInt32) || size.value == Scalar(std::uint64_t{0})) {
            fail(size.position, "expected the size of array '" + to.name +
                                    "' as a positive integer, found '" + size.text + "'");
        }
    }
    expect("]", "the size of array '" + to.name + "'");
    to.array = true;
}

void Parser::defaultValue(Feature& to) {
    if (!accept("=")) return;
    const Position start = next_.position;
    to.defaultValue = to.array ? listOrNull() : Initializer{false, {scalar()}};
    for (const Scalar& item : to.defaultValue->items) {
        if (!fits(item, to.type)) {
            fail(start, std::string("the default of property '") + to.name +
                            "' is no value of type " + nameOf(to.type));
        }
    }
}

std::vector<Qualifier> Parser::qualifierList() {
    std::vector<Qualifier> result;
    if (!accept("[")) return result;
    NameSet seen;
    do {
        Qualifier next = qualifier();
        if (!seen.insert(base::toLower(next.name)).second) {
            fail(next.position, "qualifier '" + next.name + "' stands twice in one list");
        }
        result.push_back(std::move(next));
    } while (accept(","));
    expect("]", "the qualifiers");
    return result;
}

Qualifier Parser::qualifier() {
    const Token name = identifier("the name of a qualifier");
    Qualifier result{name.text, name.position, std::nullopt};
    if (accept("(")) {
        result.value = initializer();
        expect(")", "the value of qualifier '" + name.text + "'");
    } else if (peekIs("{")) {
        result.value = list();
    }
    // Flavors govern how qualifiers are inherited and overridden; nothing here asks for that.
    if (accept(":")) {
        identifier("a flavor of qualifier '" + name.text + "'");
        while (next_.kind == TokenKind::Identifier) take();
    }
    return result;
}

void Parser::nameList(const char* what) {
    expect("(", what);
    do {
        identifier(std::string("a name in ") + what);
    } while (accept(","));
    expect(")", what);
}

/// Read as a property is, for its type, array suffix and default have the same form.
void Parser::qualifierDeclaration() {
    Feature declared;
    declared.name = identifier("the name of the qualifier").text;
    const std::string what = "qualifier '" + declared.name + "'";
    expect(":", "the name of " + what);
    const Token type = identifier("the type of " + what);
    if (!typeNamed(type.text)) fail(type.position, "'" + type.text + "' is no type");
    declared.type = *typeNamed(type.text);
    arraySuffix(declared);
    defaultValue(declared);
    while (accept(",")) {
        if (acceptWord("scope")) {
            nameList("the scope");
        } else if (acceptWord("flavor")) {
            nameList("the flavor");
        } else {
            expected("'Scope' or 'Flavor'");
        }
    }
    expect(";", what);
}

void Parser::instanceDeclaration() {
    if (!acceptWord("of")) expected("'of' after 'instance'");
    const std::string name = identifier("the class of the instance").text;
    alias();
    expect("{", "the head of the instance of '" + name + "'");
    // Values are not held against a class: it may stand in a file that is read later.
    while (!accept("}")) {
        qualifierList();
        const std::string property = identifier("the name of a property or '}'").text;
        expect("=", "the name of property '" + property + "'");
        if (next_.kind == TokenKind::Alias) {
            take();
        } else {
            initializer();
        }
        expect(";", "the value of property '" + property + "'");
    }
    expect(";", "the instance of '" + name + "'");
}

void Parser::alias() {
    if (acceptWord("as")) {
        if (next_.kind != TokenKind::Alias) expected("an alias ($name) after 'as'");
        take();
    }
}

Scalar Parser::scalar() {
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

Initializer Parser::list() {
    Initializer result{true, {}};
    expect("{", "'='");
    if (accept("}")) return result;
    do {
        result.items.push_back(scalar());
    } while (accept(","));
    expect("}", "the list of values");
    return result;
}

/// NULL alone is an array that is not there, not one with a null in it.
Initializer Parser::listOrNull() {
    return acceptWord("null") ? Initializer{false, {Scalar()}} : list();
}

/// Some writers put the list of a qualifier in parentheses, where a single constant belongs.
Initializer Parser::initializer() {
    return peekIs("{") ? list() : Initializer{false, {scalar()}};
}

}  // namespace

Document parse(std::string_view text, const std::string& file) {
    return Parser(text, file).document();
}

Initializer parseInitializer(std::string_view text, const std::string& name) {
    return Parser(text, name).onlyInitializer();
}

}  // namespace cmpihost::mof
