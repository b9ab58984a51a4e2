// Descriptions for people. A description in a schema may be pages long and have lines of its own.
#include <algorithm>
#include <variant>

#include "host/cli/Describe.h"

namespace cmpihost {

namespace {

/// "uint16[]", "CIM_ComputerSystem REF".
std::string typeText(const FeatureDescription& feature) {
    const std::string type =
        feature.referenceClass.empty() ? feature.type : feature.referenceClass + " REF";
    return type + (feature.array ? "[]" : "");
}

/// What is said of a member in a list of members.
std::string firstSentence(const std::string& text) {
    const std::size_t line = text.find('\n');
    const std::size_t sentence = text.find(". ");
    return text.substr(0, std::min(line, sentence == std::string::npos ? sentence : sentence + 1));
}

std::string listedNames(const std::vector<std::string>& names) {
    std::string text;
    for (const std::string& name : names) text += (text.empty() ? "" : ", ") + name;
    return text;
}

/// A line of a list: what it begins with, and what a description says.
struct Row {
    std::string head;
    std::string text;
};

class DescriptionPrinter {
  public:
    DescriptionPrinter(const Terminal& terminal, std::ostream& stream)
        : terminal_(terminal), stream_(stream) {}

    void operator()(const ClassDescription& described) const;
    void operator()(const PropertyDescription& described) const;
    void operator()(const MethodDescription& described) const;

  private:
    void paragraphs(const std::string& text, std::size_t indent) const;
    void heading(const std::string& name, const std::string& description) const;
    /// "  label  text"; nothing for an empty text.
    void fact(const char* label, const std::string& text) const;
    void facts(const char* label, const std::vector<std::string>& texts) const;
    void factsOf(const FeatureDescription& feature) const;
    void rows(const std::vector<Row>& rows, std::size_t indent) const;
    void values(const FeatureDescription& feature, std::size_t indent) const;

