#include "host/mof/MofValues.h"

#include <utility>

namespace cmpihost::mof {

Scalar Values::scalar() {
    switch (tokens_.peek().kind) {
        case TokenKind::Text:
            return tokens_.texts("a value");
        case TokenKind::Number:
        case TokenKind::Character:
            return tokens_.take().value;
        default:
            break;
    }
    if (tokens_.acceptWord("null")) {
        return std::monostate();
    }
    if (tokens_.acceptWord("true")) {
        return true;
    }
    if (tokens_.acceptWord("false")) {
        return false;
    }
    tokens_.expected("a value (a string, a number, a character, TRUE, FALSE or NULL)");
}

Value Values::list() {
    Value result;
    result.array = true;
    tokens_.expect("{", "'='");
    if (tokens_.accept("}")) {
        return result;
    }
    do {
        result.items.push_back(scalar());
    } while (tokens_.accept(","));
    tokens_.expect("}", "the list of values");
    return result;
}

Value Values::value(bool array) {
    if (!array) {
        return {false, {scalar()}};
    }
    if (tokens_.acceptWord("null")) {
        return {false, {Scalar()}};
    }
    return list();
}

Value Values::scalarValue() {
    return tokens_.peekIs("{") ? list() : value(false);
}

Value Values::anyValue() {
    if (tokens_.peek().kind == TokenKind::Alias) {
        return {false, {tokens_.take().text}};
    }
    return scalarValue();
}

}  // namespace cmpihost::mof
