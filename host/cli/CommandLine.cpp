// CLI11 reads the words and prints the help from the same tables, so that the two cannot differ.
#include "host/cli/CommandLine.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <type_traits>

#include "base/Utf8.h"
#include "host/cli/ArgumentWords.h"
#include "host/cli/Commands.h"
#include "host/cli/Diagnostics.h"
#include "host/cli/Suggestion.h"
#include "host/cli/Terminal.h"

namespace cmpihost {

namespace {

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

/// Whether the operation is one that OperatingSystemProvider has.
bool isShown(Operation operation) {
    return operation == Operation::EnumerateInstances ||
           operation == Operation::EnumerateInstanceNames || operation == Operation::GetInstance ||
           isAssociationOperation(operation);
}

const char* groupOf(Command command) {
    if (command == Command::Operation) return "Operations";
    return command == Command::Serve ? "Service" : "Overviews";
}

std::string commandFooter(const CommandRow& row) {
    const std::string paths = row.path == nullptr ? "" : std::string(pathHelp) + "\n";
    const bool refused = row.command == Command::Operation && !isShown(row.operation);
    return paths + "Example" +
           (refused ? ", which OperatingSystemProvider refuses (CIM_ERR_NOT_SUPPORTED)" : "") +
           ":\n  cmpihost " + row.example +
           "\n\nThe options that cmpihost --help tells can stand here, too.";
}

/// An optional value is part of the option's word, so no blank stands before it. The help fits a
/// terminal of the usual width.
class HelpFormatter : public CLI::Formatter {
  public:
    std::string make_option_opts(const CLI::Option* option) const override {
        const std::string text = CLI::Formatter::make_option_opts(option);
        return text.compare(0, 3, " [=") == 0 ? text.substr(1) : text;
    }

    std::string make_option_desc(const CLI::Option* option) const override {
        constexpr std::size_t terminalWidth = 80;
        return wrap(CLI::Formatter::make_option_desc(option), terminalWidth - get_column_width());
    }
};

/// The command line as CLI11 fills it, and the description of it all.
class CommandLineParser {
  public:
    CommandLineParser();
    ParsedCommandLine parse(int argumentCount, const char* const* arguments);

  private:
    ParsedCommandLine refused(const std::string& complaint) const;
    std::string complaint(const CLI::ParseError& error) const;
    std::string complaintAbout(const std::vector<std::string>& unknown) const;
    std::vector<std::string> optionNames() const;
    std::string name() const;
    void addHostOptions();
    void addHostOption(const OptionRow& row);
    void addCommand(const CommandRow& row);
    void addArguments(CLI::App& to, Takes takes);
    void addFilters(CLI::App& to, Filters which);
    void collectProperties();
    std::string help();

