#include "host/server/HttpMessage.h"

#include "base/Ascii.h"

namespace cmpihost::server {

const std::string* HttpRequest::header(std::string_view name) const {
    for (const auto& [each, value] : headers) {
        if (base::equalsIgnoreCase(each, name)) return &value;
    }
    return nullptr;
}

std::size_t HttpRequest::count(std::string_view name) const {
    std::size_t result = 0;
    for (const auto& each : headers) {
        if (base::equalsIgnoreCase(each.first, name)) ++result;
    }
    return result;
}

}  // namespace cmpihost::server
