// The table is for people. Whatever comes from a provider may hold control characters, so all of it
// is escaped as the terminal needs it, before it is broken into lines and written.
#include <algorithm>

#include "host/cli/PathParser.h"
#include "host/cli/Printer.h"
#include "host/cli/ValueText.h"

namespace cmpihost {

namespace {

/// What the schema says about the numbers of a property.
struct Hints {
    const ValueMap& names;
    std::optional<SizeUnit> size = std::nullopt;
};

std::string withNote(const std::string& text, const std::string& note) {
    return note.empty() ? text : text + " (" + note + ")";
}

std::string integerText(const Value& value, const Hints& hints) {
    const std::string* const name = nameOf(value, hints.names);
    if (name != nullptr) return withNote(value.toText(), *name);
    // Below the next unit the number is as readable as it gets.
    const bool sized = hints.size && categoryOf(value) == TypeCategory::Unsigned &&
                       value.unsignedInteger() >= 1024;
    return withNote(value.toText(),
                    sized ? humanReadableSize(value.unsignedInteger(), *hints.size) : "");
}

std::string scalarText(const Value& value, const Hints& hints) {
    switch (categoryOf(value)) {
        case TypeCategory::Unsigned:
        case TypeCategory::Signed:
            return integerText(value, hints);
        case TypeCategory::Boolean:
            return value.boolean() ? "TRUE" : "FALSE";
        case TypeCategory::Character:
            return characterText(value.unsignedInteger());
        case TypeCategory::DateTime:
            return withNote(value.text(), humanReadableDateTime(value.text()));
        case TypeCategory::Reference:
            return toString(value.reference());
        case TypeCategory::Text:
            return value.text().empty() ? "\"\"" : value.text();
        default:
            return value.toText();
    }
}

/// The elements of an array with commas between; those of a list of texts in quotes, for they may
/// hold commas themselves.
std::string valueText(const Value& value, const Hints& hints) {
    if (categoryOf(value) != TypeCategory::Array) return scalarText(value, hints);
    std::string result;
    for (const Value& element : value.elements()) {
        const bool bare = categoryOf(element) != TypeCategory::Text || element.text().empty();
        const std::string text = scalarText(element, hints);
        result += (result.empty() ? "" : ", ") + (bare ? text : '"' + text + '"');
    }
    return result.empty() ? "{}" : result;
}

/// Texts and lists only. A path that is broken could not be copied into a request.
bool canBreak(const Value& value) {
    const bool list = value.isArray() && value.type() != CMPI_refA;
    return list || categoryOf(value) == TypeCategory::Text;
}

class TablePrinter final : public Printer {
  public:
    TablePrinter(std::ostream& stream, const Schema& schema, const Terminal& terminal)
        : stream_(stream), schema_(schema), terminal_(terminal) {}

    void print(const std::vector<InstanceValue>& instances) override {
        bool first = true;
        for (const InstanceValue& instance : instances) {
            stream_ << (first ? "" : "\n");
            first = false;
            print(instance);
        }
    }

    void print(const std::vector<ObjectPathValue>& paths) override {
        for (const ObjectPathValue& path : paths)
            stream_ << terminal_.shown(toString(path)) << '\n';
    }

  private:
    void print(const InstanceValue& instance) {
        std::size_t longest = 0;
        for (const PropertyValue& property : instance.properties) {
            longest = std::max(longest, columnsOf(terminal_.shown(property.name)));
        }
        stream_ << terminal_.shown(toString(instance.path)) << '\n';
        for (const PropertyValue& property : instance.properties) {
            const std::string name = terminal_.shown(property.name);
            const Hints hints = hintsOf(instance.path.className, property.name);
            const std::string text = terminal_.shown(valueText(property.value, hints));
            const std::size_t width = canBreak(property.value) ? terminal_.width : 0;
            stream_ << "  " << name << std::string(longest - columnsOf(name) + 2, ' ')
                    << wrap(text, width, longest + 4) << '\n';
        }
    }

    Hints hintsOf(const std::string& className, const std::string& propertyName) const {
        return {schema_.valueMap(className, propertyName),
                sizeUnit(unitsOf(schema_, className, propertyName))};
    }

    std::ostream& stream_;
    const Schema& schema_;
    const Terminal terminal_;
};

}  // namespace

std::unique_ptr<Printer> makeTablePrinter(std::ostream& stream, const Schema& schema,
                                          const Terminal& terminal) {
    return std::make_unique<TablePrinter>(stream, schema, terminal);
}

}  // namespace cmpihost
