// Commands, their arguments and their help stand in tables; CLI11 reads the words and prints the
// help from the same description, so that the two cannot differ.
#include "host/cli/CommandLine.h"

#include <CLI/CLI.hpp>
#include <algorithm>

#include "base/Utf8.h"

namespace cmpihost {

namespace {

/// What stands behind a command beside its path.
enum class Takes { Nothing, Properties, Assignments, Query, Namespace };
enum class Filters { None, References, Associators };

struct Command {
    const char* name;
    const char* help;
    /// None draws the host.
    std::optional<Operation> operation;
    /// The help on PATH; null: it takes none.
    const char* path;
    Takes takes;
    Filters filters = Filters::None;
};

constexpr const char* classPath = "Path of the class: [NAMESPACE:]CLASS";
constexpr const char* instancePath = "Path of the instance: [NAMESPACE:]CLASS.KEY=VALUE,...";
constexpr const char* sourcePath = "Path of the instance to start from";

constexpr Command commands[] = {
    {"ei", "Enumerate the instances of a class", Operation::EnumerateInstances, classPath,
     Takes::Properties},
    {"ein", "Enumerate the names of the instances of a class", Operation::EnumerateInstanceNames,
     classPath, Takes::Nothing},
    {"gi", "Get one instance", Operation::GetInstance, instancePath, Takes::Properties},
    {"ci", "Create an instance", Operation::CreateInstance, classPath, Takes::Assignments},
    {"mi", "Modify an instance", Operation::ModifyInstance, instancePath, Takes::Assignments},
    {"di", "Delete an instance", Operation::DeleteInstance, instancePath, Takes::Nothing},
    {"ai", "Get the instances that are associated with an instance", Operation::Associators,
     sourcePath, Takes::Properties, Filters::Associators},
    {"ain", "Get the names of the associated instances", Operation::AssociatorNames, sourcePath,
     Takes::Nothing, Filters::Associators},
    {"ri", "Get the association instances that refer to an instance", Operation::References,
     sourcePath, Takes::Properties, Filters::References},
    {"rin", "Get the names of those association instances", Operation::ReferenceNames, sourcePath,
     Takes::Nothing, Filters::References},
    {"xq", "Execute a query", Operation::ExecQuery, nullptr, Takes::Query},
    {"tree", "Draw the host, what is installed and running on it", std::nullopt, nullptr,
     Takes::Namespace},
};

struct Filter {
    const char* name;
    std::optional<std::string> CommandLine::*value;
    const char* typeName;
    const char* helpOnAssociators;
    /// Null: references have no such filter.
    const char* helpOnReferences;
};

constexpr Filter filters[] = {
    {"--assoc-class", &CommandLine::assocClass, "CLASS", "Class of the association", nullptr},
    {"--result-class", &CommandLine::resultClass, "CLASS", "Class of the far end",
     "Class of the association"},
    {"--role", &CommandLine::role, "NAME", "Reference that points to the source",
     "Reference that points to the source"},
    {"--result-role", &CommandLine::resultRole, "NAME", "Reference that points to the far end",
     nullptr},
};

constexpr const char* description =
    "Embedded CIM host: loads a CMPI provider library as an object manager does, runs one\n"
    "operation on it and prints what it returns. It loads the facade, which asks the provider\n"
    "and answers as WBEM clients expect.";

constexpr const char* pathHelp =
    "Paths:\n"
    "  root/cimv2:KORVA_OperatingSystem\n"
    "  'KORVA_OperatingSystem.CSName=\"myhost\",Name=\"Debian GNU/Linux\"'\n"
    "  The namespace is root/cimv2 when a path names none. In a text key, \\\" and \\\\ stand for\n"
    "  \" and \\. Single quotes around the path keep the shell away from it.\n"
    "  The path of an instance can lack keys when only one instance has those that it gives.\n";

constexpr const char* statusHelp =
    "\n"
    "Exit status:\n"
    "  0  done\n"
    "  1  the provider answered a CIM status other than OK, named on the standard error, or the\n"
    "     results cannot be written\n"
    "  2  wrong usage, or a path that lacks keys and that none or several instances fit\n"
    "  3  the library does not load\n"
    "\n"
    "What the host catches the provider at (a null result, an undeclared property, an object used\n"
    "after its request) is told on the standard error in lines that begin with 'caught:'.";

std::string strip(const std::string& text) {
    constexpr const char* blanks = " \t\r\n";
    const std::size_t start = text.find_first_not_of(blanks);
    return start == std::string::npos
               ? std::string()
               : text.substr(start, text.find_last_not_of(blanks) - start + 1);
}

/// The names between commas; an empty text holds none.
void appendNames(const std::string& list, std::vector<std::string>& to) {
    std::size_t start = 0;
    while (start < list.size()) {
        const std::size_t comma = std::min(list.find(',', start), list.size());
        const std::string name = strip(list.substr(start, comma - start));
        if (!name.empty()) to.push_back(name);
        start = comma + 1;
    }
}

Format parseFormat(const std::string& word) {
    if (word == "table") return Format::Table;
    if (word == "mof") return Format::Mof;
    if (word == "json") return Format::Json;
    throw CLI::ValidationError("--format", "expected table, mof or json, found '" + word + "'");
}

/// An option or argument with a text that is not empty.
template <class Text>
CLI::Option* addText(CLI::App& to, const char* name, const char* typeName, Text& value,
                     const char* help) {
    const auto complaint = [](const std::string& given) {
        // Most often a variable of the shell that is not set.
        return given.empty() ? std::string("the value is empty") : std::string();
    };
    return to.add_option(name, value, help)
        ->type_name(typeName)
        ->check(CLI::Validator(complaint, {}));
}

/// The arguments behind the program's name, last one first. An empty value that stands behind a
/// sign of equality becomes an argument of its own: the parser would take the next argument for it.
std::vector<std::string> splitArguments(int argumentCount, const char* const* arguments) {
    std::vector<std::string> result;
    bool options = true;
    for (int index = 1; index < argumentCount; ++index) {
        std::string argument = arguments[index];
        options = options && argument != "--";
        const bool emptyValue = options && argument.compare(0, 2, "--") == 0 &&
                                argument.find('=') == argument.size() - 1;
        if (emptyValue) argument.pop_back();
        result.push_back(std::move(argument));
        if (emptyValue) result.emplace_back();
    }
    std::reverse(result.begin(), result.end());
    return result;
}

/// The command line as CLI11 fills it, and the description of it all.
class CommandLineParser {
  public:
    CommandLineParser();
    ParsedCommandLine parse(int argumentCount, const char* const* arguments);

