#include "host/server/Operations.h"

namespace cmpihost::server {

const std::vector<OperationRow>& instanceOperations() {
    static const std::vector<OperationRow> rows;
    return rows;
}

std::vector<InstanceValue> enumeratedInstances(const Call&) {
    return {};
}
std::vector<ObjectPathValue> enumeratedInstanceNames(const Call&) {
    return {};
}
InstanceValue gottenInstance(ObjectManager&, const ObjectPathValue&,
                             const std::optional<std::vector<std::string>>&) {
    return {};
}
void applyPropertyList(std::vector<InstanceValue>&, const std::optional<std::vector<std::string>>&,
                       bool) {}

}  // namespace cmpihost::server
