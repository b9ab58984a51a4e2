#include "host/cli/ValueKind.h"

namespace cmpihost {

ValueKind kindOf(const Value& value) {
    if (value.isNull()) {
        return ValueKind::Null;
    }
    if (value.isArray()) {
        return ValueKind::Array;
    }
    switch (value.type()) {
        case CMPI_boolean:
            return ValueKind::Boolean;
        case CMPI_uint8:
        case CMPI_uint16:
        case CMPI_uint32:
        case CMPI_uint64:
            return ValueKind::Unsigned;
        case CMPI_sint8:
        case CMPI_sint16:
        case CMPI_sint32:
        case CMPI_sint64:
            return ValueKind::Signed;
        case CMPI_real32:
        case CMPI_real64:
            return ValueKind::Real;
        case CMPI_char16:
            return ValueKind::Character;
        case CMPI_dateTime:
            return ValueKind::DateTime;
        case CMPI_ref:
            return ValueKind::Reference;
        case CMPI_instance:
            return ValueKind::Instance;
        default:
            return value.isText() ? ValueKind::Text : ValueKind::Opaque;
    }
}

}  // namespace cmpihost
