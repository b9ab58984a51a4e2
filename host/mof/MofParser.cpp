// Reads MOF by recursive descent with one token of lookahead, one function for each production of
// the grammar, so that every complaint can name what was due at its place.
#include "host/mof/MofParser.h"

#include <unordered_set>
#include <utility>

#include "base/Ascii.h"
#include "host/mof/TokenReader.h"

namespace cmpihost::mof {

namespace {

/// The names of one list, which CIM compares without case.
class NameSet {
  public:
    /// Whether the name is new.
    bool insert(const std::string& name) { return names_.insert(base::toLower(name)).second; }

  private:
    std::unordered_set<std::string> names_;
};

class Parser {
  public:
    Parser(std::string_view text, const std::string& file) : tokens_(text, file), file_(file) {}

    Document document();

  private:
    void production(Document& to);
    void pragma(Document& to);
    Class classDeclaration(std::vector<Qualifier> qualifiers);
    void member(Class& to, NameSet& properties, NameSet& methods);
    Feature feature();
    Method method(Feature result);
    std::vector<Feature> parameters();
    void arraySuffix(Feature& to);
    void defaultValue(Feature& to);
    std::vector<Qualifier> qualifierList();
    Qualifier qualifier();
    QualifierType qualifierType();
    std::vector<std::string> nameList(const char* what);
    void instanceDeclaration();
    void alias();

