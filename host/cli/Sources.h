#ifndef HOST_CLI_SOURCES_H
#define HOST_CLI_SOURCES_H

#include <filesystem>
#include <stdexcept>
#include <string>
#include <vector>

#include "host/broker/Registrations.h"
#include "host/cli/CommandLine.h"
#include "host/mof/Schema.h"

/// What a command line has the host work with: what it names, else what belongs to a program in
/// `programFolder`.
namespace cmpihost {

/// There is no library or registration to go by; what() is safe to print on a terminal.
class ProviderNotFound : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

/// The schema. Throws UsageError.
Schema loadSchema(const std::vector<std::string>& given,
                  const std::filesystem::path& programFolder);

/// The registrations; none where one library is asked for everything and none are installed. Throws
/// ProviderNotFound.
Registrations readRegistrations(const CommandLine& commandLine,
                                const std::filesystem::path& programFolder);

/// The library that is asked for everything; empty: who is registered is asked. Throws
/// ProviderNotFound.
std::string soleLibrary(const CommandLine& commandLine,
                        const std::vector<std::filesystem::path>& folders);

}  // namespace cmpihost

#endif
