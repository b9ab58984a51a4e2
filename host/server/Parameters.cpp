#include "host/server/Parameters.h"

namespace cmpihost::server {

Parameters::Parameters(const std::vector<ParameterRow>&, const Message&) {}
bool Parameters::flag(std::string_view, bool byDefault) const {
    return byDefault;
}
std::optional<std::string> Parameters::text(std::string_view) const {
    return std::nullopt;
}
std::optional<std::uint32_t> Parameters::number(std::string_view) const {
    return std::nullopt;
}
std::optional<std::string> Parameters::className(std::string_view) const {
    return std::nullopt;
}
std::optional<RequestPath> Parameters::path(std::string_view) const {
    return std::nullopt;
}
std::optional<std::vector<std::string>> Parameters::names(std::string_view) const {
    return std::nullopt;
}
const XmlElement* Parameters::element(std::string_view) const {
    return nullptr;
}

}  // namespace cmpihost::server
