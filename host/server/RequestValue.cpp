#include "host/server/RequestValue.h"

namespace cmpihost::server {

std::optional<Value> valueFromText(const std::string&, CMPIType) {
    return std::nullopt;
}

std::optional<CMPIType> typeNamed(const std::string&) {
    return std::nullopt;
}

Value readValue(const XmlElement&, CMPIType, const ClassCatalogue&, const std::string&) {
    return {};
}

InstanceValue readInstance(const XmlElement&, const ClassCatalogue&, const std::string&) {
    return {};
}

}  // namespace cmpihost::server
