#include "host/server/Message.h"

namespace cmpihost::server {

Message readMessage(std::string_view) {
    throw MessageError(400, "request-not-valid", "not built yet");
}

}  // namespace cmpihost::server
