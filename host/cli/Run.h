#ifndef HOST_CLI_RUN_H
#define HOST_CLI_RUN_H

#include <filesystem>
#include <ostream>

#include "host/cli/CommandLine.h"

namespace cmpihost {

/// Carries a command line out: loads the providers, runs the operation, writes the results to `out`
/// and everything else (failures, what the broker caught, notes) to `err`. Libraries, registrations
/// and MOF files that the command line does not name are looked for around `programFolder`. Turns
/// what is wrong on the way into a complaint and its exit status; throws what else the standard
/// library does. One thread may call it at a time, for it changes the environment.
ExitStatus run(const CommandLine& commandLine, const std::filesystem::path& programFolder,
               std::ostream& out, std::ostream& err);

}  // namespace cmpihost

#endif
