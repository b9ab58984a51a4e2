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

Json listJson(const std::vector<Value>& elements, const Schema& schema) {
    Json list = Json::array();
    for (const Value& element : elements) list.push_back(valueJson(element, schema));
    return list;
}

void addProperties(Json& object, const InstanceValue& instance, const Schema& schema) {
    Json properties = Json::object();
    Annotations annotations;
    const std::string& className = instance.path.className;
    for (const PropertyValue& property : instance.properties) {
        properties[property.name] = valueJson(property.value, schema);
        annotations.add(property.name, property.value, schema.valueMap(className, property.name),
                        schema.findProperty(className, property.name));
    }
    object["properties"] = std::move(properties);
    std::move(annotations).addTo(object);
}

Json embeddedJson(const InstanceValue& instance, const Schema& schema) {
    // Without a path: what is embedded has none of its own.
    Json object = {{"class", instance.path.className}};
    addProperties(object, instance, schema);
    return object;
}

Json nameJson(const Value& value, const ValueMap& meanings) {
    const std::string* const name = nameOf(value, meanings);
    return name == nullptr ? Json() : Json(*name);
}

Json timeJson(const Value& value) {
    if (categoryOf(value) != TypeCategory::DateTime) return nullptr;
    const std::string text = isoDateTime(value.text());
    return text.empty() ? Json() : Json(text);
}

/// What `one` gives for a value, or for each element of an array. Null when that is nothing at all.
template <class One>
Json eachJson(const Value& value, One one) {
    if (categoryOf(value) != TypeCategory::Array) return one(value);
    Json list = Json::array();
    bool any = false;
    for (const Value& element : value.elements()) {
        list.push_back(one(element));
        any = any || !list.back().is_null();
    }
    return any ? list : Json();
}

void addUnlessNull(Json& object, const std::string& name, Json value) {
    if (!value.is_null()) object[name] = std::move(value);
}

}  // namespace

Json valueJson(const Value& value, const Schema& schema) {
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
                      const mof::Feature* declaration) {
    addUnlessNull(names_, name,
                  eachJson(value, [&](const Value& one) { return nameJson(one, meanings); }));
    addUnlessNull(times_, name, eachJson(value, timeJson));
    const std::string units = declaration == nullptr ? "" : unitsOf(*declaration);
    if (!units.empty()) units_[name] = units;
}

void Annotations::addTo(Json& object) && {
    object["names"] = std::move(names_);
    object["times"] = std::move(times_);
    object["units"] = std::move(units_);
}

Json pathJson(const ObjectPathValue& path, const Schema& schema) {
    Json keys = Json::object();
    for (const KeyBinding& key : path.keys) keys[key.name] = valueJson(key.value, schema);
    return {{"class", path.className}, {"path", toString(path)}, {"keys", std::move(keys)}};
}

Json instanceJson(const InstanceValue& instance, const Schema& schema) {
    Json object = pathJson(instance.path, schema);
    addProperties(object, instance, schema);
    return object;
}

void writeJson(const Json& document, std::ostream& stream) {
    // A provider's text may be no UTF-8, and what is printed has to be JSON all the same.
    stream << document.dump(2, ' ', false, Json::error_handler_t::replace) << '\n';
}

}  // namespace cmpihost
