#include "host/server/Interop.h"

#include <utility>

namespace cmpihost::server {

Interop::Interop(std::string hostName, std::vector<std::string> nameSpaces,
                 const Statistics& statistics)
    : hostName_(std::move(hostName)),
      nameSpaces_(std::move(nameSpaces)),
      statistics_(statistics),
      catalogue_(schema_) {}

bool Interop::serves(const std::string&) const {
    return false;
}
OperationResult Interop::ask(const OperationRequest&) const {
    return {};
}

}  // namespace cmpihost::server
