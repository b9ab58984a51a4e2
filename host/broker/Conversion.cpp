// A provider passes the address of a variable of its own type, so that no byte beyond that type's
// may be read; everything else is copied between a member of CMPIValue and the value model.
#include "host/broker/Conversion.h"

#include <cstring>

namespace cmpihost {

namespace {

template <class T>
T bytesAt(const CMPIValue* value) noexcept {
    T result;
    std::memcpy(&result, value, sizeof result);
    return result;
}

/// Reading and writing share the switch, so that no type can be missing in one of them alone.
/// Calls use(member of CMPIValue) for the type of a scalar; false: it is no scalar.
template <class Use>
bool withScalarMember(CMPIType type, const Use& use) {
    switch (type) {
        case CMPI_boolean:
            return use(&CMPIValue::boolean), true;
        case CMPI_char16:
            return use(&CMPIValue::char16), true;
        case CMPI_uint8:
            return use(&CMPIValue::uint8), true;
        case CMPI_uint16:
            return use(&CMPIValue::uint16), true;
        case CMPI_uint32:
            return use(&CMPIValue::uint32), true;
        case CMPI_uint64:
            return use(&CMPIValue::uint64), true;
        case CMPI_sint8:
            return use(&CMPIValue::sint8), true;
        case CMPI_sint16:
            return use(&CMPIValue::sint16), true;
        case CMPI_sint32:
            return use(&CMPIValue::sint32), true;
        case CMPI_sint64:
            return use(&CMPIValue::sint64), true;
        case CMPI_real32:
            return use(&CMPIValue::real32), true;
        case CMPI_real64:
            return use(&CMPIValue::real64), true;
        case CMPI_ptr:
            return use(&CMPIValue::dataPtr), true;
        default:
            return false;
    }
}

template <class Member>
using MemberType = std::decay_t<decltype(std::declval<CMPIValue>().*std::declval<Member>())>;

Value readScalar(const CMPIValue* value, CMPIType type) {
    Value result;
    const bool known = withScalarMember(type, [&](auto member) {
        using T = MemberType<decltype(member)>;
        const T content = bytesAt<T>(value);
        if constexpr (std::is_same_v<T, CMPIValuePtr>) {
            result = Value::fromPointer(content);
        } else if constexpr (std::is_floating_point_v<T>) {
            result = Value::fromReal(content, type);
        } else if constexpr (std::is_signed_v<T>) {
            result = Value::fromSigned(content, type);
        } else if (type == CMPI_boolean) {
            result = Value::fromBoolean(content != 0);
        } else {
            result = Value::fromUnsigned(content, type);
        }
    });
    if (!known) throw Failure{CMPI_RC_ERR_INVALID_DATA_TYPE};
    return result;
}

void writeScalar(CMPIValue& target, const Value& value) {
    withScalarMember(value.type(), [&](auto member) {
        using T = MemberType<decltype(member)>;
        if constexpr (std::is_same_v<T, CMPIValuePtr>) {
            target.*member = value.pointer();
        } else if constexpr (std::is_floating_point_v<T>) {
            target.*member = static_cast<T>(value.real());
        } else if constexpr (std::is_signed_v<T>) {
            target.*member = static_cast<T>(value.signedInteger());
        } else if (value.type() == CMPI_boolean) {
            target.*member = value.boolean();
        } else {
            target.*member = static_cast<T>(value.unsignedInteger());
        }
    });
}

Value readText(const char* text) {
    return text == nullptr ? Value::null(CMPI_string) : Value(text);
}

Value readArray(const CMPIArray* array, CMPIType type, const CallName& call) {
    if (array == nullptr) return Value::null(type);
    const auto& body = fromHandle(array, call).body;
    const auto wanted = storedType(static_cast<CMPIType>(type & ~CMPI_ARRAY));
    if (storedType(body.elementType) != wanted) throw Failure{CMPI_RC_ERR_TYPE_MISMATCH};
    // Shared with the array until one of the two changes.
    return Value::fromArray(body.elementType, body.elements);
}

/// The value of a variable that holds a pointer to an object; `read` makes it of the object's body.
template <class Edt, class Read>
Value readObject(const CMPIValue* value, CMPIType type, const CallName& call, const Read& read) {
    const auto* const object = bytesAt<Edt*>(value);
    return object == nullptr ? Value::null(type) : read(fromHandle(object, call).body);
}

void writeText(BrokerCore& core, CMPIValue& target, const Value& value) {
    if (value.type() == CMPI_dateTime) {
        target.dateTime = core.make<CMPIDateTime>(value.text());
    } else if (value.type() == CMPI_chars) {
        // The characters live as long as the string that holds them.
        target.chars = core.make<CMPIString>(Characters(value.text()))->body.get();
    } else {
        target.string = makeString(core, value.text());
    }
}

}  // namespace

/// The two types of plain characters are ways to hand text over; what is kept is a string.
CMPIType storedType(CMPIType type) noexcept {
    return type == CMPI_chars || type == CMPI_charsptr ? CMPIType{CMPI_string} : type;
}

Value readValue(const CMPIValue* value, CMPIType type, const CallName& call) {
    // Here the argument is no address of a variable: it points to the characters themselves.
    if (type == CMPI_chars) return readText(reinterpret_cast<const char*>(value));
    if (value == nullptr) return Value::null(type);
    if ((type & CMPI_ARRAY) != 0) return readArray(bytesAt<CMPIArray*>(value), type, call);
    switch (type) {
        case CMPI_charsptr:
            return readText(bytesAt<char*>(value));
        case CMPI_string:
            return readObject<CMPIString>(value, type, call,
                                          [](const auto& body) { return readText(body.get()); });
        case CMPI_ref:
            return readObject<CMPIObjectPath>(
                value, type, call, [](const auto& body) { return Value::fromReference(body); });
        case CMPI_instance:
            return readObject<CMPIInstance>(value, type, call, [](const auto& body) {
                return Value::fromInstance(body.value);
            });
        case CMPI_dateTime:
            return readObject<CMPIDateTime>(value, type, call, [](const auto& body) {
                return Value::fromText(body, CMPI_dateTime);
            });
        default:
            return readScalar(value, type);
    }
}

CMPIData writeValue(BrokerCore& core, const Value& value) {
    CMPIData data{};
    data.type = value.type();
    if (value.isNull()) {
        // The value stays zero: who forgets to look at the state finds null there.
        data.state = CMPI_nullValue;
    } else if (value.isArray()) {
        const auto elementType = static_cast<CMPIType>(value.type() & ~CMPI_ARRAY);
        data.value.array = core.make<CMPIArray>({elementType, value.sharedElements()});
    } else if (value.isText()) {
        writeText(core, data.value, value);
    } else if (value.type() == CMPI_ref) {
        data.value.ref = core.make<CMPIObjectPath>(value.sharedReference());
    } else if (value.type() == CMPI_instance) {
        data.value.inst = makeInstance(core, value.sharedInstance());
    } else {
        writeScalar(data.value, value);
    }
    return data;
}

CMPIString* makeString(BrokerCore& core, std::string_view text) {
    return core.make<CMPIString>(Characters(text));
}

CMPIInstance* makeInstance(BrokerCore& core, std::shared_ptr<InstanceValue> value) {
    InstanceBody body;
    body.declaration = core.declaration(value->path.className);
    body.value = std::move(value);
    return core.make<CMPIInstance>(std::move(body));
}

CMPIArray* makeArray(BrokerCore& core, CMPIType elementType, std::vector<Value> elements) {
    return core.make<CMPIArray>(
        {elementType, std::make_shared<std::vector<Value>>(std::move(elements))});
}

std::optional<std::string> optionalText(const char* text) {
    if (text == nullptr) return std::nullopt;
    return std::string(text);
}

std::optional<std::vector<std::string>> readNames(const char** names) {
    if (names == nullptr) return std::nullopt;
    std::vector<std::string> result;
    for (; *names != nullptr; ++names) result.emplace_back(*names);
    return result;
}

const char* required(BrokerCore& core, const char* text, const CallName& call, const char* what) {
    if (text == nullptr) {
        core.report(call.text() + ": null " + what);
        throw Failure{CMPI_RC_ERR_INVALID_PARAMETER};
    }
    return text;
}

}  // namespace cmpihost