    const Terminal& terminal_;
    std::ostream& stream_;
};

constexpr std::size_t factIndent = 16;

/// From the column `indent` on, where the cursor stands.
void DescriptionPrinter::paragraphs(const std::string& text, std::size_t indent) const {
    std::size_t start = 0;
    for (std::size_t end = 0; end != std::string::npos; start = end + 1) {
        end = text.find('\n', start);
        std::string line = terminal_.shown(text.substr(start, end - start));
        line.erase(line.find_last_not_of(' ') + 1);
        const bool margin = start > 0 && !line.empty();
        stream_ << (margin ? std::string(indent, ' ') : "") << wrap(line, terminal_.width, indent)
                << '\n';
    }
}

void DescriptionPrinter::heading(const std::string& name, const std::string& description) const {
    stream_ << terminal_.shown(name) << "\n\n";
    if (description.empty()) return;
    stream_ << "  ";
    paragraphs(description, 2);
    stream_ << '\n';
}

void DescriptionPrinter::fact(const char* label, const std::string& text) const {
    if (text.empty()) return;
    const std::string start = std::string("  ") + label;
    stream_ << start << std::string(factIndent - start.size(), ' ');
    paragraphs(text, factIndent);
}

void DescriptionPrinter::facts(const char* label, const std::vector<std::string>& texts) const {
    for (const std::string& text : texts) {
        fact(label, text);
        label = "";
    }
}

void DescriptionPrinter::factsOf(const FeatureDescription& feature) const {
    fact("Units", feature.units);
    fact("MaxLen", feature.maxLength ? std::to_string(*feature.maxLength) : "");
    fact("Default", feature.defaultValue.value_or(""));
    if (feature.deprecated) {
        const std::string instead = listedNames(*feature.deprecated);
        fact("Deprecated", instead.empty() ? "yes" : "yes, in favor of " + instead);
    }
}

void DescriptionPrinter::rows(const std::vector<Row>& rows, std::size_t indent) const {
    std::size_t width = 0;
    for (const Row& row : rows) width = std::max(width, columnsOf(terminal_.shown(row.head)));
    for (const Row& row : rows) {
        const std::string head = terminal_.shown(row.head);
        stream_ << std::string(indent, ' ') << head;
        if (row.text.empty()) {
            stream_ << '\n';
            continue;
        }
        stream_ << std::string(width - columnsOf(head) + 2, ' ');
        paragraphs(row.text, indent + width + 2);
    }
}

void DescriptionPrinter::values(const FeatureDescription& feature, std::size_t indent) const {
    std::vector<Row> result;
    for (const ValueMeaning& each : feature.values) result.push_back({each.value, each.meaning});
    rows(result, indent);
}

void DescriptionPrinter::operator()(const ClassDescription& described) const {
    heading(described.summary.name, described.description);
    fact("Kind", (described.summary.isAbstract ? "abstract " : "") + described.summary.kind);
    fact("Version", described.version);
    fact("Superclasses", listedNames(described.superclasses));
    fact("Subclasses", listedNames(described.subclasses));
    std::vector<Row> members;
    std::size_t width = 0;
    for (const PropertyDescription& property : described.properties)
        width = std::max(width, columnsOf(property.name));
    for (const PropertyDescription& property : described.properties) {
        const std::string blanks(width - columnsOf(property.name) + 2, ' ');
        members.push_back(
            {(property.key ? "* " : "  ") + property.name + blanks + typeText(property),
             firstSentence(property.description)});
    }
    if (!members.empty()) stream_ << "\nProperties (* key)\n";
    rows(members, 0);
    members.clear();
    for (const MethodDescription& method : described.methods)
        members.push_back({method.result.name + "()", firstSentence(method.result.description)});
    if (!members.empty()) stream_ << "\nMethods\n";
    rows(members, 2);
}

void DescriptionPrinter::operator()(const PropertyDescription& described) const {
    heading(described.className + "." + described.name, described.description);
    fact("Type", typeText(described));
    fact("Key", described.key ? "yes" : "");
    fact("Required", described.required ? "yes" : "");
    fact("Writable", described.writable ? "yes" : "");
    factsOf(described);
    fact("Origin",
         described.inheritedFrom.empty()
             ? described.origin
             : described.inheritedFrom + " or a superclass of it, which this schema does not have");
    facts("Source", described.sources);
    if (described.values.empty()) return;
    stream_ << "\nValues\n";
    values(described, 2);
}

void DescriptionPrinter::operator()(const MethodDescription& described) const {
    heading(described.className + "." + described.result.name + "()", described.result.description);
    fact("Returns", typeText(described.result));
    fact("Static", described.isStatic ? "yes" : "");
    factsOf(described.result);
    fact("Origin", described.origin);
    if (!described.result.values.empty()) stream_ << "\nReturned values\n";
    values(described.result, 2);
    for (const ParameterDescription& parameter : described.parameters) {
        stream_ << "\nParameter " << terminal_.shown(parameter.name) << "\n";
        if (!parameter.description.empty()) {
            stream_ << "  ";
            paragraphs(parameter.description, 2);
        }
        fact("Type", typeText(parameter));
        fact("Direction", parameter.in && parameter.out ? "in and out"
                          : parameter.out               ? "out"
                                                        : "in");
        fact("Required", parameter.required ? "yes" : "");
        factsOf(parameter);
        values(parameter, 4);
    }
}

}  // namespace

void print(const Description& description, const Terminal& terminal, std::ostream& stream) {
    std::visit(DescriptionPrinter(terminal, stream), description);
}

void print(const std::vector<ClassSummary>& classes, const Terminal& terminal,
           std::ostream& stream) {
    std::size_t names = 0;
    std::size_t superclasses = 1;
    for (const ClassSummary& each : classes) {
        names = std::max(names, columnsOf(each.name));
        superclasses = std::max(superclasses, columnsOf(each.superclass));
    }
    for (const ClassSummary& each : classes) {
        const std::string superclass = each.superclass.empty() ? "-" : each.superclass;
        stream << terminal.shown(each.name) << std::string(names - columnsOf(each.name) + 2, ' ')
               << terminal.shown(superclass)
               << std::string(superclasses - columnsOf(superclass) + 2, ' ')
               << (each.isAbstract ? "abstract " : "") << each.kind << '\n';
    }
}

}  // namespace cmpihost
