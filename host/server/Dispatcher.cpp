#include "host/server/Dispatcher.h"

#include "host/server/ResponseWriter.h"

namespace cmpihost::server {

Response answer(ObjectManager&, const Message& message, const std::optional<std::string>&) {
    return {errorResponse(message, 7, "not built yet"), 7};
}

}  // namespace cmpihost::server
