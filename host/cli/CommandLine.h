#ifndef HOST_CLI_COMMAND_LINE_H
#define HOST_CLI_COMMAND_LINE_H

#include <optional>
#include <string>
#include <vector>

#include "host/broker/Operation.h"
#include "host/cli/PathParser.h"
#include "host/cli/Printer.h"

namespace cmpihost {

/// The exit statuses of the program. exitCimStatus also says that results cannot be written,
/// exitNotLoaded that a registration cannot be read or the server not be started; exitCaught wins
/// over exitDone, exitCimStatus and exitNothingFound.
enum ExitStatus {
    exitDone = 0,
    exitCimStatus = 1,
    exitUsage = 2,
    exitNotLoaded = 3,
    exitNothingFound = 4,
    exitCaught = 5
};

/// What the user wants: the answer to an operation, to see something about host and schema, or a
/// server for others.
enum class Command { Operation, Tree, Classes, Describe, Namespaces, Serve };

/// How much of what providers record is shown: failures only, the coarser level (3000, calls with
/// their parameters), or everything.
enum class LogLevel { Failures, Calls, Everything };

/// The two channels of the logging library, and what providers log through the broker.
enum class LogChannel { Log, Trace, Cmpi };

struct LogRequest {
    LogLevel level = LogLevel::Everything;
    /// None: the log and the broker's; the trace repeats the log.
    std::optional<LogChannel> channel{};
};

/// What the user asks for, as written: no text is looked into yet.
struct CommandLine {
    /// The provider's library, asked for every class; empty: who is registered, or what `bare`
    /// says.
    std::string provider;
    /// The name that the library's factories carry; empty: the one that it exports.
    std::string miName;
    /// Registration files and folders of them; empty: the ones beside this program.
    std::vector<std::string> registrations;
    /// Ask the provider beside this program, without the facade, and leave paths as they are.
    bool bare = false;
    /// MOF files and folders of them; empty: the folder beside this program.
    std::vector<std::string> schemas;
    Format format = Format::Table;
    /// The property whose bare values are printed, in place of whole results.
    std::optional<std::string> value;
    std::optional<LogRequest> log;
    /// Tell how long loading, the request and the output took.
    bool time = false;

    Command command = Command::Operation;
    Operation operation = Operation::EnumerateInstances;
    /// The class or instance; not for ExecQuery.
    std::string path;
    /// None: all properties.
    std::optional<std::vector<std::string>> properties;
    /// Name=value, for CreateInstance, ModifyInstance and InvokeMethod.
    std::vector<std::string> assignments;
    std::string method;
    /// The class or property to describe: CLASS or CLASS.PROPERTY.
    std::string subject;

    std::optional<std::string> assocClass;
    std::optional<std::string> resultClass;
    std::optional<std::string> role;
    std::optional<std::string> resultRole;

    std::string query;
    std::string queryLanguage = "WQL";
    std::string nameSpace = defaultNamespace;

    /// For Command::Serve, which looks into nothing itself.
    std::vector<std::string> serverArguments;
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
