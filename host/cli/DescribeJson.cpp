// A program asks for a member by its name, so every description of a kind has the same members.
#include "host/cli/DescribeJson.h"

#include "host/cli/Json.h"

namespace cmpihost {

namespace {

JsonValue textOrNull(const std::string& text) {
    return text.empty() ? JsonValue() : JsonValue(text);
}

template <class Value>
JsonValue valueOrNull(const std::optional<Value>& value) {
    return value ? JsonValue(*value) : JsonValue();
}

template <class Described>
JsonValue listJsonOf(const std::vector<Described>& all, JsonValue (*one)(const Described&)) {
    JsonValue list = JsonValue::array();
    for (const Described& described : all) list.push_back(one(described));
    return list;
}

JsonValue meaningJson(const ValueMeaning& meaning) {
    return {{"value", meaning.value}, {"meaning", meaning.meaning}};
}

JsonValue featureJson(const FeatureDescription& feature) {
    return {{"name", feature.name},
            {"type", feature.type},
            {"array", feature.array},
            {"referenceClass", textOrNull(feature.referenceClass)},
            {"description", feature.description},
            {"values", listJsonOf(feature.values, meaningJson)},
            {"units", textOrNull(feature.units)},
            {"maxLength", valueOrNull(feature.maxLength)},
            {"default", valueOrNull(feature.defaultValue)},
            {"deprecated", valueOrNull(feature.deprecated)}};
}

JsonValue propertyJson(const PropertyDescription& property) {
    JsonValue object = featureJson(property);
    object["class"] = property.className;
    object["origin"] = property.origin;
    object["inheritedFrom"] = textOrNull(property.inheritedFrom);
    object["key"] = property.key;
    object["required"] = property.required;
    object["writable"] = property.writable;
    object["sources"] = property.sources;
    return object;
}

JsonValue parameterJson(const ParameterDescription& parameter) {
    JsonValue object = featureJson(parameter);
    object["in"] = parameter.in;
    object["out"] = parameter.out;
    object["required"] = parameter.required;
    return object;
}

JsonValue methodJson(const MethodDescription& method) {
    JsonValue object = featureJson(method.result);
    object["class"] = method.className;
    object["origin"] = method.origin;
    object["static"] = method.isStatic;
    object["parameters"] = listJsonOf(method.parameters, parameterJson);
    return object;
}

JsonValue summaryJson(const ClassSummary& summary) {
    return {{"class", summary.name},
            {"superclass", textOrNull(summary.superclass)},
            {"kind", summary.kind},
            {"abstract", summary.isAbstract}};
}

JsonValue classJson(const ClassDescription& described) {
    JsonValue object = summaryJson(described.summary);
    object["description"] = described.description;
    object["version"] = textOrNull(described.version);
    object["superclasses"] = described.superclasses;
    object["subclasses"] = described.subclasses;
    object["properties"] = listJsonOf(described.properties, propertyJson);
    object["methods"] = listJsonOf(described.methods, methodJson);
    return object;
}

struct DescriptionJson {
    JsonValue operator()(const ClassDescription& described) const { return classJson(described); }
    JsonValue operator()(const PropertyDescription& described) const {
        return propertyJson(described);
    }
    JsonValue operator()(const MethodDescription& described) const { return methodJson(described); }
};

}  // namespace

void writeJson(const Description& description, std::ostream& stream) {
    writeJson(std::visit(DescriptionJson(), description), stream);
}

void writeJson(const std::vector<ClassSummary>& classes, std::ostream& stream) {
    writeJson(listJsonOf(classes, summaryJson), stream);
}

}  // namespace cmpihost
