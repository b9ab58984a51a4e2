#include "host/broker/MessageText.h"

#include "host/broker/Object.h"

namespace cmpihost {

namespace {

std::string textOrNull(const char* text) {
    return text == nullptr ? "NULL" : text;
}

std::string realText(double value) {
    return Value::fromReal(value).toText();
}

/// Small integers come widened to int, as C passes them.
std::string messageArgument(CMPIType type, std::va_list& arguments, const CallName& call) {
    switch (type) {
        case CMPI_sint8:
        case CMPI_sint16:
        case CMPI_sint32:
            return std::to_string(va_arg(arguments, int));
        case CMPI_uint8:
        case CMPI_uint16:
        case CMPI_uint32:
        case CMPI_char16:
            return std::to_string(va_arg(arguments, unsigned int));
        case CMPI_sint64:
            return std::to_string(va_arg(arguments, CMPISint64));
        case CMPI_uint64:
            return std::to_string(va_arg(arguments, CMPIUint64));
        case CMPI_real32:
        case CMPI_real64:
            return realText(va_arg(arguments, double));
        case CMPI_boolean:
            return va_arg(arguments, int) != 0 ? "true" : "false";
        case CMPI_chars:
            return textOrNull(va_arg(arguments, const char*));
        case CMPI_string: {
            const auto* const string = va_arg(arguments, const CMPIString*);
            return string == nullptr ? "NULL" : textOrNull(fromHandle(string, call).body.get());
        }
        default:
            throw Failure{CMPI_RC_ERR_INVALID_DATA_TYPE};
    }
}

}  // namespace

std::vector<std::string> messageArguments(CMPICount count, std::va_list& arguments,
                                          const CallName& call) {
    if (count > 10) throw Failure{CMPI_RC_ERR_INVALID_PARAMETER};
    std::vector<std::string> result;
    for (CMPICount i = 0; i < count; ++i) {
        const auto type = static_cast<CMPIType>(va_arg(arguments, int));
        result.push_back(messageArgument(type, arguments, call));
    }
    return result;
}

std::string expandMessage(const char* text, const std::vector<std::string>& arguments) {
    std::string result;
    for (const char* at = text; *at != '\0'; ++at) {
        const auto index = static_cast<std::size_t>(at[0] == '$' ? at[1] - '0' : -1);
        if (index < arguments.size()) {
            result += arguments[index];
            ++at;
        } else {
            result += *at;
        }
    }
    return result;
}

}  // namespace cmpihost
