#ifndef HOST_CLI_PATH_COMPLETION_H
#define HOST_CLI_PATH_COMPLETION_H

#include <stdexcept>
#include <vector>

#include "host/broker/ClassCatalogue.h"
#include "host/broker/Operation.h"

namespace cmpihost {

/// No instance has the keys that a path gives; what() is safe to print on a terminal.
class NoSuchInstance : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

/// Whether a request is about one instance, to get it or to start from it, and its path does not
/// give every key that the catalogue declares for the class. Not when it gives one that is not
/// declared, as a misspelt one: that path is wrong, whatever else it lacks.
bool lacksKeys(const OperationRequest& request, const ClassCatalogue& catalogue);

/// The request for the names of all instances of the path's class.
OperationRequest namesRequest(const ObjectPathValue& path);

/// The one of `names` that has the keys which the path gives. Texts compare with case, but for
/// those of CSName and Name, and stay as the path gives them: whether that is the same is for those
/// to decide who answer. Throws, with the names that there are, NoSuchInstance when none has the
/// keys, and UsageError when several have them.
ObjectPathValue completedPath(const ObjectPathValue& path,
                              const std::vector<ObjectPathValue>& names);

}  // namespace cmpihost

#endif
