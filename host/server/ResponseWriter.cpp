#include "host/server/ResponseWriter.h"

namespace cmpihost::server {

void beginResponse(std::string&, const Message&) {}
void endResponse(std::string&, const Message&) {}
std::string errorResponse(const Message&, unsigned, const std::string&) {
    return {};
}

}  // namespace cmpihost::server
