// Descriptions are put together from what a class has and inherits, so that an override which says
// only what is new is described in full.
#include "host/cli/Describe.h"

#include <algorithm>

#include "base/Ascii.h"
#include "base/Utf8.h"
#include "host/broker/Value.h"
#include "host/cli/PathParser.h"
#include "host/cli/Suggestion.h"
#include "host/cli/ValueText.h"
#include "host/mof/MofLexer.h"
#include "host/mof/ResolvedClass.h"

namespace cmpihost {

namespace {

using Qualifiers = std::vector<ResolvedQualifier>;

std::string textOf(const Qualifiers& qualifiers, const char* name) {
    return mof::text(findQualifier(qualifiers, name));
}

bool isSet(const Qualifiers& qualifiers, const char* name) {
    return mof::isSet(findQualifier(qualifiers, name));
}

/// Whether the class or one above it has that qualifier, for those that are inherited.
bool inheritsQualifier(const Schema& schema, const mof::Class& declared, const char* name) {
    const mof::Class* level = &declared;
    while (level != nullptr && !mof::isSet(level->qualifiers, name))
        level = schema.find(level->superclass);
    return level != nullptr;
}

ClassSummary summaryOf(const Schema& schema, const mof::Class& declared) {
    ClassSummary result;
    result.name = declared.name;
    result.superclass = declared.superclass;
    result.kind = schema.isAssociation(declared.name)                 ? "association"
                  : inheritsQualifier(schema, declared, "Indication") ? "indication"
                                                                      : "class";
    result.isAbstract = mof::isSet(declared.qualifiers, "Abstract");
    return result;
}

/// A constant as MOF writes it.
struct ScalarText {
    std::string operator()(std::monostate) const { return "NULL"; }
    std::string operator()(bool value) const { return value ? "TRUE" : "FALSE"; }
    std::string operator()(double value) const {
        return mof::realLiteral(Value::fromReal(value).toText());
    }
    std::string operator()(mof::Character value) const { return mof::characterLiteral(value.code); }
    std::string operator()(const std::string& value) const { return mof::stringLiteral(value); }
    template <class Integer>
    std::string operator()(Integer value) const {
        return std::to_string(value);
    }
};

std::optional<std::string> defaultText(const mof::Initializer* value) {
    if (value == nullptr || (!value->array && value->items.front() == mof::Scalar()))
        return std::nullopt;
    if (!value->array) return std::visit(ScalarText(), value->items.front());
    std::string text;
    for (const mof::Scalar& item : value->items)
        text += (text.empty() ? "" : ", ") + std::visit(ScalarText(), item);
    return "{" + text + "}";
}

std::vector<ValueMeaning> valuesOf(const Qualifiers& qualifiers) {
    const mof::Qualifier* const map = findQualifier(qualifiers, "ValueMap");
    const std::vector<std::string> values = mof::texts(map);
    const std::vector<std::string> meanings = mof::texts(findQualifier(qualifiers, "Values"));
    std::vector<ValueMeaning> result;
    // Without a ValueMap the position of a meaning is its number.
    const std::size_t count = map == nullptr ? meanings.size() : values.size();
    for (std::size_t index = 0; index < count; ++index) {
        result.push_back({map == nullptr ? std::to_string(index) : values[index],
                          index < meanings.size() ? meanings[index] : std::string()});
    }
    return result;
}

std::optional<std::uint64_t> maxLengthOf(const Qualifiers& qualifiers) {
    const mof::Qualifier* const found = findQualifier(qualifiers, "MaxLen");
    if (found == nullptr || !found->value || found->value->items.size() != 1) return std::nullopt;
    const auto* number = std::get_if<std::uint64_t>(&found->value->items.front());
    return number == nullptr ? std::nullopt : std::optional(*number);
}

void describeFeature(const ResolvedFeature& feature, FeatureDescription& to) {
    const Qualifiers& qualifiers = feature.qualifiers;
    to.name = feature.declared->name;
    to.type = mof::nameOf(feature.declared->type);
    to.referenceClass = feature.declared->referenceClass;
    to.array = feature.declared->array;
    to.description = textOf(qualifiers, "Description");
    to.values = valuesOf(qualifiers);
    to.units = textOf(qualifiers, "Units");
    if (to.units.empty()) to.units = unitWords(textOf(qualifiers, "PUnit"));
    to.maxLength = maxLengthOf(qualifiers);
    to.defaultValue = defaultText(feature.defaultValue);
    if (const mof::Qualifier* deprecated = findQualifier(qualifiers, "Deprecated")) {
        to.deprecated.emplace();
        // The standard's way to say that nothing takes its place.
        for (std::string& instead : mof::texts(deprecated))
            if (!base::equalsIgnoreCase(instead, "No value")) to.deprecated->push_back(instead);
    }
}

/// "File.Linux|/proc/meminfo|MemTotal" for people.
std::string sourceText(const std::string& mapping) {
    constexpr std::string_view file = "File.Linux|";
    const bool isFile = mapping.compare(0, file.size(), file) == 0;
    std::string text;
    for (const char c : isFile ? mapping.substr(file.size()) : mapping)
        text += c == '|' ? std::string(": ") : std::string(1, c);
    return text;
}

PropertyDescription describeProperty(const Schema& schema, const ResolvedClass& owner,
                                     const ResolvedFeature& property) {
    PropertyDescription result;
    describeFeature(property, result);
    result.key = schema.isKey(owner.declared->name, property.declared->name);
    result.required = isSet(property.qualifiers, "Required");
    result.writable = isSet(property.qualifiers, "Write");
    result.className = owner.declared->name;
    result.origin = property.origin->name;
    const mof::Feature* const first = schema.findProperty(result.origin, result.name);
    const std::string& above = property.origin->superclass;
    if (mof::findQualifier(first->qualifiers, "Override") != nullptr &&
        schema.find(above) == nullptr) {
        result.inheritedFrom = above;
    }
    for (const std::string& mapping :
         mof::texts(findQualifier(property.qualifiers, "MappingStrings")))
        result.sources.push_back(sourceText(mapping));
    return result;
}

MethodDescription describeMethod(const ResolvedClass& owner, const ResolvedMethod& method) {
    MethodDescription result;
    describeFeature(method.result, result.result);
    result.isStatic = isSet(method.result.qualifiers, "Static");
    result.className = owner.declared->name;
    result.origin = method.result.origin->name;
    for (const ResolvedFeature& parameter : method.parameters) {
        ParameterDescription description;
        describeFeature(parameter, description);
        // What says nothing goes in, as the standard has it.
        const mof::Qualifier* const in = findQualifier(parameter.qualifiers, "In");
        description.in = in == nullptr || mof::isSet(in);
        description.out = isSet(parameter.qualifiers, "Out");
        description.required = isSet(parameter.qualifiers, "Required");
        result.parameters.push_back(std::move(description));
    }
    return result;
}

ClassDescription describeClass(const Schema& schema, const ResolvedClass& source) {
    ClassDescription result;
    result.summary = summaryOf(schema, *source.declared);
    result.description = textOf(source.qualifiers, "Description");
    result.version = textOf(source.qualifiers, "Version");
    for (const mof::Class* level = source.declared; level != nullptr && !level->superclass.empty();
         level = schema.find(level->superclass))
        result.superclasses.push_back(level->superclass);
    result.subclasses = schema.subclasses(source.declared->name);
    for (const ResolvedFeature& property : source.properties)
        result.properties.push_back(describeProperty(schema, source, property));
    std::stable_partition(result.properties.begin(), result.properties.end(),
                          [](const PropertyDescription& property) { return property.key; });
    for (const ResolvedMethod& method : source.methods)
        result.methods.push_back(describeMethod(source, method));
    return result;
}

Description describeMember(const Schema& schema, const ResolvedClass& owner,
                           const std::string& name) {
    std::vector<std::string> known;
    for (const ResolvedFeature& property : owner.properties) {
        if (base::equalsIgnoreCase(property.declared->name, name))
            return describeProperty(schema, owner, property);
        known.push_back(property.declared->name);
    }
    for (const ResolvedMethod& method : owner.methods) {
        if (base::equalsIgnoreCase(method.result.declared->name, name))
            return describeMethod(owner, method);
        known.push_back(method.result.declared->name);
    }
    throw UsageError("the class " + owner.declared->name + " has no property or method '" +
                     base::escapeForTerminal(name) + "'" + didYouMean(name, known));
}

}  // namespace

std::vector<ClassSummary> classSummaries(const Schema& schema) {
    std::vector<ClassSummary> result;
    for (const std::string& name : schema.classNames())
        result.push_back(summaryOf(schema, *schema.find(name)));
    return result;
}

Description describe(const Schema& schema, const std::string& subject) {
    const std::size_t dot = subject.find('.');
    const std::string className = subject.substr(0, dot);
    const std::optional<ResolvedClass> resolved = resolvedClass(schema, className);
    if (!resolved) {
        throw UsageError("the schema has no class '" + base::escapeForTerminal(className) + "'" +
                         didYouMean(className, schema.classNames()));
    }
    if (dot == std::string::npos) return describeClass(schema, *resolved);
    return describeMember(schema, *resolved, subject.substr(dot + 1));
}

}  // namespace cmpihost