    TokenReader tokens_;
    std::string file_;
};

Document Parser::document() {
    Document result;
    result.file = file_;
    while (!tokens_.atEnd()) production(result);
    return result;
}

void Parser::production(Document& to) {
    if (tokens_.next().kind == TokenKind::Pragma) {
        pragma(to);
        return;
    }
    std::vector<Qualifier> qualifiers = qualifierList();
    if (tokens_.acceptWord("class")) {
        to.classes.push_back(classDeclaration(std::move(qualifiers)));
    } else if (tokens_.acceptWord("instance")) {
        instanceDeclaration();
    } else if (qualifiers.empty() && tokens_.acceptWord("qualifier")) {
        to.qualifierTypes.push_back(qualifierType());
    } else {
        tokens_.expected(qualifiers.empty() ? "'class', 'instance', 'qualifier' or '#pragma'"
                                            : "'class' or 'instance' after the qualifiers");
    }
}

void Parser::pragma(Document& to) {
    const Token token = tokens_.take();
    if (!base::equalsIgnoreCase(token.text, "#pragma"))
        tokens_.fail(token.position, "expected '#pragma', found '" + token.text + "'");
    const std::string name = tokens_.identifier("the name of the pragma").text;
    tokens_.expect('(', "the name of the pragma");
    std::string parameter = tokens_.joinedTexts("the parameter of the pragma");
    tokens_.expect(')', "the parameter of the pragma");
    // The others (locale, namespace) do not matter to who asks for classes.
    if (base::equalsIgnoreCase(name, "include"))
        to.includes.push_back({std::move(parameter), token.position});
}

Class Parser::classDeclaration(std::vector<Qualifier> qualifiers) {
    Token name = tokens_.identifier("the name of the class");
    Class result;
    result.name = std::move(name.text);
    result.position = name.position;
    result.file = file_;
    result.qualifiers = std::move(qualifiers);
    alias();
    if (tokens_.accept(':'))
        result.superclass = tokens_.identifier("the name of the superclass").text;
    tokens_.expect('{', "the head of class", result.name);
    NameSet properties;
    NameSet methods;
    while (!tokens_.accept('}')) member(result, properties, methods);
    tokens_.expect(';', "class", result.name);
    return result;
}

void Parser::member(Class& to, NameSet& properties, NameSet& methods) {
    // Only the parenthesis tells a method from a property, so both begin alike.
    Feature head = feature();
    const bool isMethod = tokens_.accept('(');
    if (!(isMethod ? methods : properties).insert(head.name)) {
        tokens_.fail(head.position, std::string(isMethod ? "method '" : "property '") + head.name +
                                        "' is declared twice in class '" + to.name + "'");
    }
    if (isMethod) {
        to.methods.push_back(method(std::move(head)));
        return;
    }
    arraySuffix(head);
    defaultValue(head);
    tokens_.expect(';', "property", head.name);
    to.properties.push_back(std::move(head));
}

Feature Parser::feature() {
    Feature result;
    result.qualifiers = qualifierList();
    const Token type =
        tokens_.identifier(result.qualifiers.empty() ? "a type, a class, qualifiers or '}'"
                                                     : "a type or a class after the qualifiers");
    if (tokens_.acceptWord("ref")) {
        result.type = Type::Reference;
        result.referenceClass = type.text;
    } else if (const std::optional<Type> known = typeNamed(type.text)) {
        result.type = *known;
    } else {
        tokens_.fail(type.position, "'" + type.text + "' is no type, and no REF follows it");
    }
    Token name = tokens_.identifier("a name after the type", type.text);
    result.name = std::move(name.text);
    result.position = name.position;
    return result;
}

Method Parser::method(Feature result) {
    Method declaration{std::move(result), parameters()};
    tokens_.expect(')', "the parameters of method", declaration.result.name);
    tokens_.expect(';', "method", declaration.result.name);
    return declaration;
}

std::vector<Feature> Parser::parameters() {
    std::vector<Feature> result;
    if (tokens_.peekIs(')')) return result;
    do {
        Feature parameter = feature();
        arraySuffix(parameter);
        result.push_back(std::move(parameter));
    } while (tokens_.accept(','));
    return result;
}

void Parser::arraySuffix(Feature& to) {
    if (!tokens_.accept('[')) return;
    // The size has to be right and is then forgotten: nothing here is stored in arrays.
    if (tokens_.next().kind == TokenKind::Number) {
        const Token size = tokens_.take();
        if (!fits(size.value, Type::UInt32) || size.value == Scalar(std::uint64_t{0})) {
            tokens_.fail(size.position, "expected the size of array '" + to.name +
                                            "' as a positive integer, found '" + size.text + "'");
        }
    }
    tokens_.expect(']', "the size of array", to.name);
    to.array = true;
}

void Parser::defaultValue(Feature& to) {
    if (!tokens_.accept('=')) return;
    const Position start = tokens_.next().position;
    if (to.type == Type::Reference && tokens_.next().kind == TokenKind::Alias) {
        // It stands for an instance, and instances are left out.
        tokens_.take();
        return;
    }
    to.defaultValue = to.array ? tokens_.listOrNull() : Initializer{false, {tokens_.scalar()}};
    for (const Scalar& item : to.defaultValue->items) {
        if (!fits(item, to.type)) {
            tokens_.fail(start, std::string("the default of property '") + to.name +
                                    "' is no value of type " + nameOf(to.type));
        }
    }
}

std::vector<Qualifier> Parser::qualifierList() {
    std::vector<Qualifier> result;
    if (!tokens_.accept('[')) return result;
    NameSet seen;
    do {
        Qualifier next = qualifier();
        if (!seen.insert(next.name)) {
            tokens_.fail(next.position, "qualifier '" + next.name + "' stands twice in one list");
        }
        result.push_back(std::move(next));
    } while (tokens_.accept(','));
    tokens_.expect(']', "the qualifiers");
    return result;
}

/// A word that is no flavor of the standard (ToInstance and others of object managers) says nothing
/// about subclasses.
void addFlavor(const std::string& word, Flavor& to) {
    const auto is = [&](const char* name) { return base::equalsIgnoreCase(word, name); };
    if (is("ToSubclass") || is("Restricted")) to.toSubclass = is("ToSubclass");
    if (is("EnableOverride") || is("DisableOverride")) to.overridable = is("EnableOverride");
    if (is("Translatable")) to.translatable = true;
}

Qualifier Parser::qualifier() {
    Token name = tokens_.identifier("the name of a qualifier");
    Qualifier result{std::move(name.text), name.position};
    if (tokens_.accept('(')) {
        result.value = tokens_.initializer();
        tokens_.expect(')', "the value of qualifier", result.name);
    } else if (tokens_.peekIs('{')) {
        result.value = tokens_.list();
    }
    if (tokens_.accept(':')) {
        addFlavor(tokens_.identifier("a flavor of qualifier", result.name).text, result.flavor);
        while (tokens_.next().kind == TokenKind::Identifier)
            addFlavor(tokens_.take().text, result.flavor);
    }
    return result;
}

std::vector<std::string> Parser::nameList(const char* what) {
    std::vector<std::string> names;
    tokens_.expect('(', what);
    do {
        names.push_back(tokens_.identifier((std::string("a name in ") + what).c_str()).text);
    } while (tokens_.accept(','));
    tokens_.expect(')', what);
    return names;
}

/// Read as a property is, for its type, array suffix and default have the same form.
QualifierType Parser::qualifierType() {
    Feature declared;
    Token name = tokens_.identifier("the name of the qualifier");
    declared.name = std::move(name.text);
    tokens_.expect(':', "the name of qualifier", declared.name);
    const Token type = tokens_.identifier("the type of qualifier", declared.name);
    if (!typeNamed(type.text)) tokens_.fail(type.position, "'" + type.text + "' is no type");
    declared.type = *typeNamed(type.text);
    arraySuffix(declared);
    defaultValue(declared);
    QualifierType result;
    while (tokens_.accept(',')) {
        if (tokens_.acceptWord("scope")) {
            result.scopes = nameList("the scope");
        } else if (tokens_.acceptWord("flavor")) {
            for (const std::string& word : nameList("the flavor")) addFlavor(word, result.flavor);
        } else {
            tokens_.expected("'Scope' or 'Flavor'");
        }
    }
    tokens_.expect(';', "qualifier", declared.name);
    result.name = std::move(declared.name);
    result.file = file_;
    result.position = name.position;
    result.type = declared.type;
    result.array = declared.array;
    result.defaultValue = std::move(declared.defaultValue);
    return result;
}

void Parser::instanceDeclaration() {
    if (!tokens_.acceptWord("of")) tokens_.expected("'of' after 'instance'");
    const std::string name = tokens_.identifier("the class of the instance").text;
    alias();
    tokens_.expect('{', "the head of the instance of", name);
    // Values are not held against a class: it may stand in a file that is read later.
    while (!tokens_.accept('}')) {
        qualifierList();
        const std::string property = tokens_.identifier("the name of a property or '}'").text;
        tokens_.expect('=', "the name of property", property);
        if (tokens_.next().kind == TokenKind::Alias) {
            tokens_.take();
        } else {
            tokens_.initializer();
        }
        tokens_.expect(';', "the value of property", property);
    }
    tokens_.expect(';', "the instance of", name);
}

void Parser::alias() {
    if (!tokens_.acceptWord("as")) return;
    if (tokens_.next().kind != TokenKind::Alias) tokens_.expected("an alias ($name) after 'as'");
    tokens_.take();
}

}  // namespace

Document parse(std::string_view text, const std::string& file) {
    return Parser(text, file).document();
}

Initializer parseInitializer(std::string_view text, const std::string& name) {
    TokenReader tokens(text, name);
    Initializer result = tokens.initializer();
    if (!tokens.atEnd()) tokens.expected("nothing after the value");
    return result;
}

}  // namespace cmpihost::mof