    CLI::App app_;
    CommandLine result_;
    std::vector<std::string> propertyArguments_;
    std::optional<std::string> propertyOption_;
};

CommandLineParser::CommandLineParser() : app_(programHelp, "cmpihost") {
    app_.set_version_flag("--version", "cmpihost " KORVA_VERSION, "Print the version");
    app_.set_help_flag("-h,--help", "Print this help");
    app_.footer(std::string(pathHelp) + statusHelp);
    app_.require_subcommand(1);
    // As wide as the longest option with its type, so that every help stands on the line of its
    // option.
    app_.formatter(std::make_shared<HelpFormatter>());
    app_.get_formatter()->column_width(28);
    app_.get_formatter()->label("Positionals", "Arguments");
    app_.get_formatter()->label("SUBCOMMAND", "COMMAND ARGUMENT...");
    addHostOptions();
    for (const CommandRow& row : commandRows()) addCommand(row);
}

ParsedCommandLine CommandLineParser::parse(int argumentCount, const char* const* arguments) {
    // What stands behind it is for another program, --help included.
    if (argumentCount > 1 && arguments[1] == std::string("serve")) {
        result_.command = Command::Serve;
        result_.serverArguments.assign(arguments + 2, arguments + argumentCount);
        return {result_, {}, exitDone};
    }
    try {
        app_.parse(splitArguments(argumentCount, arguments));
    } catch (const CLI::CallForVersion& version) {
        return {std::nullopt, std::string(version.what()) + "\n", exitDone};
    } catch (const CLI::CallForHelp&) {
        return {std::nullopt, help(), exitDone};
    } catch (const CLI::ParseError& error) {
        return refused(complaint(error));
    } catch (const UsageError& error) {
        return refused(error.what());
    }
    // Refused, not ignored: a script that asks for one thing would take another for it.
    if (result_.command == Command::Serve)
        return refused("serve goes first: its options stand behind it");
    const bool operation = result_.command == Command::Operation;
    const bool hasMof = operation && result_.operation != Operation::InvokeMethod;
    if (!hasMof && result_.format == Format::Mof)
        return refused("--format: " + name() + " has the forms table and json");
    const bool modifies = operation && (result_.operation == Operation::ModifyInstance ||
                                        result_.operation == Operation::DeleteInstance);
    if ((!operation || modifies) && result_.value)
        return refused("--value: " + name() + " prints no values");
    collectProperties();
    return {result_, {}, exitDone};
}

ParsedCommandLine CommandLineParser::refused(const std::string& complaint) const {
    return {std::nullopt,
            messageLines(base::escapeForTerminal(complaint)) +
                noteLine("cmpihost " + (name().empty() ? "" : name() + " ") + "--help tells more"),
            exitUsage};
}

/// CLI11's own complaints speak of subcommands, a word that the help does not know, and suggest
/// nothing.
std::string CommandLineParser::complaint(const CLI::ParseError& error) const {
    const std::string text = error.what();
    const std::string option = text.substr(0, text.find(':'));
    if (dynamic_cast<const CLI::ArgumentMismatch*>(&error) != nullptr) {
        const bool lacksValue = text.find("missing") != std::string::npos;
        return option + (lacksValue ? ": the value is missing" : " stands more than once");
    }
    const bool missing = dynamic_cast<const CLI::RequiredError*>(&error) != nullptr;
    if (!missing && dynamic_cast<const CLI::ExtrasError*>(&error) == nullptr) return text;
    const std::vector<std::string> unknown = app_.remaining(true);
    if (!unknown.empty()) return complaintAbout(unknown);
    return name().empty() ? "a command is required" : text;
}

std::string CommandLineParser::complaintAbout(const std::vector<std::string>& unknown) const {
    const auto isOption = [](const std::string& word) { return word.substr(0, 1) == "-"; };
    const auto option = std::find_if(unknown.begin(), unknown.end(), isOption);
    if (option != unknown.end()) {
        const std::string written = option->substr(0, option->find('='));
        return (name().empty() ? "there is" : name() + " has") + " no option '" + written + "'" +
               didYouMean(written, optionNames());
    }
    if (!name().empty()) {
        const bool meansLog =
            app_.get_option("--log")->count() > 0 && beginsWithLogLevel(unknown.front());
        return name() + " takes no argument '" + unknown.front() + "'" +
               (meansLog ? "; did you mean --log=" + unknown.front() + "?" : "");
    }
    std::vector<std::string> commands;
    for (const CommandRow& row : commandRows()) commands.emplace_back(row.name);
    return "there is no command '" + unknown.front() + "'" + didYouMean(unknown.front(), commands);
}

/// Of the program and of the command, if there is one.
std::vector<std::string> CommandLineParser::optionNames() const {
    std::vector<const CLI::App*> apps = {&app_};
    for (const CLI::App* command : app_.get_subcommands()) apps.push_back(command);
    std::vector<std::string> names;
    for (const CLI::App* app : apps) {
        for (const CLI::Option* option : app->get_options())
            for (const std::string& word : option->get_lnames()) names.push_back("--" + word);
    }
    return names;
}

/// The command; empty when there is none.
std::string CommandLineParser::name() const {
    const std::vector<CLI::App*> chosen = app_.get_subcommands();
    return chosen.empty() ? std::string() : chosen.front()->get_name();
}

void CommandLineParser::addHostOptions() {
    for (const OptionRow& row : optionRows()) addHostOption(row);
    app_.get_option("--bare")->excludes("--provider")->option_text(" ");
    app_.get_option("--value")->excludes("--format")->option_text("PROPERTY");
    app_.get_option("--name")->needs("--provider")->option_text("NAME");
}

void CommandLineParser::addHostOption(const OptionRow& row) {
    const auto addParsed = [&](auto parse) {
        app_.add_option_function<std::string>(row.name, parse, row.help)
            ->option_text(row.valueName);
    };
    const auto add = [&](auto CommandLine::*field) {
        auto& value = result_.*field;
        using Field = std::decay_t<decltype(value)>;
        if constexpr (std::is_same_v<Field, bool>) {
            app_.add_flag(row.name, value, row.help);
        } else if constexpr (std::is_same_v<Field, Format>) {
            addParsed([&value](const std::string& word) { value = parseFormat(word); });
        } else if constexpr (std::is_same_v<Field, std::optional<LogRequest>>) {
            addParsed([&value](const std::string& text) { value = parseLogRequest(text); });
        } else {
            // One value for each mention, also where several mentions add up.
            addText(app_, row.name, row.valueName, value, row.help)
                ->allow_extra_args(false)
                ->option_text(row.valueName);
        }
    };
    std::visit(add, row.field);
}

void CommandLineParser::addCommand(const CommandRow& row) {
    CLI::App& added = *app_.add_subcommand(row.name, row.help);
    // Options of the program may stand behind the command, too; those of the server are another
    // program's, and parse() hands them on.
    const bool serves = row.command == Command::Serve;
    added.fallthrough(!serves)->allow_extras(serves);
    if (serves) added.set_help_flag();
    added.group(groupOf(row.command));
    added.footer(commandFooter(row));
    added.callback([this, &row] {
        result_.command = row.command;
        result_.operation = row.operation;
    });
    if (row.path != nullptr)
        added.add_option("PATH", result_.path, row.path)->required()->type_name("");
    addArguments(added, row.takes);
    addFilters(added, row.filters);
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
        case Takes::Method:
            addText(to, "METHOD", "", result_.method, "Name of the method")->required();
            to.add_option("NAME=VALUE", result_.assignments,
                          "Values of parameters; a list stands in braces: NAME={1, 2}")
                ->type_name("");
            return;
        case Takes::Subject:
            addText(to, "CLASS[.PROPERTY]", "", result_.subject, "The class, or one property of it")
                ->required();
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
    for (const FilterRow& row : filterRows()) {
        const char* help =
            which == Filters::Associators ? row.helpOnAssociators : row.helpOnReferences;
        if (help != nullptr) addText(to, row.name, row.valueName, result_.*row.field, help);
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
    const std::vector<CLI::App*> chosen = app_.get_subcommands();
    return chosen.empty() ? app_.help() : chosen.front()->help("cmpihost");
}

}  // namespace

ParsedCommandLine parseCommandLine(int argumentCount, const char* const* arguments) {
    return CommandLineParser().parse(argumentCount, arguments);
}

}  // namespace cmpihost
