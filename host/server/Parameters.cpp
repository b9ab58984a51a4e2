#include "host/server/Parameters.h"

#include <algorithm>
#include <array>

#include "base/Ascii.h"
#include "host/server/CimError.h"
#include "host/server/RequestValue.h"

namespace cmpihost::server {

namespace {

[[noreturn]] void refuseParameter(const std::string& name, const std::string& reason) {
    throw CimError(cimInvalidParameter, name + ": " + reason);
}

/// What a parameter of a kind holds: one of these elements, and in a VALUE a text of this type.
struct KindRow {
    ParameterKind kind;
    const char* content;
    std::array<std::string_view, 4> elements;
    CMPIType type = CMPI_string;
};

constexpr KindRow kindRows[] = {
    {ParameterKind::Boolean, "TRUE or FALSE", {"VALUE"}, CMPI_boolean},
    {ParameterKind::Text, "a text", {"VALUE"}},
    {ParameterKind::Number, "a uint32", {"VALUE"}, CMPI_uint32},
    {ParameterKind::ClassName, "a CLASSNAME", {"CLASSNAME"}},
    {ParameterKind::InstanceName, "an INSTANCENAME", {"INSTANCENAME"}},
    {ParameterKind::ObjectName, "a CLASSNAME or an INSTANCENAME", {"CLASSNAME", "INSTANCENAME"}},
    {ParameterKind::PropertyList, "a VALUE.ARRAY of names", {"VALUE.ARRAY", "VALUE"}},
    {ParameterKind::AnyValue,
     "a value",
     {"VALUE", "VALUE.ARRAY", "VALUE.REFERENCE", "VALUE.REFARRAY"}},
    {ParameterKind::Instance, "an INSTANCE", {"INSTANCE"}},
    {ParameterKind::NamedInstance, "a VALUE.NAMEDINSTANCE", {"VALUE.NAMEDINSTANCE"}},
};

bool fits(const XmlElement& element, const KindRow& row) {
    if (std::find(row.elements.begin(), row.elements.end(), element.name) == row.elements.end()) {
        return false;
    }
    return element.name != "VALUE" || valueFromText(element.text, row.type).has_value();
}

/// A kind without a row holds anything.
void checkKind(const ParameterRow& parameter, const XmlElement& value) {
    for (const KindRow& row : kindRows) {
        if (row.kind != parameter.kind || fits(value, row)) continue;
        refuseParameter(parameter.name, std::string("this parameter takes ") + row.content);
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
    if (value->name == "VALUE") return std::vector<std::string>{value->text};
    std::vector<std::string> result;
    result.reserve(value->children.size());
    // NULL among them has no text, and no property has that name.
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
