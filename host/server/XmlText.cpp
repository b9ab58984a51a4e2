// Most texts are plain ASCII: they are gone through once, and copied in as few pieces as there are.
#include "host/server/XmlText.h"

#include <array>

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

}  // namespace

void writeText(std::string& xml, std::string_view text) {
    writeEscaped(xml, text, Place::Content);
}

void writeAttributeText(std::string& xml, std::string_view text) {
    writeEscaped(xml, text, Place::Attribute);
}

void writeAttribute(std::string& xml, std::string_view name, std::string_view value) {
    xml += ' ';
    xml += name;
    xml += "=\"";
    writeAttributeText(xml, value);
    xml += '"';
}

}  // namespace cmpihost::server
