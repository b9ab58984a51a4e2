#include "host/server/Operations.h"

namespace cmpihost::server {

const std::vector<OperationRow>& classOperations() {
    static const std::vector<OperationRow> rows;
    return rows;
}

}  // namespace cmpihost::server
