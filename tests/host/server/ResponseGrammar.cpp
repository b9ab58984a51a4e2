// The grammar is a table, in the portable part that responses keep to: paths are whole ones, keys
// have names, nothing is VALUE.NULL.
#include "host/server/ResponseGrammar.h"

#include <algorithm>
#include <cctype>
#include <set>
#include <string_view>

#include "host/server/ResponseValues.h"

namespace cmpihost::server::validator {

namespace {

struct ElementRow {
    const char* name;
    /// Apart by blanks; those in brackets may be missing.
    const char* attributes;
    /// As for fitsContent; "#" for text.
    const char* content;
};

constexpr const char* results =
    "CLASSNAME* / INSTANCENAME* / INSTANCEPATH* / VALUE* / VALUE.OBJECTWITHPATH* / VALUE.OBJECT* / "
    "OBJECTPATH* / QUALIFIER.DECLARATION* / VALUE.ARRAY? / VALUE.REFERENCE? / CLASS* / INSTANCE* / "
    "VALUE.NAMEDINSTANCE* / VALUE.INSTANCEWITHPATH*";
constexpr const char* qualified = "QUALIFIER*";

constexpr ElementRow elementRows[] = {
    {"CIM", "CIMVERSION DTDVERSION", "MESSAGE"},
    {"MESSAGE", "ID PROTOCOLVERSION", "SIMPLERSP"},
    {"SIMPLERSP", "", "IMETHODRESPONSE|METHODRESPONSE"},
    {"IMETHODRESPONSE", "NAME", "ERROR / IRETURNVALUE? PARAMVALUE*"},
    {"METHODRESPONSE", "NAME", "ERROR / RETURNVALUE? PARAMVALUE*"},
    {"ERROR", "CODE DESCRIPTION", ""},
    {"RETURNVALUE", "[PARAMTYPE] [EmbeddedObject]", "VALUE|VALUE.REFERENCE?"},
    {"IRETURNVALUE", "", results},
    {"PARAMVALUE", "NAME [PARAMTYPE] [EmbeddedObject]",
     "VALUE|VALUE.REFERENCE|VALUE.ARRAY|VALUE.REFARRAY?"},
    {"NAMESPACEPATH", "", "HOST LOCALNAMESPACEPATH"},
    {"LOCALNAMESPACEPATH", "", "NAMESPACE+"},
    {"NAMESPACE", "NAME", ""},
    {"HOST", "", "#"},
    {"CLASSNAME", "NAME", ""},
    {"CLASSPATH", "", "NAMESPACEPATH CLASSNAME"},
    {"INSTANCENAME", "CLASSNAME", "KEYBINDING*"},
    {"INSTANCEPATH", "", "NAMESPACEPATH INSTANCENAME"},
    {"OBJECTPATH", "", "INSTANCEPATH|CLASSPATH"},
    {"KEYBINDING", "NAME", "KEYVALUE|VALUE.REFERENCE"},
    {"KEYVALUE", "VALUETYPE [TYPE]", "#"},
    {"VALUE.REFERENCE", "", "CLASSPATH|INSTANCEPATH"},
    {"VALUE", "", "#"},
    {"VALUE.ARRAY", "", "VALUE*"},
    {"VALUE.REFARRAY", "", "VALUE.REFERENCE*"},
    {"VALUE.OBJECT", "", "CLASS|INSTANCE"},
    {"VALUE.NAMEDINSTANCE", "", "INSTANCENAME INSTANCE"},
    {"VALUE.INSTANCEWITHPATH", "", "INSTANCEPATH INSTANCE"},
    {"VALUE.OBJECTWITHPATH", "", "CLASSPATH CLASS / INSTANCEPATH INSTANCE"},
    {"INSTANCE", "CLASSNAME", "QUALIFIER* PROPERTY|PROPERTY.ARRAY|PROPERTY.REFERENCE*"},
    {"PROPERTY", "NAME TYPE [CLASSORIGIN] [PROPAGATED] [EmbeddedObject]", "QUALIFIER* VALUE?"},
    {"PROPERTY.ARRAY", "NAME TYPE [ARRAYSIZE] [CLASSORIGIN] [PROPAGATED] [EmbeddedObject]",
     "QUALIFIER* VALUE.ARRAY?"},
    {"PROPERTY.REFERENCE", "NAME [REFERENCECLASS] [CLASSORIGIN] [PROPAGATED]",
     "QUALIFIER* VALUE.REFERENCE?"},
    {"CLASS", "NAME [SUPERCLASS]",
     "QUALIFIER* PROPERTY|PROPERTY.ARRAY|PROPERTY.REFERENCE* METHOD*"},
    {"METHOD", "NAME TYPE [CLASSORIGIN] [PROPAGATED]",
     "QUALIFIER* PARAMETER|PARAMETER.REFERENCE|PARAMETER.ARRAY|PARAMETER.REFARRAY*"},
    {"PARAMETER", "NAME TYPE", qualified},
    {"PARAMETER.REFERENCE", "NAME [REFERENCECLASS]", qualified},
    {"PARAMETER.ARRAY", "NAME TYPE [ARRAYSIZE]", qualified},
    {"PARAMETER.REFARRAY", "NAME [REFERENCECLASS] [ARRAYSIZE]", qualified},
    {"QUALIFIER", "NAME TYPE [PROPAGATED] [OVERRIDABLE] [TOSUBCLASS] [TOINSTANCE] [TRANSLATABLE]",
     "VALUE|VALUE.ARRAY?"},
    {"QUALIFIER.DECLARATION",
     "NAME TYPE [ISARRAY] [ARRAYSIZE] [OVERRIDABLE] [TOSUBCLASS] [TOINSTANCE] [TRANSLATABLE]",
     "SCOPE? VALUE|VALUE.ARRAY?"},
    {"SCOPE", "[CLASS] [ASSOCIATION] [REFERENCE] [PROPERTY] [METHOD] [PARAMETER] [INDICATION]", ""},
};

const ElementRow* rowOf(const std::string& name) {
    for (const ElementRow& row : elementRows)
        if (row.name == name) return &row;
    return nullptr;
}

/// Takes what stands before the separator, or all, off the front of a text.
std::string_view takeFront(std::string_view& text, char separator) {
    const std::string_view front = text.substr(0, text.find(separator));
    text.remove_prefix(std::min(text.size(), front.size() + 1));
    return front;
}

bool isAmong(std::string_view alternatives, const std::string& name) {
    while (!alternatives.empty())
        if (takeFront(alternatives, '|') == name) return true;
    return false;
}

/// One item of a content model: how many of the children from `next` on it takes; none: it does
/// not fit.
std::optional<std::size_t> taken(const std::vector<Element>& children, std::size_t next,
                                 std::string_view item) {
    const char last = item.back();
    const bool many = last == '*' || last == '+';
    const bool optional = last == '*' || last == '?';
    if (many || optional) item.remove_suffix(1);
    std::size_t count = 0;
    while (next + count < children.size() && (many || count == 0) &&
           isAmong(item, children[next + count].name))
        ++count;
    if (count == 0 && !optional) return std::nullopt;
    return count;
}

bool fitsSequence(const Element& element, std::string_view sequence) {
    std::size_t next = 0;
    while (!sequence.empty()) {
        const std::string_view item = takeFront(sequence, ' ');
        const std::optional<std::size_t> count = taken(element.children, next, item);
        if (!count) return false;
        next += *count;
    }
    return next == element.children.size();
}

bool isNumber(const std::string& text) {
    return isValueText("uint32", text) && text != "0";
}

/// Whether an attribute may have that value. `element` is the name of the element.
bool fitsAttribute(const std::string& element, const std::string& name, const std::string& value) {
    if (name == "ID") return true;
    if (name == "CIMVERSION" || name == "DTDVERSION") return value == "2.0";
    if (name == "PROTOCOLVERSION") return value == "1.0";
    if (name == "CODE" || name == "ARRAYSIZE") return isNumber(value);
    if (name == "DESCRIPTION") return !value.empty() && characterCount(value) <= 500;
    if (name == "TYPE") return isType(value);
    if (name == "PARAMTYPE") return isType(value) || value == "reference";
    if (name == "VALUETYPE") return value == "string" || value == "boolean" || value == "numeric";
    if (name == "EmbeddedObject") return value == "instance" || value == "object";
    if (name == "NAME" && element == "NAMESPACE")
        return !value.empty() && value.find('/') == std::string::npos;
    // Repeats what the client wrote.
    if (name == "NAME" && (element == "IMETHODRESPONSE" || element == "METHODRESPONSE"))
        return true;
    if (name == "NAME" || name == "CLASSNAME" || name == "CLASSORIGIN" || name == "SUPERCLASS" ||
        name == "REFERENCECLASS")
        return isIdentifier(value);
    return value == "true" || value == "false";
}

/// Checks one element, without what is in its children.
class ElementCheck {
  public:
    ElementCheck(const Element& element, const std::string& place, Complaints& complaints)
        : element_(element), place_(place), complaints_(complaints) {}

