// Elements with content stand between a start and an end tag, empty ones too: some clients take
// what follows a self-closing PROPERTY or VALUE for its content. Those that never have content
// (CLASSNAME, NAMESPACE) close themselves.
#include "host/server/ElementWriter.h"

#include <array>
#include <charconv>
#include <cmath>
#include <initializer_list>

#include "base/Utf8.h"

namespace cmpihost::server {

namespace {

constexpr std::string_view replacement = "\xEF\xBF\xBD";

/// Whether a byte of a text stands for itself everywhere. True for what most texts consist of.
constexpr std::array<bool, 256> plainBytes = [] {
    std::array<bool, 256> result{};
    for (std::size_t byte = 0x20; byte < 0x80; ++byte)
        result[byte] = byte != '&' && byte != '<' && byte != '>' && byte != '"';
    return result;
}();

enum class Place { Content, Attribute };

/// What is written in place of a character; empty where it is written as it is.
std::string_view insteadOf(const base::Utf8Char& character, Place place) {
    const bool attribute = place == Place::Attribute;
    switch (character.codePoint) {
        case '&':
            return "&amp;";
        case '<':
            return "&lt;";
        case '>':
            return "&gt;";
        case '"':
            return attribute ? "&quot;" : "";
        case '\t':
        case '\n':
            // Parsers read them as blanks in attributes anyway.
            return attribute ? " " : "";
        case '\r':
            // The only numeric reference: a bare one would be read as a line feed.
            return attribute ? " " : "&#13;";
        case 0xFFFE:
        case 0xFFFF:
            return replacement;
        default:
            return character.valid && character.codePoint >= 0x20 ? std::string_view()
                                                                  : replacement;
    }
}

void writeEscaped(std::string& xml, std::string_view text, Place place) {
    std::size_t written = 0;
    std::size_t next = 0;
    while (next < text.size()) {
        if (plainBytes[static_cast<unsigned char>(text[next])]) {
            ++next;
            continue;
        }
        const base::Utf8Char character = base::decodeUtf8(text.substr(next));
        const std::string_view instead = insteadOf(character, place);
        if (!instead.empty()) {
            xml.append(text, written, next - written).append(instead);
            written = next + character.length;
        }
        next += character.length;
    }
    xml.append(text, written, next - written);
}

void append(std::string& xml, std::initializer_list<std::string_view> parts) {
    for (const std::string_view part : parts) xml += part;
}

void writeAttribute(std::string& xml, std::string_view name, std::string_view value) {
    append(xml, {" ", name, "=\""});
    writeAttributeText(xml, value);
    xml += '"';
}

/// The types that have a form in XML.
struct TypeRow {
    CMPIType type;
    std::string_view name;
    /// How keys of the type are tagged.
    std::string_view keyType;
};
constexpr TypeRow typeRows[] = {
    {CMPI_string, "string", "string"},    {CMPI_uint16, "uint16", "numeric"},
    {CMPI_uint64, "uint64", "numeric"},   {CMPI_uint32, "uint32", "numeric"},
    {CMPI_boolean, "boolean", "boolean"}, {CMPI_dateTime, "datetime", "string"},
    {CMPI_ref, "reference", "string"},    {CMPI_chars, "string", "string"},
    {CMPI_instance, "string", "string"},  {CMPI_uint8, "uint8", "numeric"},
    {CMPI_sint8, "sint8", "numeric"},     {CMPI_sint16, "sint16", "numeric"},
    {CMPI_sint32, "sint32", "numeric"},   {CMPI_sint64, "sint64", "numeric"},
    {CMPI_real32, "real32", "numeric"},   {CMPI_real64, "real64", "numeric"},
    {CMPI_char16, "char16", "string"},
};

CMPIType elementType(const Value& value) {
    return static_cast<CMPIType>(value.type() & ~CMPI_ARRAY);
}

/// Null for a type that only CMPI has, such as CMPI_ptr.
const TypeRow* rowOf(const Value& value) {
    const CMPIType type = elementType(value);
    for (const TypeRow& row : typeRows)
        if (row.type == type) return &row;
    return nullptr;
}

template <class Number, class... Form>
void writeNumber(std::string& xml, Number number, Form... form) {
    std::array<char, 40> text;
    const auto end = std::to_chars(text.data(), text.data() + text.size(), number, form...).ptr;
    xml.append(text.data(), end);
}

/// In the same way in every locale.
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

void writeEmbedded(std::string& xml, const InstanceValue& instance, const Site& site) {
    std::string text;
    writeInstance(text, instance, site);
    writeText(xml, text);
}

/// What stands in a VALUE or KEYVALUE: a value that is neither null nor an array nor a reference.
void writeScalarText(std::string& xml, const Value& value, const Site& site) {
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
        case CMPI_instance:
            writeEmbedded(xml, value.instance(), site);
            break;
        default:
            writeText(xml, value.text());
    }
}

void writeScalar(std::string& xml, const Value& value, const Site& site) {
    xml += "<VALUE>";
    writeScalarText(xml, value, site);
    xml += "</VALUE>";
}

void writeReference(std::string& xml, const ObjectPathValue& path, const Site& site) {
    xml += "<VALUE.REFERENCE>";
    if (path.keys.empty()) {
        writeClassPath(xml, path.className,
                       {site.hostName, path.nameSpace.empty() ? site.nameSpace : path.nameSpace});
    } else {
        writeInstancePath(xml, path, site);
    }
    xml += "</VALUE.REFERENCE>";
}

/// An element of an array that is null. Clients stumble over VALUE.NULL, so an empty text stands
/// for it among texts, which keeps the others in their places; other types have no value that
/// could, and the element is left out.
void writeNullElement(std::string& xml, const TypeRow& row) {
    if (row.name == "string") xml += "<VALUE></VALUE>";
}

void writeArray(std::string& xml, const Value& value, const TypeRow& row, const Site& site) {
    const bool references = row.type == CMPI_ref;
    xml += references ? "<VALUE.REFARRAY>" : "<VALUE.ARRAY>";
    for (const Value& element : value.elements()) {
        if (element.isNull()) {
            writeNullElement(xml, row);
        } else if (references) {
            writeReference(xml, element.reference(), site);
        } else {
            writeScalar(xml, element, site);
        }
    }
    xml += references ? "</VALUE.REFARRAY>" : "</VALUE.ARRAY>";
}

void writeNameSpacePath(std::string& xml, std::string_view hostName, std::string_view nameSpace) {
    xml += "<NAMESPACEPATH><HOST>";
    writeText(xml, hostName);
    xml += "</HOST><LOCALNAMESPACEPATH>";
    while (!nameSpace.empty()) {
        const std::string_view component = nameSpace.substr(0, nameSpace.find('/'));
        if (!component.empty()) {
            xml += "<NAMESPACE";
            writeAttribute(xml, "NAME", component);
            xml += "/>";
        }
        nameSpace.remove_prefix(std::min(nameSpace.size(), component.size() + 1));
    }
    xml += "</LOCALNAMESPACEPATH></NAMESPACEPATH>";
}

void writeKey(std::string& xml, const KeyBinding& key, const Site& site) {
    xml += "<KEYBINDING";
    writeAttribute(xml, "NAME", key.name);
    xml += '>';
    const TypeRow* const row = rowOf(key.value);
    if (row == nullptr || key.value.isNull() || key.value.isArray()) {
        // No such key is a proper one; an empty text is what is left of it.
        xml += "<KEYVALUE VALUETYPE=\"string\"></KEYVALUE>";
    } else if (row->type == CMPI_ref) {
        writeReference(xml, key.value.reference(), site);
    } else {
        append(xml, {"<KEYVALUE VALUETYPE=\"", row->keyType, "\">"});
        writeScalarText(xml, key.value, site);
        xml += "</KEYVALUE>";
    }
    xml += "</KEYBINDING>";
}

/// Whether the value is one that a property can have.
bool hasPropertyForm(const Value& value, const TypeRow* row) {
    const bool referenceArray = value.isArray() && row != nullptr && row->type == CMPI_ref;
    return row != nullptr && !value.isNull() && !referenceArray;
}

void writeProperty(std::string& xml, const PropertyValue& property, const Site& site,
                   bool classOrigin) {
    const Value& value = property.value;
    const TypeRow* const row = rowOf(value);
    if (!hasPropertyForm(value, row)) return;
    const bool reference = row->type == CMPI_ref;
    const std::string_view tag = reference         ? "PROPERTY.REFERENCE"
                                 : value.isArray() ? "PROPERTY.ARRAY"
                                                   : "PROPERTY";
    append(xml, {"<", tag});
    writeAttribute(xml, "NAME", property.name);
    if (reference) {
        writeAttribute(xml, "REFERENCECLASS", value.reference().className);
    } else {
        append(xml, {" TYPE=\"", row->name, "\""});
    }
    if (classOrigin && !property.origin.empty())
        writeAttribute(xml, "CLASSORIGIN", property.origin);
    if (row->type == CMPI_instance) xml += " EmbeddedObject=\"instance\"";
    xml += '>';
    writeValue(xml, value, site);
    append(xml, {"</", tag, ">"});
}

/// The attributes and the content of a PARAMVALUE or RETURNVALUE.
void writeTyped(std::string& xml, const Value& value, const Site& site) {
    if (const TypeRow* const row = rowOf(value)) {
        append(xml, {" PARAMTYPE=\"", row->name, "\""});
        if (row->type == CMPI_instance) xml += " EmbeddedObject=\"instance\"";
    }
    xml += '>';
    writeValue(xml, value, site);
}

}  // namespace

