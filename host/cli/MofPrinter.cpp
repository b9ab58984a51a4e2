#include <algorithm>
#include <cmath>

#include "host/cli/MofText.h"
#include "host/cli/PathText.h"
#include "host/cli/Printer.h"
#include "host/cli/ReadableText.h"
#include "host/cli/ValueKind.h"

namespace cmpihost {

namespace {

/// A real constant of MOF always has a point with a digit after it.
std::string mofReal(const Value& value) {
    if (!std::isfinite(value.real())) {
        return "NULL";
    }
    std::string text = realText(value.real(), value.type());
    if (text.find('.') == std::string::npos) {
        text.insert(std::min(text.find('e'), text.size()), ".0");
    }
    return text;
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
    switch (kindOf(value)) {
        case ValueKind::Unsigned:
        case ValueKind::Signed:
            return value.toText();
        case ValueKind::Boolean:
            return value.boolean() ? "TRUE" : "FALSE";
        case ValueKind::Real:
            return mofReal(value);
        case ValueKind::Character:
            return mofCharacter(static_cast<std::uint32_t>(value.unsignedInteger()));
        case ValueKind::Text:
        case ValueKind::DateTime:
            return mofString(value.text());
        case ValueKind::Reference:
            return mofString(writePath(value.reference()));
        case ValueKind::Instance:
            return mofString(instanceText(value.instance()));
        case ValueKind::Array:
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
