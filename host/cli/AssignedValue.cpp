#include "host/cli/AssignedValue.h"

#include "host/broker/DateTimeText.h"
#include "host/cli/PathText.h"
#include "host/cli/TerminalText.h"
#include "host/cli/UsageError.h"
#include "host/mof/MofTokens.h"
#include "host/mof/MofTypes.h"
#include "host/mof/MofValues.h"
#include "host/mof/SchemaCatalogue.h"

namespace cmpihost {

namespace {

mof::Value constant(const std::string& text, const mof::Feature& property) {
    mof::Tokens tokens(text, property.name);
    mof::Value result = mof::Values(tokens).scalarValue();
    if (!tokens.atEnd()) {
        tokens.expected("nothing after the value");
    }
    return result;
}

/// scalar fits the type of the property.
Value typed(const mof::Scalar& scalar, CMPIType type, const ClassCatalogue* catalogue) {
    struct ToValue {
        CMPIType type;
        const ClassCatalogue* catalogue;

        Value operator()(std::monostate) const { return Value::null(type); }
        Value operator()(bool boolean) const { return Value::fromBoolean(boolean); }
        Value operator()(std::uint64_t number) const {
            if (type == CMPI_real32 || type == CMPI_real64) {
                return Value::fromReal(static_cast<double>(number), type);
            }
            return isSigned() ? Value::fromSigned(static_cast<std::int64_t>(number), type)
                              : Value::fromUnsigned(number, type);
        }
        Value operator()(std::int64_t number) const {
            if (type == CMPI_real32 || type == CMPI_real64) {
                return Value::fromReal(static_cast<double>(number), type);
            }
            // An unsigned type takes none but "-0" of these.
            return isSigned() ? Value::fromSigned(number, type)
                              : Value::fromUnsigned(static_cast<std::uint64_t>(number), type);
        }
        Value operator()(double real) const { return Value::fromReal(real, type); }
        Value operator()(mof::Character character) const {
            return Value::fromUnsigned(character.code, CMPI_char16);
        }
        Value operator()(const std::string& text) const {
            return type == CMPI_ref ? Value::fromReference(parsePath(text, catalogue))
                                    : Value::fromText(text, type);
        }
        bool isSigned() const { return (type & CMPI_SINT) == CMPI_SINT; }
    };
    return std::visit(ToValue{type, catalogue}, scalar);
}

bool isWrittenBare(const mof::Feature& property) {
    return property.type == mof::Type::String || property.type == mof::Type::DateTime ||
           property.type == mof::Type::Reference;
}

/// MOF takes any text for a datetime.
bool isDateTimeOrNull(const mof::Scalar& scalar) {
    const auto* text = std::get_if<std::string>(&scalar);
    return text == nullptr || parseDateTime(*text).has_value();
}

/// A single text without quotes, as one gives it to a scalar: "{" begins a list instead.
mof::Value constantOrText(const std::string& text, const mof::Feature& property) {
    const bool list = property.array && text.substr(0, 1) == "{";
    const bool absent = property.type == mof::Type::DateTime && equalNames(text, "NULL");
    const bool bare = isWrittenBare(property) && !list && !absent;
    return bare ? mof::Value{false, {text}} : constant(text, property);
}

}  // namespace

Value assignedValue(const std::string& text, const mof::Feature& property,
                    const ClassCatalogue* catalogue) {
    const auto refuse = [&](const std::string& why) {
        throw UsageError("'" + terminalText(text) + "' is " + why + " for the property '" +
                         property.name + "'");
    };
    mof::Value value;
    try {
        value = constantOrText(text, property);
    } catch (const mof::MofError& error) {
        throw UsageError("the value of '" + property.name +
                         "': " + terminalText(error.complaint()));
    }
    if (value.array && !property.array) {
        refuse("a list, no single value,");
    }
    const CMPIType type = cmpiType(property);
    const auto elementType = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    std::vector<Value> elements;
    for (const mof::Scalar& item : value.items) {
        const bool wrongDate = property.type == mof::Type::DateTime && !isDateTimeOrNull(item);
        if (wrongDate || !mof::fits(item, property.type)) {
            refuse(std::string("no value of type ") + mof::nameOf(property.type));
        }
        elements.push_back(typed(item, elementType, catalogue));
    }
    const bool nullArray = property.array && !value.array && elements.front().isNull();
    if (nullArray) {
        return Value::null(type);
    }
    return property.array ? Value::fromArray(elementType, std::move(elements)) : elements.front();
}

}  // namespace cmpihost
