#ifndef HOST_BROKER_VALUE_H
#define HOST_BROKER_VALUE_H

#include <cmpi/cmpidt.h>

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

/// The plain value model of the host: what a CMPI object holds, without CMPI ownership.
/// Everything here is an ordinary C++ value. Text is UTF-8, passed byte for byte.
namespace cmpihost {

struct ObjectPathValue;
struct InstanceValue;

/// The name of a CMPI type as schemas spell it ("uint16", "string[]", "datetime", "ref", "null").
std::string cimTypeName(CMPIType type);

/// One CIM value with its CMPI type; null of any type is a value too.
/// An accessor that does not fit the value throws std::bad_variant_access.
class Value {
  public:
    /// Null without a type.
    Value() = default;
    /// A CMPI_string.
    Value(std::string text);
    Value(const char* text);

    /// Null of a type.
    static Value null(CMPIType type);
    /// `type` is CMPI_string, CMPI_chars or CMPI_dateTime (25 characters, not checked here).
    static Value fromText(std::string text, CMPIType type = CMPI_string);
    static Value fromBoolean(bool value);
    /// `type` is an unsigned integer type or CMPI_char16; the value is cut to its width.
    static Value fromUnsigned(std::uint64_t value, CMPIType type = CMPI_uint64);
    /// `type` is a signed integer type; the value is cut to its width.
    static Value fromSigned(std::int64_t value, CMPIType type = CMPI_sint64);
    static Value fromReal(double value, CMPIType type = CMPI_real64);
    static Value fromReference(ObjectPathValue path);
    static Value fromReference(std::shared_ptr<ObjectPathValue> path);
    static Value fromInstance(InstanceValue instance);
    static Value fromInstance(std::shared_ptr<InstanceValue> instance);
    /// `elementType` carries no array bit; every element is of that type or null.
    static Value fromArray(CMPIType elementType, std::vector<Value> elements);
    static Value fromArray(CMPIType elementType, std::shared_ptr<std::vector<Value>> elements);
    /// Opaque bytes that CMPI passes by address (CMPI_ptr); nothing is copied.
    static Value fromPointer(CMPIValuePtr pointer);

    CMPIType type() const noexcept { return type_; }
    bool isNull() const noexcept { return std::holds_alternative<std::monostate>(data_); }
    bool isArray() const noexcept { return (type_ & CMPI_ARRAY) != 0; }
    /// CMPI_string, CMPI_chars or CMPI_dateTime, not null.
    bool isText() const noexcept { return std::holds_alternative<std::string>(data_); }

    bool boolean() const { return std::get<bool>(data_); }
    /// Unsigned integers and CMPI_char16.
    std::uint64_t unsignedInteger() const { return std::get<std::uint64_t>(data_); }
    std::int64_t signedInteger() const { return std::get<std::int64_t>(data_); }
    double real() const { return std::get<double>(data_); }
    /// The text of a string, or the 25 characters of a datetime.
    const std::string& text() const { return std::get<std::string>(data_); }
    const ObjectPathValue& reference() const;
    const InstanceValue& instance() const;
    const std::vector<Value>& elements() const;
    CMPIValuePtr pointer() const { return std::get<CMPIValuePtr>(data_); }

    /// The shared storage behind reference(), instance() and elements(); whoever alters it copies
    /// it first.
    const std::shared_ptr<ObjectPathValue>& sharedReference() const;
    const std::shared_ptr<InstanceValue>& sharedInstance() const;
    const std::shared_ptr<std::vector<Value>>& sharedElements() const;

    /// For people: text as it is, numbers in decimal (reals as the shortest that gives the value
    /// back), "true"/"false", "NULL", references as toString(path), arrays as "{a, b}".
    std::string toText() const;

    /// Same type (CMPI_chars counts as CMPI_string) and same content; references compare as paths.
    friend bool operator==(const Value& left, const Value& right);
    friend bool operator!=(const Value& left, const Value& right) { return !(left == right); }

  private:
    using Data =
        std::variant<std::monostate, bool, std::uint64_t, std::int64_t, double, std::string,
                     std::shared_ptr<ObjectPathValue>, std::shared_ptr<InstanceValue>,
                     std::shared_ptr<std::vector<Value>>, CMPIValuePtr>;
    template <class Content>
    Value(CMPIType type, Content content) : type_(type), data_(std::move(content)) {}

    CMPIType type_ = CMPI_null;
    Data data_;
};

/// A name with a value: a key binding, an argument, a context entry.
struct NamedValue {
    std::string name;
    Value value;
};
using KeyBinding = NamedValue;

/// A property of an instance; `origin` is empty unless the provider named one.
struct PropertyValue {
    std::string name;
    Value value;
    std::string origin{};
};

/// An object path. No keys: the path of a class.
struct ObjectPathValue {
    std::string nameSpace{};
    std::string className{};
    std::vector<KeyBinding> keys{};
    std::string hostName{};

    /// The value of a key; null if no key has that name.
    const Value* key(std::string_view name) const;
};

/// An instance: its path and its properties in the order in which they were set.
struct InstanceValue {
    ObjectPathValue path{};
    std::vector<PropertyValue> properties{};

    /// The value of a property; null if the instance has no property of that name.
    const Value* property(std::string_view name) const;
};

/// Names without case, key bindings as a set; the host name does not count.
bool operator==(const ObjectPathValue& left, const ObjectPathValue& right);
bool operator!=(const ObjectPathValue& left, const ObjectPathValue& right);
/// Equal paths and the same set of properties; origins do not count.
bool operator==(const InstanceValue& left, const InstanceValue& right);
bool operator!=(const InstanceValue& left, const InstanceValue& right);

/// The path as clients write it: `[//host/][namespace:]Class[.Key1="text",Key2=5,Key3=TRUE]`. The
/// path of a class has no dot. Quotes and backslashes in texts are escaped, references are paths in
/// quotes; null is an empty text.
std::string toString(const ObjectPathValue& path);

}  // namespace cmpihost

#endif
