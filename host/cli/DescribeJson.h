#ifndef HOST_CLI_DESCRIBE_JSON_H
#define HOST_CLI_DESCRIBE_JSON_H

#include <ostream>
#include <vector>

#include "host/cli/Describe.h"

namespace cmpihost {

/// Writes a description as one JSON object. What there is none of is null, or an empty list or
/// description.
void writeJson(const Description& description, std::ostream& stream);

/// Writes the classes as one JSON array.
void writeJson(const std::vector<ClassSummary>& classes, std::ostream& stream);

}  // namespace cmpihost

#endif
