#ifndef HOST_SERVER_PATH_IDENTITY_H
#define HOST_SERVER_PATH_IDENTITY_H

#include <string>

#include "host/broker/Value.h"

namespace cmpihost::server {

/// A text that two paths have in common exactly if they name the same object: names compare without
/// case, keys in any order, a number like its text; hosts do not count. A path without a namespace,
/// and a reference without one among its keys, is in `nameSpace`. For comparing only; any thread
/// may call it.
std::string pathIdentity(const ObjectPathValue& path, const std::string& nameSpace);

}  // namespace cmpihost::server

#endif
