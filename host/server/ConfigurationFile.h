#ifndef HOST_SERVER_CONFIGURATION_FILE_H
#define HOST_SERVER_CONFIGURATION_FILE_H

#include <string>

namespace cmpihost::server {

/// The text of a regular file of at most 1 MiB. `isSecret`: not everybody may be permitted to read
/// or write it. Throws std::runtime_error with one line that names the file.
std::string readConfigurationFile(const std::string& path, bool isSecret);

}  // namespace cmpihost::server

#endif
