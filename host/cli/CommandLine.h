#ifndef HOST_CLI_COMMAND_LINE_H
#define HOST_CLI_COMMAND_LINE_H

#include <optional>
#include <string>
#include <vector>

#include "host/broker/Operation.h"
#include "host/cli/PathParser.h"
#include "host/cli/Printer.h"

namespace cmpihost {

/// The exit statuses of the program. exitCimStatus also says that results cannot be written.
enum ExitStatus { exitDone = 0, exitCimStatus = 1, exitUsage = 2, exitNotLoaded = 3 };

/// What the user asks for, as written: no text is looked into yet.
struct CommandLine {
    /// The provider's library; empty: the facade beside this program, or what `bare` says.
    std::string provider;
    /// Ask the provider beside this program, without the facade, and leave paths as they are.
    bool bare = false;
    /// The folder of the MOF files; empty: the one beside this program.
    std::string schema;
    Format format = Format::Table;
    bool log = false;
    /// The library that serves the computer system; empty: the one beside this program, if any.
    std::string companion;
    /// How many computer systems the host is to serve itself, in place of that library.
    std::optional<unsigned> computerSystems;
    /// Draw the host instead of running an operation.
    bool tree = false;

    Operation operation = Operation::EnumerateInstances;
    /// The class or instance; not for ExecQuery.
    std::string path;
    /// None: all properties.
    std::optional<std::vector<std::string>> properties;
    /// Name=value, for CreateInstance and ModifyInstance.
    std::vector<std::string> assignments;

    std::optional<std::string> assocClass;
    std::optional<std::string> resultClass;
    std::optional<std::string> role;
    std::optional<std::string> resultRole;

    std::string query;
    std::string queryLanguage = "WQL";
    std::string nameSpace = defaultNamespace;
};

/// A command line to carry out, or else a text to show: on the standard output when the status is
/// exitDone (help, version), on the standard error otherwise.
struct ParsedCommandLine {
    std::optional<CommandLine> commandLine;
    std::string text;
    ExitStatus status = exitDone;
};

/// Reads the arguments, program name first. Never throws because of what they say.
ParsedCommandLine parseCommandLine(int argumentCount, const char* const* arguments);

}  // namespace cmpihost

#endif