  private:
    static ParsedCommandLine refused(const std::string& complaint);
    std::string withoutCommand(const CLI::ParseError& error) const;
    void addHostOptions();
    void addCommand(const Command& command);
    void addArguments(CLI::App& to, Takes takes);
    void addFilters(CLI::App& to, Filters which);
    void collectProperties();
    std::string help();

    CLI::App app_;
    CommandLine result_;
    std::vector<std::string> propertyArguments_;
    std::optional<std::string> propertyOption_;
};

CommandLineParser::CommandLineParser() : app_(description, "cmpihost") {
    app_.set_version_flag("--version", "cmpihost " KORVA_VERSION, "Print the version");
    app_.set_help_flag("-h,--help", "Print this help");
    app_.footer(std::string(pathHelp) + statusHelp);
    app_.require_subcommand(1);
    // As wide as the longest option with its type, so that every help stands on the line of its
    // option.
    app_.get_formatter()->column_width(34);
    app_.get_formatter()->label("SUBCOMMAND", "OPERATION ARGUMENT...");
    addHostOptions();
    for (const Command& command : commands) addCommand(command);
}

ParsedCommandLine CommandLineParser::parse(int argumentCount, const char* const* arguments) {
    try {
        app_.parse(splitArguments(argumentCount, arguments));
    } catch (const CLI::CallForVersion& version) {
        return {std::nullopt, std::string(version.what()) + "\n", exitDone};
    } catch (const CLI::CallForHelp&) {
        return {std::nullopt, help(), exitDone};
    } catch (const CLI::ParseError& error) {
        return refused(app_.get_subcommands().empty() ? withoutCommand(error) : error.what());
    }
    // Refused, not ignored: a script that asks for JSON would take the picture for it.
    if (result_.tree && result_.format != Format::Table)
        return refused("--format: tree draws a picture, it has no other form");
    collectProperties();
    return {result_, {}, exitDone};
}

ParsedCommandLine CommandLineParser::refused(const std::string& complaint) {
    return {std::nullopt,
            "cmpihost: " + base::escapeForTerminal(complaint) +
                "\nRun cmpihost --help for more information.\n",
            exitUsage};
}

/// The complaint about arguments among which there is no command. CLI11's own speaks of
/// subcommands, a word that the help does not know.
std::string CommandLineParser::withoutCommand(const CLI::ParseError& error) const {
    if (dynamic_cast<const CLI::RequiredError*>(&error) == nullptr) return error.what();
    const std::vector<std::string> unknown = app_.remaining();
    return unknown.empty() ? "An operation is required"
                           : "There is no operation '" + unknown.front() + "'";
}

void CommandLineParser::addHostOptions() {
    CLI::Option* provider =
        addText(app_, "--provider", "FILE", result_.provider,
                "Library of the provider; without it the facade beside this program,\n"
                "which asks the provider");
    app_.add_flag("--bare", result_.bare,
                  "Ask the provider itself, and complete no path that lacks keys")
        ->excludes(provider);
    app_.add_option_function<std::string>(
            "--format", [this](const std::string& word) { result_.format = parseFormat(word); },
            "How results are printed: table (the default), mof or json;\n"
            "not for tree")
        ->type_name("FORMAT");
    app_.add_flag("--log", result_.log, "Show the records of the provider on the standard error");
    addText(app_, "--schema", "DIR", result_.schema,
            "Folder of the MOF files; without it the one beside this program");
    CLI::Option* companion =
        addText(app_, "--companion", "FILE", result_.companion,
                "Library that serves the computer system; without it the one beside this\n"
                "program, else this program itself");
    app_.add_option("--computer-systems", result_.computerSystems,
                    "Answer for so many computer systems without that library, 0 to 1000, to see\n"
                    "what then happens")
        ->check(CLI::Range(0, 1000))
        ->excludes(companion)
        ->type_name("N");
}

void CommandLineParser::addCommand(const Command& command) {
    CLI::App& added = *app_.add_subcommand(command.name, command.help);
    // Options of the program may stand behind the operation, too.
    added.fallthrough();
    added.group(command.operation ? "Operations" : "Pictures");
    if (command.operation) added.footer(pathHelp);
    added.callback([this, operation = command.operation] {
        result_.tree = !operation;
        result_.operation = operation.value_or(result_.operation);
    });
    if (command.path != nullptr)
        added.add_option("PATH", result_.path, command.path)->required()->type_name("");
    addArguments(added, command.takes);
    addFilters(added, command.filters);
}

void CommandLineParser::addArguments(CLI::App& to, Takes takes) {
    switch (takes) {
        case Takes::Nothing:
            return;
        case Takes::Properties:
            to.add_option("PROPERTY", propertyArguments_,
                          "Print these properties and the keys only")
                ->type_name("");
            to.add_option("--properties", propertyOption_,
                          "The same as a list with commas; an empty list prints the keys only")
                ->type_name("LIST");
            return;
        case Takes::Assignments:
            to.add_option("NAME=VALUE", result_.assignments,
                          "Values of properties; a list stands in braces: NAME={1, 2}")
                ->type_name("");
            return;
        case Takes::Query:
            addText(to, "QUERY", "", result_.query, "Text of the query")->required();
            addText(to, "--lang", "NAME", result_.queryLanguage, "Language of the query")
                ->capture_default_str();
            break;
        case Takes::Namespace:
            break;
    }
    addText(to, "--namespace", "NAME", result_.nameSpace,
            takes == Takes::Query ? "Namespace of the query" : "Namespace of the classes")
        ->capture_default_str();
}

void CommandLineParser::addFilters(CLI::App& to, Filters which) {
    if (which == Filters::None) return;
    for (const Filter& filter : filters) {
        const char* help =
            which == Filters::Associators ? filter.helpOnAssociators : filter.helpOnReferences;
        if (help != nullptr) addText(to, filter.name, filter.typeName, result_.*filter.value, help);
    }
}

void CommandLineParser::collectProperties() {
    // An empty --properties is a list too, one without names; without any there is no list.
    if (!propertyOption_ && propertyArguments_.empty()) return;
    result_.properties.emplace();
    for (const std::string& argument : propertyArguments_)
        appendNames(argument, *result_.properties);
    appendNames(propertyOption_.value_or(std::string()), *result_.properties);
}

std::string CommandLineParser::help() {
    // The operations are few and alike: the help of the program shows all of them in full.
    const std::vector<CLI::App*> chosen = app_.get_subcommands();
    return chosen.empty() ? app_.help("", CLI::AppFormatMode::All)
                          : chosen.front()->help("cmpihost");
}

}  // namespace

ParsedCommandLine parseCommandLine(int argumentCount, const char* const* arguments) {
    return CommandLineParser().parse(argumentCount, arguments);
}

}  // namespace cmpihost
