#include "host/server/RequestPath.h"

namespace cmpihost::server {

RequestPath readPath(const XmlElement&) {
    return {};
}

ObjectPathValue typedPath(const RequestPath&, const ClassCatalogue&, const std::string&) {
    return {};
}

}  // namespace cmpihost::server
