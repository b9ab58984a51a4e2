#include "host/server/CimOverHttp.h"

#include <utility>

namespace cmpihost::server {

CimOverHttp::CimOverHttp(ObjectManager& manager, AccessControl& access, Options options)
    : manager_(manager), access_(access), options_(std::move(options)) {}

HttpResponse CimOverHttp::answer(const HttpRequest&) {
    return {};
}

}  // namespace cmpihost::server
