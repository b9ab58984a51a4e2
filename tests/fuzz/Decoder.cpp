// Bytes choose among what is likely before they spell anything: so inputs soon reach the handlers.
#include "fuzz/Decoder.h"

#include <utility>

#include "support/Requests.h"

namespace fuzz {

using cmpihost::InstanceValue;
using cmpihost::ObjectPathValue;
using cmpihost::Value;

namespace {

constexpr const char* classNames[] = {
    "KORVA_OperatingSystem",
    "KORVA_OperatingSystemCapabilities",
    "KORVA_InstalledOS",
    "KORVA_RunningOS",
    "KORVA_OSElementCapabilities",
    "KORVA_ComputerSystem",
    "korva_operatingsystem",
    "KORVA_ELEMENTCAPABILITIES",
    "CIM_OperatingSystem",
    "KORVA_RunningOS ",
    "",
};
constexpr const char* nameSpaces[] = {"root/cimv2", "", "root/interop"};
constexpr const char* itemNames[] = {
    "Name",       "CSName",         "CreationClassName", "CSCreationClassName",
    "InstanceID", "GroupComponent", "Antecedent",        "PartComponent",
    "Dependent",  "ManagedElement", "Capabilities",      "name",
};
constexpr const char* texts[] = {
    "Linux",  "host1", "KORVA_OperatingSystem",     "KORVA_ComputerSystem", "linux", "",
    "Linux ", "%s%n",  "20090317081542.000000+060",
};
constexpr CMPIType scalarTypes[] = {
    CMPI_string, CMPI_chars,  CMPI_boolean, CMPI_char16, CMPI_uint8,
    CMPI_uint16, CMPI_uint32, CMPI_uint64,  CMPI_sint8,  CMPI_sint16,
    CMPI_sint32, CMPI_sint64, CMPI_real32,  CMPI_real64, CMPI_dateTime,
};

}  // namespace

ObjectPathValue Decoder::knownPath() {
    const auto kind = numberUpTo(5);
    const std::string name = textLike(texts);
    const std::string other = flag() ? textLike(texts) : name;
    const ObjectPathValue system = operatingSystemPath("host1", name);
    switch (kind) {
        case 0:
            return system;
        case 1:
            return capabilitiesPath(name);
        case 2:
            return computerSystemPath(name);
        case 3:
            return pairPath(elementCapabilities, system, capabilitiesPath(other));
        case 4:
            return pairPath(installedOS, computerSystemPath(other), system);
        default:
            return pairPath(runningOS, system, computerSystemPath(other));
    }
}

std::string Decoder::className() {
    return textLike(classNames);
}

std::optional<std::string> Decoder::optionalClassName() {
    if (flag()) return className();
    return std::nullopt;
}

std::optional<std::string> Decoder::optionalText() {
    if (flag()) return textLike(itemNames);
    return std::nullopt;
}

CMPIrc Decoder::status() {
    constexpr CMPIrc likely[] = {CMPI_RC_ERR_FAILED, CMPI_RC_OK, CMPI_RC_ERR_NOT_FOUND,
                                 CMPI_RC_ERR_INVALID_CLASS, CMPI_RC_ERR_TYPE_MISMATCH};
    return pick(likely);
}

Value Decoder::scalar(CMPIType type) {
    switch (type) {
        case CMPI_string:
        case CMPI_chars:
            return Value::fromText(textLike(texts), type);
        case CMPI_dateTime: {
            std::string characters = textLike(texts);
            characters.resize(25, '0');
            return Value::fromText(std::move(characters), type);
        }
        case CMPI_boolean:
            return Value::fromBoolean(flag());
        case CMPI_real32:
        case CMPI_real64:
            return Value::fromReal(input_.ConsumeFloatingPoint<double>(), type);
        case CMPI_sint8:
        case CMPI_sint16:
        case CMPI_sint32:
        case CMPI_sint64:
            return Value::fromSigned(input_.ConsumeIntegral<std::int64_t>(), type);
        default:
            return Value::fromUnsigned(number(), type);
    }
}

Value Decoder::array(unsigned depth) {
    const auto count = numberUpTo(3);
    std::vector<Value> elements;
    if (depth > 0 && flag()) {
        for (auto each = count; each > 0; --each)
            elements.push_back(Value::fromReference(path(depth - 1)));
        return Value::fromArray(CMPI_ref, std::move(elements));
    }
    const CMPIType type = pick(scalarTypes);
    for (auto each = count; each > 0; --each)
        elements.push_back(flag() ? Value::null(type) : scalar(type));
    return Value::fromArray(type, std::move(elements));
}

Value Decoder::value(unsigned depth) {
    static char bytes[] = "bytes";
    enum Kind : unsigned { Text, Scalar, Reference, Null, Array, Instance, Pointer };
    switch (numberUpTo(Pointer)) {
        case Scalar:
            return scalar(pick(scalarTypes));
        case Reference:
            return depth > 0 ? Value::fromReference(path(depth - 1)) : Value::null(CMPI_ref);
        case Null: {
            constexpr CMPIType types[] = {CMPI_null,   CMPI_string,   CMPI_ref,     CMPI_dateTime,
                                          CMPI_uint32, CMPI_instance, CMPI_stringA, CMPI_refA};
            return Value::null(pick(types));
        }
        case Array:
            return array(depth);
        case Instance:
            return depth > 0 ? Value::fromInstance(instance(depth - 1))
                             : Value::null(CMPI_instance);
        case Pointer:
            return Value::fromPointer({bytes, sizeof bytes});
        default:
            return scalar(CMPI_string);
    }
}

ObjectPathValue Decoder::path(unsigned depth) {
    ObjectPathValue result;
    if (flag()) result = knownPath();
    if (result.className.empty() || flag()) result.className = className();
    result.nameSpace = textLike(nameSpaces);
    for (auto changes = numberUpTo(6); changes > 0; --changes) {
        std::string name = textLike(itemNames);
        const auto place = numberUpTo(result.keys.size());
        if (place < result.keys.size())
            result.keys[place].value = value(depth);
        else
            result.keys.push_back({std::move(name), value(depth)});
    }
    if (flag()) result.hostName = text(64);
    return result;
}

InstanceValue Decoder::instance(unsigned depth) {
    InstanceValue result;
    result.path = path(depth);
    for (auto properties = numberUpTo(4); properties > 0; --properties) {
        std::string name = textLike(itemNames);
        result.properties.push_back({std::move(name), value(depth)});
    }
    return result;
}

}  // namespace fuzz
