#ifndef HOST_CLI_RUN_H
#define HOST_CLI_RUN_H

#include <filesystem>
#include <ostream>

#include "host/cli/CommandLine.h"

namespace cmpihost {

/// Carries a command line out: loads the provider, runs the operation, writes the results to `out`
/// and everything else (failures, what the broker caught, notes) to `err`. Libraries and MOF files
/// that the command line does not name are looked for around `programFolder`.
ExitStatus run(const CommandLine& commandLine, const std::filesystem::path& programFolder,
               std::ostream& out, std::ostream& err);

}  // namespace cmpihost

#endif
