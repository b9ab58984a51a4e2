// JSON is for programs: values keep their types, and nothing of what the table adds for people
// (names of numbers, sizes, local times) is in it.
#include <charconv>
#include <nlohmann/json.hpp>

#include "host/cli/PathParser.h"
#include "host/cli/Printer.h"
#include "host/cli/ValueText.h"

namespace cmpihost {

namespace {

using Json = nlohmann::ordered_json;

/// A real of single precision is printed with its own digits, not with those of its double.
double shownReal(const Value& value) {
    const std::string text = value.toText();
    double shown = value.real();
    std::from_chars(text.data(), text.data() + text.size(), shown);
    return shown;
}

Json valueJson(const Value& value);

Json propertiesJson(const InstanceValue& instance) {
    Json properties = Json::object();
    for (const PropertyValue& property : instance.properties) {
        properties[property.name] = valueJson(property.value);
    }
    return properties;
}

Json listJson(const std::vector<Value>& elements) {
    Json list = Json::array();
    for (const Value& element : elements) list.push_back(valueJson(element));
    return list;
}

Json valueJson(const Value& value) {
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
            return toString(value.reference());
        case TypeCategory::Instance:
            // Without a path: what is embedded has none of its own.
            return {{"class", value.instance().path.className},
                    {"properties", propertiesJson(value.instance())}};
        case TypeCategory::Array:
            return listJson(value.elements());
        default:
            return nullptr;
    }
}

Json pathJson(const ObjectPathValue& path) {
    return {{"class", path.className}, {"path", toString(path)}};
}

class JsonPrinter final : public Printer {
  public:
    explicit JsonPrinter(std::ostream& stream) : stream_(stream) {}

    void print(const std::vector<InstanceValue>& instances) override {
        Json list = Json::array();
        for (const InstanceValue& instance : instances) {
            Json element = pathJson(instance.path);
            element["properties"] = propertiesJson(instance);
            list.push_back(std::move(element));
        }
        write(list);
    }

    void print(const std::vector<ObjectPathValue>& paths) override {
        Json list = Json::array();
        for (const ObjectPathValue& path : paths) list.push_back(pathJson(path));
        write(list);
    }

  private:
    void write(const Json& list) {
        // A provider's text may be no UTF-8, and what is printed has to be JSON all the same.
        stream_ << list.dump(2, ' ', false, Json::error_handler_t::replace) << '\n';
    }

    std::ostream& stream_;
};

}  // namespace

std::unique_ptr<Printer> makeJsonPrinter(std::ostream& stream) {
    return std::make_unique<JsonPrinter>(stream);
}

}  // namespace cmpihost
