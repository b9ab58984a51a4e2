#include "host/server/Operations.h"

namespace cmpihost::server {

const OperationRow* findOperation(std::string_view) {
    return nullptr;
}

}  // namespace cmpihost::server