void writeText(std::string& xml, std::string_view text) {
    writeEscaped(xml, text, Place::Content);
}

void writeAttributeText(std::string& xml, std::string_view text) {
    writeEscaped(xml, text, Place::Attribute);
}

void writeValue(std::string& xml, const Value& value, const Site& site) {
    const TypeRow* const row = rowOf(value);
    if (row == nullptr || value.isNull()) return;
    if (value.isArray()) {
        writeArray(xml, value, *row, site);
    } else if (row->type == CMPI_ref) {
        writeReference(xml, value.reference(), site);
    } else {
        writeScalar(xml, value, site);
    }
}

void writeInstanceName(std::string& xml, const ObjectPathValue& path, const Site& site) {
    xml += "<INSTANCENAME";
    writeAttribute(xml, "CLASSNAME", path.className);
    xml += '>';
    for (const KeyBinding& key : path.keys) writeKey(xml, key, site);
    xml += "</INSTANCENAME>";
}

void writeInstancePath(std::string& xml, const ObjectPathValue& path, const Site& site) {
    xml += "<INSTANCEPATH>";
    writeNameSpacePath(xml, path.hostName.empty() ? site.hostName : path.hostName,
                       path.nameSpace.empty() ? site.nameSpace : path.nameSpace);
    writeInstanceName(xml, path, site);
    xml += "</INSTANCEPATH>";
}

