#include "host/server/Parameters.h"

#include <algorithm>

#include "base/Ascii.h"
#include "host/server/CimError.h"
#include "host/server/RequestValue.h"

namespace cmpihost::server {

namespace {

[[noreturn]] void refuseParameter(const std::string& name, const std::string& reason) {
    throw CimError(cimInvalidParameter, name + ": " + reason);
}

bool isElement(const XmlElement& element, std::initializer_list<std::string_view> names) {
    return std::find(names.begin(), names.end(), element.name) != names.end();
}

bool isText(const XmlElement& element) {
    return element.name == "VALUE";
}

bool isValueOf(const XmlElement& element, CMPIType type) {
    return isText(element) && valueFromText(element.text, type).has_value();
}

bool isNameList(const XmlElement& element) {
    return isText(element) ||
           (element.name == "VALUE.ARRAY" &&
            std::all_of(element.children.begin(), element.children.end(), isText));
}

/// What a parameter of the kind holds, and whether an element is that.
struct KindRow {
    ParameterKind kind;
    const char* content;
    bool (*fits)(const XmlElement& element);
};

const KindRow kindRows[] = {
    {ParameterKind::Boolean, "TRUE or FALSE",
     [](const XmlElement& e) { return isValueOf(e, CMPI_boolean); }},
    {ParameterKind::Text, "a text", isText},
    {ParameterKind::Number, "a uint32",
     [](const XmlElement& e) { return isValueOf(e, CMPI_uint32); }},
    {ParameterKind::ClassName, "a CLASSNAME",
     [](const XmlElement& e) { return isElement(e, {"CLASSNAME"}); }},
    {ParameterKind::InstanceName, "an INSTANCENAME",
     [](const XmlElement& e) { return isElement(e, {"INSTANCENAME"}); }},
    {ParameterKind::ObjectName, "a CLASSNAME or an INSTANCENAME",
     [](const XmlElement& e) {
         return isElement(e, {"CLASSNAME", "INSTANCENAME"});
     }},
    {ParameterKind::PropertyList, "a VALUE.ARRAY of names", isNameList},
    {ParameterKind::AnyValue, "a value",
     [](const XmlElement& e) {
         return isElement(e, {"VALUE", "VALUE.ARRAY", "VALUE.REFERENCE", "VALUE.REFARRAY"});
     }},
    {ParameterKind::Instance, "an INSTANCE",
     [](const XmlElement& e) { return isElement(e, {"INSTANCE"}); }},
    {ParameterKind::NamedInstance, "a VALUE.NAMEDINSTANCE",
     [](const XmlElement& e) { return isElement(e, {"VALUE.NAMEDINSTANCE"}); }},
    {ParameterKind::Anything, "anything", [](const XmlElement&) { return true; }},
};

void checkKind(const ParameterRow& row, const XmlElement& value) {
    for (const KindRow& each : kindRows) {
        if (each.kind != row.kind || each.fits(value)) continue;
        refuseParameter(row.name, std::string("this parameter takes ") + each.content);
    }
}

}  // namespace

Parameters::Parameters(const std::vector<ParameterRow>& rows, const Message& message) {
    given_.reserve(rows.size());
    for (const ParameterRow& row : rows) given_.push_back({&row, nullptr, false});
    for (const MessageParameter& parameter : message.parameters) {
        const auto given = std::find_if(given_.begin(), given_.end(), [&](const Given& each) {
            return base::equalsIgnoreCase(each.row->name, parameter.name);
        });
        if (given == given_.end()) {
            refuseParameter(parameter.name, message.method + " has no such parameter");
        }
        if (given->isGiven) refuseParameter(given->row->name, "this parameter is given twice");
        given->isGiven = true;
        if (!parameter.value) continue;
        checkKind(*given->row, *parameter.value);
        given->value = &*parameter.value;
    }
    for (const Given& each : given_) {
        if (each.row->required && each.value == nullptr) {
            refuseParameter(each.row->name, message.method + " needs this parameter");
        }
    }
}

bool Parameters::flag(std::string_view name, bool byDefault) const {
    const XmlElement* const value = find(name, {ParameterKind::Boolean});
    return value == nullptr ? byDefault : base::equalsIgnoreCase(value->text, "true");
}

std::optional<std::string> Parameters::text(std::string_view name) const {
    const XmlElement* const value = find(name, {ParameterKind::Text});
    if (value == nullptr) return std::nullopt;
    return value->text;
}

std::optional<std::uint32_t> Parameters::number(std::string_view name) const {
    const XmlElement* const value = find(name, {ParameterKind::Number});
    if (value == nullptr) return std::nullopt;
    return static_cast<std::uint32_t>(valueFromText(value->text, CMPI_uint32)->unsignedInteger());
}

std::optional<std::string> Parameters::className(std::string_view name) const {
    const XmlElement* const value = find(name, {ParameterKind::ClassName});
    if (value == nullptr) return std::nullopt;
    return *value->attribute("NAME");
}

std::optional<RequestPath> Parameters::path(std::string_view name) const {
    const XmlElement* const value =
        find(name, {ParameterKind::InstanceName, ParameterKind::ObjectName});
    if (value == nullptr) return std::nullopt;
    return readPath(*value);
}

std::optional<std::vector<std::string>> Parameters::names(std::string_view name) const {
    const XmlElement* const value = find(name, {ParameterKind::PropertyList});
    if (value == nullptr) return std::nullopt;
    if (isText(*value)) return std::vector<std::string>{value->text};
    std::vector<std::string> result;
    result.reserve(value->children.size());
    for (const XmlElement& child : value->children) result.push_back(child.text);
    return result;
}

const XmlElement* Parameters::element(std::string_view name) const {
    return find(name, {ParameterKind::AnyValue, ParameterKind::Instance,
                       ParameterKind::NamedInstance, ParameterKind::Anything});
}

const XmlElement* Parameters::find(std::string_view name,
                                   std::initializer_list<ParameterKind> kinds) const {
    for (const Given& each : given_) {
        if (!base::equalsIgnoreCase(each.row->name, name)) continue;
        if (std::find(kinds.begin(), kinds.end(), each.row->kind) == kinds.end()) break;
        return each.value;
    }
    throw std::logic_error("no parameter of that kind has the name " + std::string(name));
}

}  // namespace cmpihost::server
