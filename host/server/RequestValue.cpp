#include "host/server/RequestValue.h"

#include <charconv>
#include <limits>
#include <set>
#include <utility>

#include "base/Ascii.h"
#include "base/Utf8.h"
#include "host/broker/DateTimeText.h"
#include "host/server/CimError.h"
#include "host/server/RequestPath.h"

namespace cmpihost::server {

namespace {

struct NamedType {
    const char* name;
    CMPIType type;
};

constexpr NamedType namedTypes[] = {
    {"boolean", CMPI_boolean}, {"string", CMPI_string}, {"char16", CMPI_char16},
    {"uint8", CMPI_uint8},     {"sint8", CMPI_sint8},   {"uint16", CMPI_uint16},
    {"sint16", CMPI_sint16},   {"uint32", CMPI_uint32}, {"sint32", CMPI_sint32},
    {"uint64", CMPI_uint64},   {"sint64", CMPI_sint64}, {"datetime", CMPI_dateTime},
    {"real32", CMPI_real32},   {"real64", CMPI_real64}, {"reference", CMPI_ref},
};

/// Of an integer type.
struct IntegerType {
    CMPIType type;
    unsigned bits;
    bool isSigned;
};

constexpr IntegerType integerTypes[] = {
    {CMPI_uint8, 8, false},   {CMPI_sint8, 8, true},    {CMPI_uint16, 16, false},
    {CMPI_sint16, 16, true},  {CMPI_uint32, 32, false}, {CMPI_sint32, 32, true},
    {CMPI_uint64, 64, false}, {CMPI_sint64, 64, true},
};

/// All of the text, read in that base.
template <class Number, class... Base>
std::optional<Number> wholeNumber(std::string_view text, Base... numberBase) {
    Number number{};
    const char* const end = text.data() + text.size();
    const auto [rest, error] = std::from_chars(text.data(), end, number, numberBase...);
    if (error != std::errc() || rest != end) return std::nullopt;
    return number;
}

std::optional<Value> integerFromText(std::string_view text, const IntegerType& type) {
    const bool isNegative = text.substr(0, 1) == "-";
    if (isNegative || text.substr(0, 1) == "+") text.remove_prefix(1);
    const bool isHex = text.substr(0, 2) == "0x" || text.substr(0, 2) == "0X";
    if (isHex) text.remove_prefix(2);
    const auto magnitude = wholeNumber<std::uint64_t>(text, isHex ? 16 : 10);
    if (!magnitude) return std::nullopt;

    const std::uint64_t most = ~std::uint64_t{0} >> (64 - type.bits + (type.isSigned ? 1 : 0));
    if (!isNegative) {
        if (*magnitude > most) return std::nullopt;
        return type.isSigned ? Value::fromSigned(static_cast<std::int64_t>(*magnitude), type.type)
                             : Value::fromUnsigned(*magnitude, type.type);
    }
    if (*magnitude > (type.isSigned ? most + 1 : 0)) return std::nullopt;
    // Of the lowest number there is no positive counterpart that could be negated.
    return type.isSigned ? Value::fromSigned(static_cast<std::int64_t>(0 - *magnitude), type.type)
                         : Value::fromUnsigned(0, type.type);
}

template <class Real>
std::optional<Value> realFromText(std::string_view text, CMPIType type) {
    constexpr Real infinity = std::numeric_limits<Real>::infinity();
    if (text == "INF") return Value::fromReal(infinity, type);
    if (text == "-INF") return Value::fromReal(-infinity, type);
    if (text == "NaN") return Value::fromReal(std::numeric_limits<Real>::quiet_NaN(), type);
    // Other spellings of these are read by the library only.
    if (text.find_first_not_of("+-.0123456789eE") != std::string_view::npos) return std::nullopt;
    if (text.substr(0, 1) == "+" && text.substr(1, 1) != "-") text.remove_prefix(1);
    const std::optional<Real> number = wholeNumber<Real>(text);
    if (!number) return std::nullopt;
    return Value::fromReal(*number, type);
}

std::optional<Value> booleanFromText(std::string_view text) {
    if (base::equalsIgnoreCase(text, "true")) return Value::fromBoolean(true);
    if (base::equalsIgnoreCase(text, "false")) return Value::fromBoolean(false);
    return std::nullopt;
}

std::optional<Value> characterFromText(std::string_view text) {
    if (text.empty()) return std::nullopt;
    const base::Utf8Char character = base::takeUtf8(text);
    if (!text.empty() || !character.valid || character.codePoint > 0xFFFF) return std::nullopt;
    return Value::fromUnsigned(character.codePoint, CMPI_char16);
}

std::optional<Value> dateTimeFromText(const std::string& text) {
    if (!parseDateTime(text)) return std::nullopt;
    // Nothing is known behind what is not known, but for the offset from UTC.
    const std::size_t unknown = text.find('*');
    if (unknown < 21 && text.find_first_not_of("*.", unknown) < 21) return std::nullopt;
    return Value::fromText(text, CMPI_dateTime);
}

CMPIType elementType(CMPIType type) {
    return static_cast<CMPIType>(type & ~CMPI_ARRAY);
}

/// `element` is no array.
Value readSingle(const XmlElement& element, CMPIType type, const ClassCatalogue& catalogue,
                 const std::string& nameSpace) {
    if (element.name == "VALUE.NULL") return Value::null(type);
    if (type == CMPI_ref) {
        if (element.name == "VALUE.REFERENCE") {
            return Value::fromReference(typedPath(readPath(element), catalogue, nameSpace));
        }
    } else if (element.name == "VALUE") {
        if (std::optional<Value> value = valueFromText(element.text, type)) return *value;
    }
    const std::string given = element.name == "VALUE" ? "'" + element.text + "'" : element.name;
    throw CimError(cimInvalidParameter,
                   given + " is no " + (type == CMPI_ref ? "reference" : cimTypeName(type)));
}

/// The type of a property that no schema declares.
CMPIType toldType(const XmlElement& property) {
    if (property.name == "PROPERTY.REFERENCE") return CMPI_ref;
    const std::string& name = *property.attribute("TYPE");
    const std::optional<CMPIType> type = typeNamed(name);
    if (!type) throw CimError(cimInvalidParameter, name + ": there is no such type");
    return property.name == "PROPERTY" ? *type : static_cast<CMPIType>(*type | CMPI_ARRAY);
}

PropertyValue readProperty(const XmlElement& property, const ClassDeclaration* declaration,
                           const ClassCatalogue& catalogue, const std::string& nameSpace) {
    const std::string& name = *property.attribute("NAME");
    const PropertyDeclaration* const declared =
        declaration == nullptr ? nullptr : declaration->property(name);
    const CMPIType type = declared == nullptr ? toldType(property) : declared->type;
    PropertyValue result{declared == nullptr ? name : declared->name, Value::null(type)};
    if (property.children.empty() || property.children.back().name == "QUALIFIER") return result;
    try {
        result.value = readValue(property.children.back(), type, catalogue, nameSpace);
    } catch (const CimError& error) {
        throw CimError(error.code(), result.name + ": " + error.what());
    }
    return result;
}

}  // namespace

std::optional<Value> valueFromText(const std::string& text, CMPIType type) {
    for (const IntegerType& integer : integerTypes) {
        if (integer.type == type) return integerFromText(text, integer);
    }
    switch (type) {
        case CMPI_boolean:
            return booleanFromText(text);
        case CMPI_real32:
            return realFromText<float>(text, type);
        case CMPI_real64:
            return realFromText<double>(text, type);
        case CMPI_char16:
            return characterFromText(text);
        case CMPI_dateTime:
            return dateTimeFromText(text);
        case CMPI_string:
            return Value(text);
        default:
            return std::nullopt;
    }
}

std::optional<CMPIType> typeNamed(const std::string& name) {
    for (const NamedType& row : namedTypes) {
        if (base::equalsIgnoreCase(row.name, name)) return row.type;
    }
    return std::nullopt;
}

Value readValue(const XmlElement& element, CMPIType type, const ClassCatalogue& catalogue,
                const std::string& nameSpace) {
    const bool isArray = element.name == "VALUE.ARRAY" || element.name == "VALUE.REFARRAY";
    if (isArray != ((type & CMPI_ARRAY) != 0)) {
        throw CimError(cimTypeMismatch, isArray ? "an array is given for a single value"
                                                : "a single value is given for an array");
    }
    if (!isArray) return readSingle(element, type, catalogue, nameSpace);
    std::vector<Value> elements;
    elements.reserve(element.children.size());
    for (const XmlElement& child : element.children) {
        elements.push_back(readSingle(child, elementType(type), catalogue, nameSpace));
    }
    return Value::fromArray(elementType(type), std::move(elements));
}

InstanceValue readInstance(const XmlElement& element, const ClassCatalogue& catalogue,
                           const std::string& nameSpace) {
    const std::string& className = *element.attribute("CLASSNAME");
    const ClassDeclaration* const declaration = catalogue.find(className);
    InstanceValue instance;
    instance.path.nameSpace = nameSpace;
    instance.path.className = declaration == nullptr ? className : declaration->name;
    std::set<std::string> names;
    for (const XmlElement& child : element.children) {
        if (child.name == "QUALIFIER") continue;
        instance.properties.push_back(readProperty(child, declaration, catalogue, nameSpace));
        if (!names.insert(base::toLower(instance.properties.back().name)).second) {
            throw CimError(cimInvalidParameter,
                           instance.properties.back().name + ": this property is given twice");
        }
    }
    if (declaration == nullptr) return instance;
    for (const PropertyDeclaration& declared : declaration->properties) {
        const Value* const value = declared.key ? instance.property(declared.name) : nullptr;
        if (value != nullptr && !value->isNull()) {
            instance.path.keys.push_back({declared.name, *value});
        }
    }
    return instance;
}

}  // namespace cmpihost::server
