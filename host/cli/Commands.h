#ifndef HOST_CLI_COMMANDS_H
#define HOST_CLI_COMMANDS_H

#include <variant>
#include <vector>

#include "host/cli/CommandLine.h"

/// The commands and options of the program with their help: the one description that the parser,
/// the help, the completion scripts and the manual page agree with.
namespace cmpihost {

/// What stands behind a command beside its path.
enum class Takes { Nothing, Properties, Assignments, Method, Query, Namespace, Subject };
enum class Filters { None, References, Associators };

struct CommandRow {
    const char* name;
    const char* help;
    Command command;
    /// For Command::Operation.
    Operation operation;
    /// The help on PATH; null: it takes none.
    const char* path;
    Takes takes;
    Filters filters;
    /// Arguments that show the command at work, as one types them.
    const char* example;
};

/// The field of the command line that an option sets.
using OptionField =
    std::variant<bool CommandLine::*, std::string CommandLine::*,
                 std::optional<std::string> CommandLine::*, std::vector<std::string> CommandLine::*,
                 Format CommandLine::*, std::optional<LogRequest> CommandLine::*>;

/// An option of the program.
struct OptionRow {
    const char* name;
    /// As the help writes it behind the name; null: the option takes no value.
    const char* valueName;
    OptionField field;
    const char* help;
};

/// An option that restricts an association operation.
struct FilterRow {
    const char* name;
    const char* valueName;
    std::optional<std::string> CommandLine::*field;
    const char* helpOnAssociators;
    /// Null: references have no such filter.
    const char* helpOnReferences;
};

/// In the order of the help.
const std::vector<CommandRow>& commandRows();
const std::vector<OptionRow>& optionRows();
const std::vector<FilterRow>& filterRows();

extern const char* const programHelp;
extern const char* const pathHelp;
extern const char* const statusHelp;

}  // namespace cmpihost

#endif
