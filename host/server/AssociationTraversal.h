#ifndef HOST_SERVER_ASSOCIATION_TRAVERSAL_H
#define HOST_SERVER_ASSOCIATION_TRAVERSAL_H

#include <string>
#include <string_view>

#include "host/server/Associations.h"
#include "host/server/Operations.h"

/// From an instance over associations to others.
namespace cmpihost::server {

/// Whether it asks for the associations themselves, not for what they lead to.
constexpr bool isReferenceOperation(Operation operation) noexcept {
    return operation == Operation::References || operation == Operation::ReferenceNames;
}

/// The filters among the parameters of an association operation. Throws CimError:
/// cimInvalidParameter for a class that nobody knows or a role that is no name, cimNotSupported for
/// an association class of the standard that is not served.
AssociationFilter associationFilter(const Call& call, Operation operation);

/// The class of the source, as the schema spells it. Throws CimError with cimInvalidParameter for
/// one that nobody knows.
std::string sourceClass(const Call& call, std::string_view parameter);

/// The instances or paths that an association operation yields, each once, all of their properties
/// with them; none where the source does not exist. A failure of one provider is that of the
/// operation. Throws CimError as the functions above do, too.
OperationResult traversed(const Call& call, std::string_view sourceParameter, Operation operation);

}  // namespace cmpihost::server

#endif
