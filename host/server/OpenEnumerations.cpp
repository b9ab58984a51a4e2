#include "host/server/OpenEnumerations.h"

namespace cmpihost::server {}  // namespace cmpihost::server
