#ifndef BASE_CMPI_TEXT_H
#define BASE_CMPI_TEXT_H

#include <cmpi/cmpidt.h>

#include <optional>
#include <string>

namespace base {

/// The text of a CMPI value that is an integer or a char16, in decimal, or a boolean, "true" or
/// "false". None for a value of any other type. The state is not looked at.
inline std::optional<std::string> scalarText(const CMPIData& data) {
    const CMPIValue& value = data.value;
    switch (data.type) {
        case CMPI_boolean:
            return value.boolean != 0 ? "true" : "false";
        case CMPI_uint8:
            return std::to_string(value.uint8);
        case CMPI_uint16:
            return std::to_string(value.uint16);
        case CMPI_uint32:
            return std::to_string(value.uint32);
        case CMPI_uint64:
            return std::to_string(value.uint64);
        case CMPI_sint8:
            return std::to_string(value.sint8);
        case CMPI_sint16:
            return std::to_string(value.sint16);
        case CMPI_sint32:
            return std::to_string(value.sint32);
        case CMPI_sint64:
            return std::to_string(value.sint64);
        case CMPI_char16:
            return std::to_string(value.char16);
        default:
            return std::nullopt;
    }
}

/// Characters as an argument of type CMPI_chars: brokers take the pointer itself, not the address
/// of one, as for other types.
inline const CMPIValue* charsArgument(const char* characters) {
    return reinterpret_cast<const CMPIValue*>(characters);
}

}  // namespace base

#endif
