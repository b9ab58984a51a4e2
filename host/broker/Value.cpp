// Contents are shared between values and copied by who changes them: a request hands the same paths
// and instances around many times.
#include "host/broker/Value.h"

#include "base/Ascii.h"
#include "base/Utf8.h"

#include <algorithm>
#include <charconv>
#include <iterator>

namespace cmpihost {

namespace {

struct TypeRow {
    CMPIType type;
    const char* name;
    /// Of an unsigned number narrower than 64 bits.
    unsigned bits{};
};

constexpr TypeRow typeRows[] = {
    {CMPI_null, "null"},         {CMPI_boolean, "boolean"},   {CMPI_char16, "char16", 16},
    {CMPI_real32, "real32"},     {CMPI_real64, "real64"},     {CMPI_uint8, "uint8", 8},
    {CMPI_uint16, "uint16", 16}, {CMPI_uint32, "uint32", 32}, {CMPI_uint64, "uint64"},
    {CMPI_sint8, "sint8"},       {CMPI_sint16, "sint16"},     {CMPI_sint32, "sint32"},
    {CMPI_sint64, "sint64"},     {CMPI_instance, "instance"}, {CMPI_ref, "ref"},
    {CMPI_string, "string"},     {CMPI_chars, "string"},      {CMPI_dateTime, "datetime"},
    {CMPI_charsptr, "string"},   {CMPI_ptr, "pointer"},
};

const TypeRow* typeRow(CMPIType elementType) noexcept {
    const auto row =
        std::find_if(std::begin(typeRows), std::end(typeRows),
                     [elementType](const TypeRow& r) { return r.type == elementType; });
    return row == std::end(typeRows) ? nullptr : row;
}

unsigned bitsOf(CMPIType type) noexcept {
    const TypeRow* row = typeRow(type);
    return row == nullptr || row->bits == 0 ? 64 : row->bits;
}

/// CMPI_chars is only another way to pass a string.
CMPIType comparable(CMPIType type) noexcept {
    const auto arrayBit = static_cast<CMPIType>(type & CMPI_ARRAY);
    const auto element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    return element == CMPI_chars ? static_cast<CMPIType>(CMPI_string | arrayBit) : type;
}

/// Deep comparison of shared storage.
struct SameContent {
    template <class T>
    bool operator()(const std::shared_ptr<T>& left, const std::shared_ptr<T>& right) const {
        return left == right || *left == *right;
    }
    bool operator()(const CMPIValuePtr& left, const CMPIValuePtr& right) const {
        return left.ptr == right.ptr && left.length == right.length;
    }
    template <class T>
    bool operator()(const T& left, const T& right) const {
        return left == right;
    }
    template <class T, class U>
    bool operator()(const T&, const U&) const {
        return false;
    }
};

template <class Named>
const Value* valueNamed(const std::vector<Named>& items, std::string_view name) {
    const auto item = std::find_if(items.begin(), items.end(), [name](const Named& candidate) {
        return base::equalsIgnoreCase(candidate.name, name);
    });
    return item == items.end() ? nullptr : &item->value;
}

/// Whether two lists hold the same named values in any order.
template <class Named>
bool sameSet(const std::vector<Named>& left, const std::vector<Named>& right) {
    return left.size() == right.size() &&
           std::all_of(left.begin(), left.end(), [&right](const Named& item) {
               const Value* other = valueNamed(right, item.name);
               return other != nullptr && *other == item.value;
           });
}

/// Nothing else is escaped: the syntax of object paths knows no other escape.
std::string inQuotes(const std::string& text) {
    std::string result = "\"";
    for (const char letter : text) {
        if (letter == '"' || letter == '\\') result += '\\';
        result += letter;
    }
    return result + '"';
}

/// As parsers of clients read it: booleans in capitals, and everything that is no number in quotes.
std::string keyText(const Value& value) {
    if (value.isNull()) return inQuotes("");
    if (value.type() == CMPI_boolean) return value.boolean() ? "TRUE" : "FALSE";
    if (value.type() == CMPI_char16) {
        std::string character;
        base::appendUtf8(character, static_cast<char32_t>(value.unsignedInteger()));
        return inQuotes(character);
    }
    const bool isNumber = !value.isText() && value.type() != CMPI_ref;
    return isNumber ? value.toText() : inQuotes(value.toText());
}

/// Not by a stream: this is the shortest text that reads back as the same number, in every locale.
template <class Real>
std::string shortestText(Real real) {
    char text[64];
    return std::string(text, std::to_chars(text, text + sizeof text, real).ptr);
}

std::string arrayText(const std::vector<Value>& elements) {
    std::string result = "{";
    for (const Value& element : elements) {
        if (result.size() > 1) result += ", ";
        result += element.toText();
    }
    return result + "}";
}

struct ToText {
    CMPIType type;

