#include "host/server/Operations.h"

namespace cmpihost::server {

const std::vector<OperationRow>& associationOperations() {
    static const std::vector<OperationRow> rows;
    return rows;
}

std::vector<InstanceValue> associators(const Call&, std::string_view) {
    return {};
}
std::vector<ObjectPathValue> associatorNames(const Call&, std::string_view) {
    return {};
}
std::vector<InstanceValue> references(const Call&, std::string_view) {
    return {};
}
std::vector<ObjectPathValue> referenceNames(const Call&, std::string_view) {
    return {};
}

}  // namespace cmpihost::server