void writeClassPath(std::string& xml, const std::string& className, const Site& site) {
    xml += "<CLASSPATH>";
    writeNameSpacePath(xml, site.hostName, site.nameSpace);
    xml += "<CLASSNAME";
    writeAttribute(xml, "NAME", className);
    xml += "/></CLASSPATH>";
}

void writeInstance(std::string& xml, const InstanceValue& instance, const Site& site,
                   bool classOrigin) {
    xml += "<INSTANCE";
    writeAttribute(xml, "CLASSNAME", instance.path.className);
    xml += '>';
    for (const PropertyValue& property : instance.properties)
        writeProperty(xml, property, site, classOrigin);
    xml += "</INSTANCE>";
}

void writeParameter(std::string& xml, std::string_view name, const Value& value, const Site& site) {
    xml += "<PARAMVALUE";
    writeAttribute(xml, "NAME", name);
    writeTyped(xml, value, site);
    xml += "</PARAMVALUE>";
}

void writeReturnValue(std::string& xml, const Value& value, const Site& site) {
    if (value.isNull() || value.isArray() || rowOf(value) == nullptr) return;
    xml += "<RETURNVALUE";
    writeTyped(xml, value, site);
    xml += "</RETURNVALUE>";
}

void writeNamedInstances(std::string& xml, const std::vector<InstanceValue>& instances,
                         const Site& site, bool classOrigin) {
    for (const InstanceValue& instance : instances) {
        xml += "<VALUE.NAMEDINSTANCE>";
        writeInstanceName(xml, instance.path, site);
        writeInstance(xml, instance, site, classOrigin);
        xml += "</VALUE.NAMEDINSTANCE>";
    }
}

void writeObjectsWithPath(std::string& xml, const std::vector<InstanceValue>& instances,
                          const Site& site, bool classOrigin) {
    for (const InstanceValue& instance : instances) {
        xml += "<VALUE.OBJECTWITHPATH>";
        writeInstancePath(xml, instance.path, site);
        writeInstance(xml, instance, site, classOrigin);
        xml += "</VALUE.OBJECTWITHPATH>";
    }
}

void writeInstancesWithPath(std::string& xml, const std::vector<InstanceValue>& instances,
                            const Site& site, bool classOrigin) {
    for (const InstanceValue& instance : instances) {
        xml += "<VALUE.INSTANCEWITHPATH>";
        writeInstancePath(xml, instance.path, site);
        writeInstance(xml, instance, site, classOrigin);
        xml += "</VALUE.INSTANCEWITHPATH>";
    }
}

void writeInstanceNames(std::string& xml, const std::vector<ObjectPathValue>& paths,
                        const Site& site) {
    for (const ObjectPathValue& path : paths) writeInstanceName(xml, path, site);
}

void writeInstancePaths(std::string& xml, const std::vector<ObjectPathValue>& paths,
                        const Site& site) {
    for (const ObjectPathValue& path : paths) writeInstancePath(xml, path, site);
}

void writeObjectPaths(std::string& xml, const std::vector<ObjectPathValue>& paths,
                      const Site& site) {
    for (const ObjectPathValue& path : paths) {
        xml += "<OBJECTPATH>";
        writeInstancePath(xml, path, site);
        xml += "</OBJECTPATH>";
    }
}

}  // namespace cmpihost::server