    void run(const ElementRow& row) {
        checkAttributes(row);
        checkContent(row);
        checkNames();
        checkValueMap();
        checkClassOfPath();
        checkValues();
    }

  private:
    void complain(const std::string& what) { complaints_.push_back(place_ + ": " + what); }

    void checkAttributes(const ElementRow& row) {
        std::vector<std::string_view> known;
        for (std::string_view rest = row.attributes; !rest.empty();) {
            std::string_view word = takeFront(rest, ' ');
            const bool optional = word.front() == '[';
            if (optional) word = word.substr(1, word.size() - 2);
            known.push_back(word);
            const std::string name(word);
            if (!optional && element_.attribute(name) == nullptr) complain("no " + name);
        }
        for (const auto& [name, value] : element_.attributes) {
            if (std::find(known.begin(), known.end(), name) == known.end()) {
                complain("unknown attribute " + name);
            } else if (!fitsAttribute(element_.name, name, value)) {
                complain("wrong " + name + " '" + value + "'");
            }
        }
    }

    void checkContent(const ElementRow& row) {
        const bool text = std::string_view(row.content) == "#";
        if (!fitsContent(element_, text ? "" : row.content)) {
            std::string found;
            for (const Element& child : element_.children) {
                if (found.size() < 200) found += " " + child.name;
            }
            complain("wrong children:" + found);
        }
        const bool blank = element_.text.find_first_not_of(" \t\r\n") == std::string::npos;
        if (!text && !blank) complain("text between elements");
        if (element_.name == "HOST" && blank) complain("empty");
    }

