// Numbers are written in the same way in every locale.
#include "host/server/ValueText.h"

#include <array>
#include <charconv>
#include <cmath>

#include "base/Utf8.h"
#include "host/server/XmlText.h"

namespace cmpihost::server {

namespace {

/// An embedded instance is a string by its type.
constexpr XmlType xmlTypes[] = {
    {CMPI_boolean, "boolean", "boolean"}, {CMPI_string, "string", "string"},
    {CMPI_chars, "string", "string"},     {CMPI_instance, "string", "string"},
    {CMPI_char16, "char16", "string"},    {CMPI_dateTime, "datetime", "string"},
    {CMPI_ref, "reference", "string"},    {CMPI_uint8, "uint8", "numeric"},
    {CMPI_sint8, "sint8", "numeric"},     {CMPI_uint16, "uint16", "numeric"},
    {CMPI_sint16, "sint16", "numeric"},   {CMPI_uint32, "uint32", "numeric"},
    {CMPI_sint32, "sint32", "numeric"},   {CMPI_uint64, "uint64", "numeric"},
    {CMPI_sint64, "sint64", "numeric"},   {CMPI_real32, "real32", "numeric"},
    {CMPI_real64, "real64", "numeric"},
};

template <class Number, class... Form>
void writeNumber(std::string& xml, Number number, Form... form) {
    std::array<char, 40> text;
    const auto end = std::to_chars(text.data(), text.data() + text.size(), number, form...).ptr;
    xml.append(text.data(), end);
}

void writeReal(std::string& xml, double real, int digits) {
    if (std::isnan(real)) {
        xml += "NaN";
    } else if (std::isinf(real)) {
        xml += real < 0 ? "-INF" : "INF";
    } else {
        writeNumber(xml, real, std::chars_format::scientific, digits);
    }
}

void writeCharacter(std::string& xml, std::uint64_t code) {
    std::string character;
    base::appendUtf8(character, static_cast<char32_t>(code));
    writeText(xml, character);
}

}  // namespace

const XmlType* xmlTypeOf(const Value& value) {
    const auto elementType = static_cast<CMPIType>(value.type() & ~CMPI_ARRAY);
    for (const XmlType& each : xmlTypes)
        if (each.cmpi == elementType) return &each;
    return nullptr;
}

void writeValueText(std::string& xml, const Value& value) {
    switch (value.type()) {
        case CMPI_boolean:
            xml += value.boolean() ? "TRUE" : "FALSE";
            break;
        case CMPI_uint8:
        case CMPI_uint16:
        case CMPI_uint32:
        case CMPI_uint64:
            writeNumber(xml, value.unsignedInteger());
            break;
        case CMPI_sint8:
        case CMPI_sint16:
        case CMPI_sint32:
        case CMPI_sint64:
            writeNumber(xml, value.signedInteger());
            break;
        case CMPI_real32:
            writeReal(xml, value.real(), 8);
            break;
        case CMPI_real64:
            writeReal(xml, value.real(), 16);
            break;
        case CMPI_char16:
            writeCharacter(xml, value.unsignedInteger());
            break;
        default:
            writeText(xml, value.text());
    }
}

}  // namespace cmpihost::server
