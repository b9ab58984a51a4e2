#include "host/mof/MofTypes.h"

#include <algorithm>
#include <iterator>

#include "host/broker/Value.h"

namespace cmpihost::mof {

namespace {

struct TypeRow {
    Type type;
    const char* name;
    /// Of an integer.
    unsigned bits{};
    bool isSigned{};
};

constexpr TypeRow types[] = {
    {Type::Boolean, "boolean"},
    {Type::String, "string"},
    {Type::Char16, "char16"},
    {Type::DateTime, "datetime"},
    {Type::UInt8, "uint8", 8, false},
    {Type::SInt8, "sint8", 8, true},
    {Type::UInt16, "uint16", 16, false},
    {Type::SInt16, "sint16", 16, true},
    {Type::UInt32, "uint32", 32, false},
    {Type::SInt32, "sint32", 32, true},
    {Type::UInt64, "uint64", 64, false},
    {Type::SInt64, "sint64", 64, true},
    {Type::Real32, "real32"},
    {Type::Real64, "real64"},
    {Type::Reference, "ref"},
};

/// Every type has a row.
const TypeRow& rowOf(Type type) {
    return *std::find_if(std::begin(types), std::end(types),
                         [type](const TypeRow& row) { return row.type == type; });
}

bool fitsInteger(const Scalar& scalar, const TypeRow& row) {
    const unsigned valueBits = row.isSigned ? row.bits - 1 : row.bits;
    if (const auto* number = std::get_if<std::uint64_t>(&scalar)) {
        return valueBits == 64 || *number >> valueBits == 0;
    }
    if (const auto* number = std::get_if<std::int64_t>(&scalar)) {
        // The magnitude less one, so that the least number of 64 bits does not overflow.
        const auto magnitude = static_cast<std::uint64_t>(-(*number + 1));
        return *number == 0 || (row.isSigned && magnitude >> valueBits == 0);
    }
    return false;
}

}  // namespace

std::optional<Type> typeNamed(const std::string& name) {
    for (const TypeRow& row : types) {
        if (row.type != Type::Reference && equalNames(row.name, name)) {
            return row.type;
        }
    }
    return std::nullopt;
}

const char* nameOf(Type type) {
    return rowOf(type).name;
}

bool fits(const Scalar& scalar, Type type) {
    if (std::holds_alternative<std::monostate>(scalar)) {
        return true;
    }
    switch (type) {
        case Type::Boolean:
            return std::holds_alternative<bool>(scalar);
        case Type::String:
        case Type::DateTime:
        case Type::Reference:
            return std::holds_alternative<std::string>(scalar);
        case Type::Char16: {
            const auto* character = std::get_if<Character>(&scalar);
            return character != nullptr && character->code <= 0xFFFF;
        }
        case Type::Real32:
        case Type::Real64:
            return std::holds_alternative<double>(scalar) ||
                   std::holds_alternative<std::uint64_t>(scalar) ||
                   std::holds_alternative<std::int64_t>(scalar);
        default:
            return fitsInteger(scalar, rowOf(type));
    }
}

}  // namespace cmpihost::mof