    /// No two properties, keys, parameters or qualifiers have the same name.
    void checkNames() {
        std::set<std::string> seen;
        for (const Element& child : element_.children) {
            const std::string* const name = child.attribute("NAME");
            const bool counts = child.name != "NAMESPACE" && child.name != "CLASSNAME" &&
                                element_.name != "IRETURNVALUE";
            if (name == nullptr || !counts) continue;
            std::string key = child.name.substr(0, child.name.find('.')) + " ";
            for (const char letter : *name)
                key += static_cast<char>(std::tolower(static_cast<unsigned char>(letter)));
            if (!seen.insert(key).second) complain("two of the name " + *name);
        }
    }

    /// The entries of the qualifier with that name; none without it.
    std::optional<std::size_t> entriesOf(const char* qualifier) const {
        for (const Element& child : element_.children) {
            const std::string* const name = child.attribute("NAME");
            if (child.name == "QUALIFIER" && name != nullptr && *name == qualifier)
                return child.children.empty() ? 0 : child.children.front().children.size();
        }
        return std::nullopt;
    }

    void checkValueMap() {
        const auto numbers = entriesOf("ValueMap");
        const auto names = entriesOf("Values");
        if (numbers && names && *numbers != *names)
            complain("ValueMap and Values are of different lengths");
    }

    /// An instance is of the class that its path tells.
    void checkClassOfPath() {
        if (element_.children.size() != 2 || element_.children[1].name != "INSTANCE") return;
        const Element* path = &element_.children[0];
        if (path->name == "INSTANCEPATH" && path->children.size() == 2) path = &path->children[1];
        const std::string* const told = path->attribute("CLASSNAME");
        const std::string* const own = element_.children[1].attribute("CLASSNAME");
        if (told != nullptr && own != nullptr && *told != *own)
            complain("an instance of " + *own + " has a path of " + *told);
    }

    void checkValues() {
        if (element_.name == "KEYVALUE") {
            const std::string* const valueType = element_.attribute("VALUETYPE");
            const bool known =
                valueType != nullptr && fitsAttribute(element_.name, "VALUETYPE", *valueType);
            if (known && !isKeyText(*valueType, element_.text))
                complain("'" + element_.text + "' is not " + *valueType);
            return;
        }
        const std::string* type = element_.attribute("TYPE");
        if (type == nullptr) type = element_.attribute("PARAMTYPE");
        if (type == nullptr) return;
        for (const Element& child : element_.children) {
            if (child.name == "VALUE") checkValue(child, *type);
            if (child.name == "VALUE.ARRAY")
                for (const Element& each : child.children) checkValue(each, *type);
            if (child.name == "VALUE.REFERENCE" && *type != "reference" &&
                element_.attribute("PARAMTYPE") != nullptr)
                complain("a reference is not " + *type);
        }
    }

    void checkValue(const Element& value, const std::string& type) {
        if (type == "reference") return complain("a VALUE is no reference");
        if (isType(type) && !isValueText(type, value.text))
            complain("'" + value.text + "' is not " + type);
        if (const std::string* const embedded = element_.attribute("EmbeddedObject")) {
            if (type != "string") complain("an embedded object is a string, not " + type);
            checkEmbedded(value.text, *embedded);
        }
    }

    /// The text is a document of its own.
    void checkEmbedded(const std::string& text, const std::string& kind) {
        const std::optional<Element> object = readTree(text, complaints_);
        if (!object) return complain("an embedded object that is no XML");
        const bool fits =
            object->name == "INSTANCE" || (object->name == "CLASS" && kind == "object");
        if (!fits) return complain(object->name + " is no embedded " + kind);
        checkElement(*object, place_ + "/VALUE", complaints_);
    }

    const Element& element_;
    const std::string& place_;
    Complaints& complaints_;
};

}  // namespace

bool fitsContent(const Element& element, std::string_view model) {
    std::size_t start = 0;
    while (true) {
        const std::size_t end = model.find(" / ", start);
        if (fitsSequence(element, model.substr(start, end - start))) return true;
        if (end == std::string_view::npos) return false;
        start = end + 3;
    }
}

void checkElement(const Element& element, const std::string& place, Complaints& complaints) {
    const std::string here = place.empty() ? element.name : place + "/" + element.name;
    const ElementRow* const row = rowOf(element.name);
    if (row == nullptr) {
        complaints.push_back(here + ": unknown element");
        return;
    }
    ElementCheck(element, here, complaints).run(*row);
    for (const Element& child : element.children) checkElement(child, here, complaints);
}

}  // namespace cmpihost::server::validator
