// The rules on MOF's types and qualifiers that hold wherever a declaration is looked at, so that
// the parser, the schema and the command line judge constants alike.
#include "host/mof/MofAst.h"

#include <iterator>
#include <utility>

#include "base/Ascii.h"

namespace cmpihost::mof {

namespace {

struct TypeRow {
    const char* name;
    /// Of an integer.
    unsigned bits{};
    bool isSigned{};
};

/// In the order of Type. "ref" is only how a reference is called: it is declared by a class and
/// REF.
constexpr TypeRow types[] = {
    {"boolean"},
    {"string"},
    {"char16"},
    {"datetime"},
    {"uint8", 8, false},
    {"sint8", 8, true},
    {"uint16", 16, false},
    {"sint16", 16, true},
    {"uint32", 32, false},
    {"sint32", 32, true},
    {"uint64", 64, false},
    {"sint64", 64, true},
    {"real32"},
    {"real64"},
    {"ref"},
};
static_assert(std::size(types) == static_cast<std::size_t>(Type::Reference) + 1);

const TypeRow& rowOf(Type type) {
    return types[static_cast<std::size_t>(type)];
}

bool fitsInteger(const Scalar& scalar, const TypeRow& row) {
    const unsigned valueBits = row.isSigned ? row.bits - 1 : row.bits;
    if (const auto* number = std::get_if<std::uint64_t>(&scalar))
        return valueBits == 64 || *number >> valueBits == 0;
    if (const auto* number = std::get_if<std::int64_t>(&scalar)) {
        // The magnitude less one, so that the least number of 64 bits does not overflow.
        const auto magnitude = static_cast<std::uint64_t>(-(*number + 1));
        return *number == 0 || (row.isSigned && magnitude >> valueBits == 0);
    }
    return false;
}

}  // namespace

MofError::MofError(const std::string& file, Position position, const std::string& complaint)
    : std::runtime_error(file + ":" + std::to_string(position.line) + ":" +
                         std::to_string(position.column) + ": " + complaint),
      complaint_(complaint),
      position_(position) {}

std::optional<Type> typeNamed(const std::string& name) {
    for (std::size_t index = 0; index < static_cast<std::size_t>(Type::Reference); ++index)
        if (base::equalsIgnoreCase(types[index].name, name)) return static_cast<Type>(index);
    return std::nullopt;
}

const char* nameOf(Type type) {
    return rowOf(type).name;
}

bool fits(const Scalar& scalar, Type type) {
    if (std::holds_alternative<std::monostate>(scalar)) return true;
    switch (type) {
        case Type::Boolean:
            return std::holds_alternative<bool>(scalar);
        case Type::String:
        case Type::DateTime:
        case Type::Reference:
            return std::holds_alternative<std::string>(scalar);
        case Type::Char16: {
            // CIM characters are UCS-2: what is beyond has no place in 16 bits.
            const auto* character = std::get_if<Character>(&scalar);
            return character != nullptr && character->code <= 0xFFFF;
        }
        case Type::Real32:
        case Type::Real64:
            // An integer may stand where a real is due, not the other way round.
            return std::holds_alternative<double>(scalar) ||
                   std::holds_alternative<std::uint64_t>(scalar) ||
                   std::holds_alternative<std::int64_t>(scalar);
        default:
            return fitsInteger(scalar, rowOf(type));
    }
}

const Qualifier* findQualifier(const std::vector<Qualifier>& qualifiers, const std::string& name) {
    for (const Qualifier& qualifier : qualifiers)
        if (base::equalsIgnoreCase(qualifier.name, name)) return &qualifier;
    return nullptr;
}

bool isSet(const Qualifier* qualifier) {
    if (qualifier == nullptr) return false;
    // Boolean qualifiers are mostly given by name alone.
    if (!qualifier->value) return true;
    const auto& items = qualifier->value->items;
    return items.size() == 1 && items.front() == Scalar(true);
}

bool isSet(const std::vector<Qualifier>& qualifiers, const std::string& name) {
    return isSet(findQualifier(qualifiers, name));
}

std::vector<std::string> texts(const Qualifier* qualifier) {
    std::vector<std::string> result;
    if (qualifier == nullptr || !qualifier->value) return result;
    for (const Scalar& item : qualifier->value->items)
        if (const auto* string = std::get_if<std::string>(&item)) result.push_back(*string);
    return result;
}

std::vector<std::string> texts(const std::vector<Qualifier>& qualifiers, const std::string& name) {
    return texts(findQualifier(qualifiers, name));
}

std::string text(const Qualifier* qualifier) {
    std::vector<std::string> all = texts(qualifier);
    return all.empty() ? std::string() : std::move(all.front());
}

std::string text(const std::vector<Qualifier>& qualifiers, const std::string& name) {
    return text(findQualifier(qualifiers, name));
}

}  // namespace cmpihost::mof
