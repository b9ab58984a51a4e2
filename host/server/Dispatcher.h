#ifndef HOST_SERVER_DISPATCHER_H
#define HOST_SERVER_DISPATCHER_H

#include <optional>
#include <string>

#include "host/server/Message.h"
#include "host/server/ObjectManager.h"

namespace cmpihost::server {

/// A response document, and the CIM status in it.
struct Response {
    std::string document{};
    unsigned code = 0;
};

/// Carries a message out: the response document, which tells a failure too. It throws nothing but
/// std::bad_alloc. Counts in the manager's statistics. Any threads may call it.
Response answer(ObjectManager& manager, const Message& message,
                const std::optional<std::string>& user);

}  // namespace cmpihost::server

#endif