    std::string operator()(std::monostate) const { return "NULL"; }
    std::string operator()(bool value) const { return value ? "true" : "false"; }
    std::string operator()(std::uint64_t value) const { return std::to_string(value); }
    std::string operator()(std::int64_t value) const { return std::to_string(value); }
    std::string operator()(double value) const {
        return type == CMPI_real32 ? shortestText(static_cast<float>(value)) : shortestText(value);
    }
    std::string operator()(const std::string& value) const { return value; }
    std::string operator()(const std::shared_ptr<ObjectPathValue>& value) const {
        return toString(*value);
    }
    std::string operator()(const std::shared_ptr<InstanceValue>& value) const {
        return "instance of " + value->path.className;
    }
    std::string operator()(const std::shared_ptr<std::vector<Value>>& value) const {
        return arrayText(*value);
    }
    std::string operator()(const CMPIValuePtr& value) const {
        return std::to_string(value.length) + " bytes";
    }
};

}  // namespace

std::string cimTypeName(CMPIType type) {
    const TypeRow* row = typeRow(static_cast<CMPIType>(type & ~CMPI_ARRAY));
    std::string name = row == nullptr ? "type " + std::to_string(type & ~CMPI_ARRAY) : row->name;
    if ((type & CMPI_ARRAY) != 0) name += "[]";
    return name;
}

Value::Value(std::string text) : type_(CMPI_string), data_(std::move(text)) {}
Value::Value(const char* text) : Value(std::string(text)) {}

Value Value::null(CMPIType type) {
    return Value(type, std::monostate());
}
Value Value::fromText(std::string text, CMPIType type) {
    return Value(type, std::move(text));
}
Value Value::fromBoolean(bool value) {
    return Value(CMPI_boolean, value);
}

Value Value::fromUnsigned(std::uint64_t value, CMPIType type) {
    // A shift by all 64 bits would be undefined; no type is so narrow.
    const unsigned unused = 64 - bitsOf(type);
    return Value(type, value << unused >> unused);
}

Value Value::fromSigned(std::int64_t value, CMPIType type) {
    // Through the narrow type: the value is what a variable of a provider would hold.
    switch (type) {
        case CMPI_sint8:
            return Value(type, std::int64_t{static_cast<std::int8_t>(value)});
        case CMPI_sint16:
            return Value(type, std::int64_t{static_cast<std::int16_t>(value)});
        case CMPI_sint32:
            return Value(type, std::int64_t{static_cast<std::int32_t>(value)});
        default:
            return Value(type, value);
    }
}

Value Value::fromReal(double value, CMPIType type) {
    if (type == CMPI_real32) return Value(type, double{static_cast<float>(value)});
    return Value(type, value);
}

Value Value::fromReference(ObjectPathValue path) {
    return fromReference(std::make_shared<ObjectPathValue>(std::move(path)));
}
Value Value::fromReference(std::shared_ptr<ObjectPathValue> path) {
    return Value(CMPI_ref, std::move(path));
}
Value Value::fromInstance(InstanceValue instance) {
    return fromInstance(std::make_shared<InstanceValue>(std::move(instance)));
}
Value Value::fromInstance(std::shared_ptr<InstanceValue> instance) {
    return Value(CMPI_instance, std::move(instance));
}
Value Value::fromArray(CMPIType elementType, std::vector<Value> elements) {
    return fromArray(elementType, std::make_shared<std::vector<Value>>(std::move(elements)));
}
Value Value::fromArray(CMPIType elementType, std::shared_ptr<std::vector<Value>> elements) {
    return Value(static_cast<CMPIType>(elementType | CMPI_ARRAY), std::move(elements));
}
Value Value::fromPointer(CMPIValuePtr pointer) {
    return Value(CMPI_ptr, pointer);
}

const ObjectPathValue& Value::reference() const {
    return *sharedReference();
}
const InstanceValue& Value::instance() const {
    return *sharedInstance();
}
const std::vector<Value>& Value::elements() const {
    return *sharedElements();
}

const std::shared_ptr<ObjectPathValue>& Value::sharedReference() const {
    return std::get<std::shared_ptr<ObjectPathValue>>(data_);
}
const std::shared_ptr<InstanceValue>& Value::sharedInstance() const {
    return std::get<std::shared_ptr<InstanceValue>>(data_);
}
const std::shared_ptr<std::vector<Value>>& Value::sharedElements() const {
    return std::get<std::shared_ptr<std::vector<Value>>>(data_);
}

std::string Value::toText() const {
    return std::visit(ToText{type_}, data_);
}

bool operator==(const Value& left, const Value& right) {
    return comparable(left.type_) == comparable(right.type_) &&
           std::visit(SameContent(), left.data_, right.data_);
}

const Value* ObjectPathValue::key(std::string_view name) const {
    return valueNamed(keys, name);
}

const Value* InstanceValue::property(std::string_view name) const {
    return valueNamed(properties, name);
}

/// The host is left out: a path with one and a path without name the same object.
bool operator==(const ObjectPathValue& left, const ObjectPathValue& right) {
    return base::equalsIgnoreCase(left.nameSpace, right.nameSpace) &&
           base::equalsIgnoreCase(left.className, right.className) &&
           sameSet(left.keys, right.keys);
}
bool operator!=(const ObjectPathValue& left, const ObjectPathValue& right) {
    return !(left == right);
}

bool operator==(const InstanceValue& left, const InstanceValue& right) {
    return left.path == right.path && sameSet(left.properties, right.properties);
}
bool operator!=(const InstanceValue& left, const InstanceValue& right) {
    return !(left == right);
}

std::string toString(const ObjectPathValue& path) {
    std::string result;
    if (!path.hostName.empty()) result += "//" + path.hostName + "/";
    if (!path.nameSpace.empty()) result += path.nameSpace + ":";
    result += path.className;
    char separator = '.';
    for (const KeyBinding& key : path.keys) {
        result += separator + key.name + '=' + keyText(key.value);
        separator = ',';
    }
    return result;
}

}  // namespace cmpihost
