// The table is for people. Whatever comes from a provider may hold control characters, so all of it
// is escaped in the last step, when it is written.
#include <algorithm>
#include <limits>

#include "base/Ascii.h"
#include "base/Utf8.h"
#include "host/cli/PathParser.h"
#include "host/cli/Printer.h"
#include "host/cli/ValueText.h"

namespace cmpihost {

namespace {

/// What the schema says about the numbers of a property.
struct Hints {
    const ValueMap& names;
    bool kilobytes = false;
};

std::string withNote(const std::string& text, const std::string& note) {
    return note.empty() ? text : text + " (" + note + ")";
}

std::string signedText(std::int64_t number, const Hints& hints) {
    const std::string* name = hints.names.find(number);
    return withNote(std::to_string(number), name == nullptr ? "" : *name);
}

std::string unsignedText(std::uint64_t number, const Hints& hints) {
    if (number <= static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max()) &&
        !hints.names.empty()) {
        return signedText(static_cast<std::int64_t>(number), hints);
    }
    // Below the next unit the number is as readable as it gets.
    const bool sized = hints.kilobytes && number >= 1024;
    return withNote(std::to_string(number), sized ? humanReadableSize(number) : "");
}

std::string scalarText(const Value& value, const Hints& hints) {
    switch (categoryOf(value)) {
        case TypeCategory::Unsigned:
            return unsignedText(value.unsignedInteger(), hints);
        case TypeCategory::Signed:
            return signedText(value.signedInteger(), hints);
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

class TablePrinter final : public Printer {
  public:
    TablePrinter(std::ostream& stream, const Schema& schema) : stream_(stream), schema_(schema) {}

    void print(const std::vector<InstanceValue>& instances) override {
        bool first = true;
        for (const InstanceValue& instance : instances) {
            stream_ << (first ? "" : "\n");
            first = false;
            print(instance);
        }
    }

    void print(const std::vector<ObjectPathValue>& paths) override {
        for (const ObjectPathValue& path : paths) {
            stream_ << base::escapeForTerminal(toString(path)) << '\n';
        }
    }

  private:
    void print(const InstanceValue& instance) {
        std::size_t width = 0;
        for (const PropertyValue& property : instance.properties) {
            width = std::max(width, base::countUtf8(base::escapeForTerminal(property.name)));
        }
        stream_ << base::escapeForTerminal(toString(instance.path)) << '\n';
        for (const PropertyValue& property : instance.properties) {
            const std::string name = base::escapeForTerminal(property.name);
            const Hints hints = hintsOf(instance.path.className, property.name);
            stream_ << "  " << name << std::string(width - base::countUtf8(name) + 2, ' ')
                    << base::escapeForTerminal(valueText(property.value, hints)) << '\n';
        }
    }

    Hints hintsOf(const std::string& className, const std::string& propertyName) const {
        const mof::Feature* property = schema_.findProperty(className, propertyName);
        const bool kilobytes =
            property != nullptr &&
            base::equalsIgnoreCase(mof::text(property->qualifiers, "Units"), "KiloBytes");
        return {schema_.valueMap(className, propertyName), kilobytes};
    }

    std::ostream& stream_;
    const Schema& schema_;
};

}  // namespace

std::unique_ptr<Printer> makeTablePrinter(std::ostream& stream, const Schema& schema) {
    return std::make_unique<TablePrinter>(stream, schema);
}

}  // namespace cmpihost
