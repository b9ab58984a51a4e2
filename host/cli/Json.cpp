// JSON is for programs: the plain values keep their types and stand where a program looks for them.
// What the schema or a calendar adds stands beside them, so that nobody has to take it apart again.
#include "host/cli/Json.h"

#include <charconv>

#include "host/cli/ValueText.h"

namespace cmpihost {

namespace {

/// A real of single precision is printed with its own digits, not with those of its double.
double shownReal(const Value& value) {
    const std::string text = value.toText();
    double shown = value.real();
    std::from_chars(text.data(), text.data() + text.size(), shown);
    return shown;
}

JsonValue listJson(const std::vector<Value>& elements, const Schema& schema) {
    JsonValue list = JsonValue::array();
    for (const Value& element : elements) list.push_back(valueJson(element, schema));
    return list;
}

void addProperties(JsonValue& object, const InstanceValue& instance, const Schema& schema) {
    JsonValue properties = JsonValue::object();
    Annotations annotations;
    const std::string& className = instance.path.className;
    for (const PropertyValue& property : instance.properties) {
        properties[property.name] = valueJson(property.value, schema);
        annotations.add(property.name, property.value, schema.valueMap(className, property.name),
                        unitsOf(schema, className, property.name));
    }
    object["properties"] = std::move(properties);
    std::move(annotations).addTo(object);
}

JsonValue embeddedJson(const InstanceValue& instance, const Schema& schema) {
    // Without a path: what is embedded has none of its own.
    JsonValue object = {{"class", instance.path.className}};
    addProperties(object, instance, schema);
    return object;
}

JsonValue nameJson(const Value& value, const ValueMap& meanings) {
    const std::string* const name = nameOf(value, meanings);
    return name == nullptr ? JsonValue() : JsonValue(*name);
}

JsonValue timeJson(const Value& value) {
    if (categoryOf(value) != TypeCategory::DateTime) return nullptr;
    const std::string text = isoDateTime(value.text());
    return text.empty() ? JsonValue() : JsonValue(text);
}

/// What `one` gives for a value, or for each element of an array. Null when that is nothing at all.
template <class One>
JsonValue eachJson(const Value& value, One one) {
    if (categoryOf(value) != TypeCategory::Array) return one(value);
    JsonValue list = JsonValue::array();
    bool any = false;
    for (const Value& element : value.elements()) {
        list.push_back(one(element));
        any = any || !list.back().is_null();
    }
    return any ? list : JsonValue();
}

void addUnlessNull(JsonValue& object, const std::string& name, JsonValue value) {
    if (!value.is_null()) object[name] = std::move(value);
}

}  // namespace

JsonValue valueJson(const Value& value, const Schema& schema) {
    switch (categoryOf(value)) {
        case TypeCategory::Unsigned:
            return value.unsignedInteger();
        case TypeCategory::Signed:
            return value.signedInteger();
        case TypeCategory::Boolean:
            return value.boolean();
        case TypeCategory::Real:
            return shownReal(value);
        case TypeCategory::Character:
            return characterText(value.unsignedInteger());
        case TypeCategory::Text:
        case TypeCategory::DateTime:
            return value.text();
        case TypeCategory::Reference:
            return pathJson(value.reference(), schema);
        case TypeCategory::Instance:
            return embeddedJson(value.instance(), schema);
        case TypeCategory::Array:
            return listJson(value.elements(), schema);
        default:
            return nullptr;
    }
}

void Annotations::add(const std::string& name, const Value& value, const ValueMap& meanings,
                      const std::string& units) {
    addUnlessNull(names_, name,
                  eachJson(value, [&](const Value& one) { return nameJson(one, meanings); }));
    addUnlessNull(times_, name, eachJson(value, timeJson));
    if (!units.empty()) units_[name] = units;
}

void Annotations::addTo(JsonValue& object) && {
    object["names"] = std::move(names_);
    object["times"] = std::move(times_);
    object["units"] = std::move(units_);
}

JsonValue pathJson(const ObjectPathValue& path, const Schema& schema) {
    JsonValue keys = JsonValue::object();
    for (const KeyBinding& key : path.keys) keys[key.name] = valueJson(key.value, schema);
    return {{"class", path.className}, {"path", toString(path)}, {"keys", std::move(keys)}};
}

JsonValue instanceJson(const InstanceValue& instance, const Schema& schema) {
    JsonValue object = pathJson(instance.path, schema);
    addProperties(object, instance, schema);
    return object;
}

void writeJson(const JsonValue& document, std::ostream& stream) {
    // A provider's text may be no UTF-8, and what is printed has to be JSON all the same.
    stream << document.dump(2, ' ', false, JsonValue::error_handler_t::replace) << '\n';
}

}  // namespace cmpihost
