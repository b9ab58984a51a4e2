#include "host/server/RequestGrammar.h"

#include <iterator>
#include <string_view>
#include <unordered_map>

#include "base/Ascii.h"
#include "base/Utf8.h"

namespace cmpihost::server {

namespace {

/// What an element has to have. Contents are lists of parts in their order, separated by blanks: a
/// name or a choice of names ("A|B"), "?" for none or one, "*" for any number, "*64" for at most so
/// many. An element with several rows fits one of them.
struct ElementRow {
    const char* name;
    const char* attributes;
    const char* content;
};

/// Contents that are text, and contents that nobody looks at.
constexpr std::string_view textContent = "#text";
constexpr std::string_view anyContent = "#any";

constexpr ElementRow elementRows[] = {
    {"CIM", "CIMVERSION DTDVERSION", "MESSAGE"},
    {"MESSAGE", "ID PROTOCOLVERSION", "SIMPLEREQ"},
    {"SIMPLEREQ", "", "CORRELATOR* IMETHODCALL|METHODCALL"},
    {"CORRELATOR", "", "#any"},
    {"IMETHODCALL", "NAME", "LOCALNAMESPACEPATH IPARAMVALUE*64"},
    // Paths with a namespace are the value of no parameter, but the message is still understood.
    {"IPARAMVALUE", "NAME",
     "VALUE|VALUE.ARRAY|VALUE.REFERENCE|VALUE.REFARRAY|CLASSNAME|INSTANCENAME|"
     "QUALIFIER.DECLARATION|CLASS|INSTANCE|VALUE.NAMEDINSTANCE|LOCALCLASSPATH|LOCALINSTANCEPATH|"
     "CLASSPATH|INSTANCEPATH?"},
    {"METHODCALL", "NAME", "LOCALCLASSPATH|LOCALINSTANCEPATH PARAMVALUE*64"},
    {"PARAMVALUE", "NAME",
     "VALUE|VALUE.REFERENCE|VALUE.ARRAY|VALUE.REFARRAY|CLASSNAME|INSTANCENAME|CLASS|INSTANCE|"
     "VALUE.NAMEDINSTANCE?"},

    {"NAMESPACE", "NAME", ""},
    {"LOCALNAMESPACEPATH", "", "NAMESPACE NAMESPACE*"},
    {"HOST", "", "#text"},
    {"NAMESPACEPATH", "", "HOST LOCALNAMESPACEPATH"},
    {"CLASSNAME", "NAME", ""},
    {"LOCALCLASSPATH", "", "LOCALNAMESPACEPATH CLASSNAME"},
    {"CLASSPATH", "", "NAMESPACEPATH CLASSNAME"},
    {"INSTANCENAME", "CLASSNAME", "KEYBINDING*1000"},
    {"INSTANCENAME", "CLASSNAME", "KEYVALUE|VALUE.REFERENCE"},
    {"LOCALINSTANCEPATH", "", "LOCALNAMESPACEPATH INSTANCENAME"},
    {"INSTANCEPATH", "", "NAMESPACEPATH INSTANCENAME"},
    {"KEYBINDING", "NAME", "KEYVALUE|VALUE.REFERENCE"},
    {"KEYVALUE", "", "#text"},

    {"VALUE", "", "#text"},
    {"VALUE.NULL", "", ""},
    {"VALUE.ARRAY", "", "VALUE|VALUE.NULL*"},
    {"VALUE.REFERENCE", "",
     "CLASSPATH|LOCALCLASSPATH|CLASSNAME|INSTANCEPATH|LOCALINSTANCEPATH|INSTANCENAME"},
    {"VALUE.REFARRAY", "", "VALUE.REFERENCE|VALUE.NULL*"},
    {"VALUE.NAMEDINSTANCE", "", "INSTANCENAME INSTANCE"},

    {"INSTANCE", "CLASSNAME", "QUALIFIER* PROPERTY|PROPERTY.ARRAY|PROPERTY.REFERENCE*"},
    {"PROPERTY", "NAME TYPE", "QUALIFIER* VALUE?"},
    {"PROPERTY.ARRAY", "NAME TYPE", "QUALIFIER* VALUE.ARRAY?"},
    {"PROPERTY.REFERENCE", "NAME", "QUALIFIER* VALUE.REFERENCE?"},
    {"CLASS", "NAME", "QUALIFIER* PROPERTY|PROPERTY.ARRAY|PROPERTY.REFERENCE* METHOD*"},
    {"METHOD", "NAME",
     "QUALIFIER* PARAMETER|PARAMETER.REFERENCE|PARAMETER.ARRAY|PARAMETER.REFARRAY*"},
    {"PARAMETER", "NAME TYPE", "QUALIFIER*"},
    {"PARAMETER.REFERENCE", "NAME", "QUALIFIER*"},
    {"PARAMETER.ARRAY", "NAME TYPE", "QUALIFIER*"},
    {"PARAMETER.REFARRAY", "NAME", "QUALIFIER*"},
    {"QUALIFIER", "NAME TYPE", "VALUE|VALUE.ARRAY?"},
    {"QUALIFIER.DECLARATION", "NAME TYPE", "SCOPE? VALUE|VALUE.ARRAY?"},
    {"SCOPE", "", ""},
};

/// The part of a list before the first separator; takes it off.
std::string_view takeListPart(std::string_view& list, char separator) {
    const std::size_t end = list.find(separator);
    const std::string_view part = list.substr(0, end);
    list = end == std::string_view::npos ? std::string_view() : list.substr(end + 1);
    return part;
}

bool isOneOf(std::string_view name, std::string_view choice) {
    while (!choice.empty()) {
        if (takeListPart(choice, '|') == name) return true;
    }
    return false;
}

struct ContentPart {
    std::string_view choice;
    std::size_t least = 1;
    std::size_t most = 1;
};

ContentPart contentPart(std::string_view text) {
    const std::size_t mark = text.find_first_of("?*");
    if (mark == std::string_view::npos) return {text};
    ContentPart part{text.substr(0, mark), 0};
    if (text[mark] == '*') {
        part.most = 0;
        for (const char digit : text.substr(mark + 1)) {
            part.most = part.most * 10 + static_cast<std::size_t>(digit - '0');
        }
        if (part.most == 0) part.most = static_cast<std::size_t>(-1);
    }
    return part;
}

/// For elements that need not be in the table: their names are any text of the client's.
std::string shownName(const XmlElement& element) {
    return base::escape(element.name, base::EscapeStyle::ascii);
}

bool isBlank(std::string_view text) {
    return text.find_first_not_of(" \t\r\n") == std::string_view::npos;
}

std::optional<std::string> attributeError(const XmlElement& element, std::string_view attributes) {
    while (!attributes.empty()) {
        const std::string_view name = takeListPart(attributes, ' ');
        if (element.attribute(name) == nullptr) {
            return element.name + " lacks the attribute " + std::string(name);
        }
    }
    return std::nullopt;
}

/// Compares the children themselves, not what is in them.
std::optional<std::string> childrenError(const XmlElement& element, std::string_view content) {
    auto child = element.children.begin();
    while (!content.empty()) {
        const ContentPart part = contentPart(takeListPart(content, ' '));
        std::size_t count = 0;
        while (child != element.children.end() && count < part.most &&
               isOneOf(child->name, part.choice)) {
            ++child;
            ++count;
        }
        if (count < part.least) return element.name + " lacks " + std::string(part.choice);
    }
    if (child == element.children.end()) return std::nullopt;
    return shownName(*child) + " does not belong where it is in " + element.name;
}

/// The first row of an element; its others follow. Null for an element that is not known.
const ElementRow* firstRow(std::string_view name) {
    static const auto rows = [] {
        std::unordered_map<std::string_view, const ElementRow*> byName;
        for (const ElementRow& row : elementRows) byName.emplace(row.name, &row);
        return byName;
    }();
    const auto found = rows.find(name);
    return found == rows.end() ? nullptr : found->second;
}

std::optional<std::string> ownError(const XmlElement& element, const ElementRow& row) {
    if (auto error = attributeError(element, row.attributes)) return error;
    if (row.content == textContent) return childrenError(element, "");
    if (!isBlank(element.text)) return "there is text in " + element.name;
    return childrenError(element, row.content);
}

/// What keeps the element from its first row, unless it fits another one.
std::optional<std::string> rowsError(const XmlElement& element, const ElementRow* row) {
    const std::optional<std::string> error = ownError(element, *row);
    if (!error) return std::nullopt;
    while (++row != std::end(elementRows) && row->name == element.name) {
        if (!ownError(element, *row)) return std::nullopt;
    }
    return error;
}

}  // namespace

std::optional<std::string> structuralError(const XmlElement& element) {
    const ElementRow* const row = firstRow(element.name);
    if (row == nullptr) return "the element " + shownName(element) + " is not known here";
    if (row->content == anyContent) return std::nullopt;
    if (auto error = rowsError(element, row)) return error;
    for (const XmlElement& child : element.children) {
        if (auto error = structuralError(child)) return error;
    }
    return std::nullopt;
}

}  // namespace cmpihost::server
