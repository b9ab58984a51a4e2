#include "host/broker/Conversion.h"

#include <cstring>

namespace cmpihost {

namespace {

/// Reads only the bytes of T: the provider passes the address of a variable of that size.
template <class T>
T bytesAt(const CMPIValue* value) noexcept {
    T result;
    std::memcpy(&result, value, sizeof result);
    return result;
}

template <class T>
Value unsignedAt(const CMPIValue* value, CMPIType type) {
    return Value::fromUnsigned(bytesAt<T>(value), type);
}

template <class T>
Value signedAt(const CMPIValue* value, CMPIType type) {
    return Value::fromSigned(bytesAt<T>(value), type);
}

Value textAt(const char* text) {
    return text == nullptr ? Value::null(CMPI_string) : Value(text);
}

Value stringAt(const CMPIString* string, const CallName& call) {
    return string == nullptr ? Value::null(CMPI_string)
                             : textAt(fromHandle(string, call).body.get());
}

Value arrayAt(const CMPIArray* array, CMPIType type, const CallName& call) {
    if (array == nullptr) return Value::null(type);
    const auto& body = fromHandle(array, call).body;
    const auto wanted = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    const auto isText = [](CMPIType t) { return t == CMPI_string || t == CMPI_chars; };
    if (body.elementType != wanted && !(isText(body.elementType) && isText(wanted))) {
        throw Failure{CMPI_RC_ERR_TYPE_MISMATCH};
    }
    return Value::fromArray(body.elementType, body.elements);
}

Value objectAt(const CMPIValue* value, CMPIType type, const CallName& call) {
    if (type == CMPI_ref) {
        const auto* path = bytesAt<CMPIObjectPath*>(value);
        return path == nullptr ? Value::null(type)
                               : Value::fromReference(fromHandle(path, call).body);
    }
    if (type == CMPI_instance) {
        const auto* instance = bytesAt<CMPIInstance*>(value);
        return instance == nullptr ? Value::null(type)
                                   : Value::fromInstance(fromHandle(instance, call).body.value);
    }
    const auto* dateTime = bytesAt<CMPIDateTime*>(value);
    return dateTime == nullptr ? Value::null(type)
                               : Value::fromText(fromHandle(dateTime, call).body, CMPI_dateTime);
}

Value scalarAt(const CMPIValue* value, CMPIType type) {
    switch (type) {
        case CMPI_boolean:
            return Value::fromBoolean(bytesAt<CMPIBoolean>(value) != 0);
        case CMPI_char16:
            return unsignedAt<CMPIChar16>(value, type);
        case CMPI_uint8:
            return unsignedAt<CMPIUint8>(value, type);
        case CMPI_uint16:
            return unsignedAt<CMPIUint16>(value, type);
        case CMPI_uint32:
            return unsignedAt<CMPIUint32>(value, type);
        case CMPI_uint64:
            return unsignedAt<CMPIUint64>(value, type);
        case CMPI_sint8:
            return signedAt<CMPISint8>(value, type);
        case CMPI_sint16:
            return signedAt<CMPISint16>(value, type);
        case CMPI_sint32:
            return signedAt<CMPISint32>(value, type);
        case CMPI_sint64:
            return signedAt<CMPISint64>(value, type);
        case CMPI_real32:
            return Value::fromReal(bytesAt<CMPIReal32>(value), type);
        case CMPI_real64:
            return Value::fromReal(bytesAt<CMPIReal64>(value), type);
        case CMPI_ptr:
            return Value::fromPointer(bytesAt<CMPIValuePtr>(value));
        default:
            throw Failure{CMPI_RC_ERR_INVALID_DATA_TYPE};
    }
}

void writeUnsigned(CMPIValue& target, std::uint64_t value, CMPIType type) noexcept {
    switch (type) {
        case CMPI_char16:
            target.char16 = static_cast<CMPIChar16>(value);
            break;
        case CMPI_uint8:
            target.uint8 = static_cast<CMPIUint8>(value);
            break;
        case CMPI_uint16:
            target.uint16 = static_cast<CMPIUint16>(value);
            break;
        case CMPI_uint32:
            target.uint32 = static_cast<CMPIUint32>(value);
            break;
        default:
            target.uint64 = value;
    }
}

void writeSigned(CMPIValue& target, std::int64_t value, CMPIType type) noexcept {
    switch (type) {
        case CMPI_sint8:
            target.sint8 = static_cast<CMPISint8>(value);
            break;
        case CMPI_sint16:
            target.sint16 = static_cast<CMPISint16>(value);
            break;
        case CMPI_sint32:
            target.sint32 = static_cast<CMPISint32>(value);
            break;
        default:
            target.sint64 = value;
    }
}

void writeScalar(CMPIValue& target, const Value& value) {
    switch (value.type()) {
        case CMPI_boolean:
            target.boolean = value.boolean();
            break;
        case CMPI_real32:
            target.real32 = static_cast<CMPIReal32>(value.real());
            break;
        case CMPI_real64:
            target.real64 = value.real();
            break;
        case CMPI_ptr:
            target.dataPtr = value.pointer();
            break;
        case CMPI_sint8:
        case CMPI_sint16:
        case CMPI_sint32:
        case CMPI_sint64:
            writeSigned(target, value.signedInteger(), value.type());
            break;
        default:
            writeUnsigned(target, value.unsignedInteger(), value.type());
    }
}

void writeText(BrokerCore& core, CMPIValue& target, const Value& value) {
    if (value.type() == CMPI_dateTime) {
        target.dateTime = core.make<CMPIDateTime>(value.text());
    } else if (value.type() == CMPI_chars) {
        // The characters live as long as the string that holds them.
        target.chars = core.make<CMPIString>(Characters(value.text()))->body.get();
    } else {
        target.string = core.make<CMPIString>(Characters(value.text()));
    }
}

}  // namespace

Value readValue(const CMPIValue* value, CMPIType type, const CallName& call) {
    if (type == CMPI_chars) return textAt(reinterpret_cast<const char*>(value));
    if (value == nullptr) return Value::null(type);
    if ((type & CMPI_ARRAY) != 0) return arrayAt(bytesAt<CMPIArray*>(value), type, call);
    switch (type) {
        case CMPI_string:
            return stringAt(bytesAt<CMPIString*>(value), call);
        case CMPI_charsptr:
            return textAt(bytesAt<char*>(value));
        case CMPI_ref:
        case CMPI_instance:
        case CMPI_dateTime:
            return objectAt(value, type, call);
        default:
            return scalarAt(value, type);
    }
}

CMPIData writeValue(BrokerCore& core, const Value& value) {
    CMPIData data{};
    data.type = value.type();
    if (value.isNull()) {
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
