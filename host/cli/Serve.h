#ifndef HOST_CLI_SERVE_H
#define HOST_CLI_SERVE_H

#include <filesystem>
#include <ostream>
#include <string>
#include <vector>

#include "host/cli/CommandLine.h"

namespace cmpihost {

/// Becomes the program cmpihost-serve of that folder, with these arguments. Returns where that does
/// not work, and says why on `err`.
ExitStatus becomeServer(const std::vector<std::string>& arguments,
                        const std::filesystem::path& programFolder, std::ostream& err);

}  // namespace cmpihost

#endif
