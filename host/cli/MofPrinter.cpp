// What is printed as MOF can be read back; what MOF has no constant for becomes NULL or a text.
#include <algorithm>
#include <cmath>

#include "host/cli/PathParser.h"
#include "host/cli/Printer.h"
#include "host/cli/ValueText.h"
#include "host/mof/MofLexer.h"

namespace cmpihost {

namespace {

std::string mofReal(const Value& value) {
    return std::isfinite(value.real()) ? mof::realLiteral(value.toText()) : "NULL";
}

std::string valueText(const Value& value);

std::string listText(const std::vector<Value>& elements) {
    std::string result = "{";
    for (const Value& element : elements) {
        result += (result.size() > 1 ? ", " : "") + valueText(element);
    }
    return result + "}";
}

std::string instanceText(const InstanceValue& instance) {
    std::string result = "instance of " + instance.path.className + " {\n";
    for (const PropertyValue& property : instance.properties) {
        result += "    " + property.name + " = " + valueText(property.value) + ";\n";
    }
    return result + "};\n";
}

std::string valueText(const Value& value) {
    switch (categoryOf(value)) {
        case TypeCategory::Unsigned:
        case TypeCategory::Signed:
            return value.toText();
        case TypeCategory::Boolean:
            return value.boolean() ? "TRUE" : "FALSE";
        case TypeCategory::Real:
            return mofReal(value);
        case TypeCategory::Character:
            return mof::characterLiteral(static_cast<char32_t>(value.unsignedInteger()));
        case TypeCategory::Text:
        case TypeCategory::DateTime:
            return mof::stringLiteral(value.text());
        case TypeCategory::Reference:
            // MOF has aliases for references, which would need the target in the same text.
            return mof::stringLiteral(toString(value.reference()));
        case TypeCategory::Instance:
            // An embedded instance is a string with its declaration, as the CIM qualifier has it.
            return mof::stringLiteral(instanceText(value.instance()));
        case TypeCategory::Array:
            return listText(value.elements());
        default:
            return "NULL";
    }
}

class MofPrinter final : public Printer {
  public:
    explicit MofPrinter(std::ostream& stream) : stream_(stream) {}

    void print(const std::vector<InstanceValue>& instances) override {
        bool first = true;
        for (const InstanceValue& instance : instances) {
            stream_ << (first ? "" : "\n") << instanceText(instance);
            first = false;
        }
    }

    /// MOF has no form for a path: an instance with its keys alone says the same.
    void print(const std::vector<ObjectPathValue>& paths) override {
        std::vector<InstanceValue> instances;
        for (const ObjectPathValue& path : paths) {
            InstanceValue instance{path, {}};
            for (const KeyBinding& key : path.keys) {
                instance.properties.push_back({key.name, key.value});
            }
            instances.push_back(std::move(instance));
        }
        print(instances);
    }

  private:
    std::ostream& stream_;
};

}  // namespace

std::unique_ptr<Printer> makeMofPrinter(std::ostream& stream) {
    return std::make_unique<MofPrinter>(stream);
}

}  // namespace cmpihost
