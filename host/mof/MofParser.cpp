#include "host/mof/MofParser.h"

#include <utility>

#include "host/broker/Value.h"
#include "host/mof/MofTokens.h"
#include "host/mof/MofTypes.h"
#include "host/mof/MofValues.h"
#include "host/mof/Names.h"

namespace cmpihost::mof {

namespace {

class Parser {
  public:
    Parser(std::string_view text, const std::string& file)
        : tokens_(text, file), values_(tokens_), file_(file) {}

    Document document() {
        Document result;
        while (!tokens_.atEnd()) {
            production(result);
        }
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

    Tokens tokens_;
    Values values_;
    std::string file_;
};

void Parser::production(Document& to) {
    if (tokens_.peek().kind == TokenKind::Pragma) {
        pragma(to);
        return;
    }
    std::vector<Qualifier> qualifiers = qualifierList();
    if (tokens_.acceptWord("class")) {
        to.classes.push_back(classDeclaration(std::move(qualifiers)));
    } else if (tokens_.acceptWord("instance")) {
        instanceDeclaration();
    } else if (qualifiers.empty() && tokens_.acceptWord("qualifier")) {
        qualifierDeclaration();
    } else {
        tokens_.expected(qualifiers.empty() ? "'class', 'instance', 'qualifier' or '#pragma'"
                                            : "'class' or 'instance' after the qualifiers");
    }
}

void Parser::pragma(Document& to) {
    const Token token = tokens_.take();
    if (!isWord(token, "#pragma")) {
        tokens_.fail(token.position, "expected '#pragma', found '" + token.text + "'");
    }
    const std::string name = tokens_.identifier("the name of the pragma").text;
    tokens_.expect("(", "the name of the pragma");
    const std::string parameter = tokens_.texts("the parameter of the pragma");
    tokens_.expect(")", "the parameter of the pragma");
    if (equalNames(name, "include")) {
        to.includes.push_back(parameter);
    }
}

Class Parser::classDeclaration(std::vector<Qualifier> qualifiers) {
    const Token name = tokens_.identifier("the name of the class");
    Class result;
    result.name = name.text;
    result.position = name.position;
    result.file = file_;
    result.qualifiers = std::move(qualifiers);
    alias();
    if (tokens_.accept(":")) {
        result.superclass = tokens_.identifier("the name of the superclass").text;
    }
    tokens_.expect("{", "the head of class '" + result.name + "'");
    NameSet seen;
    while (!tokens_.accept("}")) {
        member(result, seen);
    }
    tokens_.expect(";", "class '" + result.name + "'");
    return result;
}

void Parser::member(Class& to, NameSet& seen) {
    Feature head = feature();
    if (tokens_.accept("(")) {
        to.methods.push_back(method(std::move(head)));
        return;
    }
    arraySuffix(head);
    defaultValue(head);
    tokens_.expect(";", "property '" + head.name + "'");
    if (!seen.add(head.name)) {
        tokens_.fail(head.position,
                     "property '" + head.name + "' is declared twice in class '" + to.name + "'");
    }
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
    const Token name = tokens_.identifier("a name after the type '" + type.text + "'");
    result.name = name.text;
    result.position = name.position;
    return result;
}

Method Parser::method(Feature result) {
    Method declaration{std::move(result), parameters()};
    tokens_.expect(")", "the parameters of method '" + declaration.result.name + "'");
    tokens_.expect(";", "method '" + declaration.result.name + "'");
    return declaration;
}

std::vector<Feature> Parser::parameters() {
    std::vector<Feature> result;
    if (tokens_.peekIs(")")) {
        return result;
    }
    do {
        Feature parameter = feature();
        arraySuffix(parameter);
        result.push_back(std::move(parameter));
    } while (tokens_.accept(","));
    return result;
}

void Parser::arraySuffix(Feature& to) {
    if (!tokens_.accept("[")) {
        return;
    }
    if (tokens_.peek().kind == TokenKind::Number) {
        const Token size = tokens_.take();
        if (!fits(size.value, Type::UInt32) || size.value == Scalar(std::uint64_t{0})) {
            tokens_.fail(size.position, "expected the size of array '" + to.name +
                                            "' as a positive integer, found '" + size.text + "'");
        }
    }
    tokens_.expect("]", "the size of array '" + to.name + "'");
    to.array = true;
}

void Parser::defaultValue(Feature& to) {
    if (!tokens_.accept("=")) {
        return;
    }
    const Position start = tokens_.peek().position;
    to.defaultValue = values_.value(to.array);
    for (const Scalar& item : to.defaultValue->items) {
        if (!fits(item, to.type)) {
            tokens_.fail(start, std::string("the default of property '") + to.name +
                                    "' is no value of type " + nameOf(to.type));
        }
    }
}

std::vector<Qualifier> Parser::qualifierList() {
    std::vector<Qualifier> result;
    if (!tokens_.accept("[")) {
        return result;
    }
    NameSet seen;
    do {
        Qualifier next = qualifier();
        if (!seen.add(next.name)) {
            tokens_.fail(next.position, "qualifier '" + next.name + "' stands twice in one list");
        }
        result.push_back(std::move(next));
    } while (tokens_.accept(","));
    tokens_.expect("]", "the qualifiers");
    return result;
}

Qualifier Parser::qualifier() {
    const Token name = tokens_.identifier("the name of a qualifier");
    Qualifier result{name.text, name.position, std::nullopt};
    if (tokens_.accept("(")) {
        result.value = values_.scalarValue();
        tokens_.expect(")", "the value of qualifier '" + name.text + "'");
    } else if (tokens_.peekIs("{")) {
        result.value = values_.value(true);
    }
    if (tokens_.accept(":")) {
        tokens_.identifier("a flavor of qualifier '" + name.text + "'");
        while (tokens_.peek().kind == TokenKind::Identifier) {
            tokens_.take();
        }
    }
    return result;
}

void Parser::nameList(const char* what) {
    tokens_.expect("(", what);
    do {
        tokens_.identifier(std::string("a name in ") + what);
    } while (tokens_.accept(","));
    tokens_.expect(")", what);
}

void Parser::qualifierDeclaration() {
    Feature declared;
    declared.name = tokens_.identifier("the name of the qualifier").text;
    const std::string what = "qualifier '" + declared.name + "'";
    tokens_.expect(":", "the name of " + what);
    const Token type = tokens_.identifier("the type of " + what);
    if (!typeNamed(type.text)) {
        tokens_.fail(type.position, "'" + type.text + "' is no type");
    }
    declared.type = *typeNamed(type.text);
    arraySuffix(declared);
    defaultValue(declared);
    while (tokens_.accept(",")) {
        if (tokens_.acceptWord("scope")) {
            nameList("the scope");
        } else if (tokens_.acceptWord("flavor")) {
            nameList("the flavor");
        } else {
            tokens_.expected("'Scope' or 'Flavor'");
        }
    }
    tokens_.expect(";", what);
}

void Parser::instanceDeclaration() {
    if (!tokens_.acceptWord("of")) {
        tokens_.expected("'of' after 'instance'");
    }
    const std::string name = tokens_.identifier("the class of the instance").text;
    alias();
    tokens_.expect("{", "the head of the instance of '" + name + "'");
    while (!tokens_.accept("}")) {
        qualifierList();
        const std::string property = tokens_.identifier("the name of a property or '}'").text;
        tokens_.expect("=", "the name of property '" + property + "'");
        values_.anyValue();
        tokens_.expect(";", "the value of property '" + property + "'");
    }
    tokens_.expect(";", "the instance of '" + name + "'");
}

void Parser::alias() {
    if (tokens_.acceptWord("as")) {
        if (tokens_.peek().kind != TokenKind::Alias) {
            tokens_.expected("an alias ($name) after 'as'");
        }
        tokens_.take();
    }
}

}  // namespace

Document parse(std::string_view text, const std::string& file) {
    return Parser(text, file).document();
}

}  // namespace cmpihost::mof
