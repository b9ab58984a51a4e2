// CLI11 reads the words and prints the help from the same tables, so that the two cannot differ.
#include "host/cli/CommandLine.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <type_traits>

#include "base/Utf8.h"
#include "host/cli/Commands.h"
#include "host/cli/Diagnostics.h"
#include "host/cli/Suggestion.h"
#include "host/cli/Terminal.h"

namespace cmpihost {

namespace {

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

/// What a word stands for.
template <class Meaning>
struct Word {
    const char* text;
    Meaning meaning;
};

constexpr Word<Format> formats[] = {
    {"table", Format::Table}, {"mof", Format::Mof}, {"json", Format::Json}};
constexpr Word<LogLevel> logLevels[] = {
    {"failures", LogLevel::Failures}, {"3000", LogLevel::Calls}, {"4000", LogLevel::Everything}};
constexpr Word<LogChannel> logChannels[] = {
    {"log", LogChannel::Log}, {"trace", LogChannel::Trace}, {"cmpi", LogChannel::Cmpi}};

/// Throws CLI::ValidationError for a word that the table does not have.
template <class Meaning, std::size_t count>
Meaning meaningOf(const std::string& word, const Word<Meaning> (&table)[count],
                  const char* option) {
    std::string known;
    std::vector<std::string> names;
    for (std::size_t index = 0; index < count; ++index) {
        if (word == table[index].text) return table[index].meaning;
        names.emplace_back(table[index].text);
        known += std::string(index == 0 ? "" : index + 1 < count ? ", " : " or ");
        known += table[index].text;
    }
    throw CLI::ValidationError(
        option, "expected " + known + ", found '" + word + "'" + didYouMean(word, names));
}

/// LEVEL[,CHANNEL]
LogRequest parseLog(const std::string& text) {
    const std::size_t comma = text.find(',');
    LogRequest request;
    request.level = meaningOf(text.substr(0, comma), logLevels, "--log");
    if (comma != std::string::npos)
        request.channel = meaningOf(text.substr(comma + 1), logChannels, "--log");
    return request;
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
/// sign of equality becomes an argument of its own: the parser would take the next argument for it,
/// as it would for --log without a value.
std::vector<std::string> splitArguments(int argumentCount, const char* const* arguments) {
    std::vector<std::string> result;
    bool options = true;
    for (int index = 1; index < argumentCount; ++index) {
        std::string argument = arguments[index];
        options = options && argument != "--";
        const bool emptyValue = options && argument.compare(0, 2, "--") == 0 &&
                                argument.find('=') == argument.size() - 1;
        if (emptyValue) argument.pop_back();
        if (options && argument == "--log" && !emptyValue) argument = "--log=4000";
        result.push_back(std::move(argument));
        if (emptyValue) result.emplace_back();
    }
    std::reverse(result.begin(), result.end());
    return result;
}

/// Whether the operation is one that OperatingSystemProvider has.
bool isShown(Operation operation) {
    return operation == Operation::EnumerateInstances ||
           operation == Operation::EnumerateInstanceNames || operation == Operation::GetInstance ||
           isAssociationOperation(operation);
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
    try {
        app_.parse(splitArguments(argumentCount, arguments));
    } catch (const CLI::CallForVersion& version) {
        return {std::nullopt, std::string(version.what()) + "\n", exitDone};
    } catch (const CLI::CallForHelp&) {
        return {std::nullopt, help(), exitDone};
    } catch (const CLI::ParseError& error) {
        return refused(complaint(error));
    }
    // Refused, not ignored: a script that asks for one thing would take another for it.
    const bool operation = result_.command == Command::Operation;
    const bool hasMof = operation && result_.operation != Operation::InvokeMethod;
    if (!hasMof && result_.format == Format::Mof)
        return refused("--format: " + name() + " has the forms table and json");
    if (!operation && result_.value) return refused("--value: " + name() + " prints no values");
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
    const bool missing = dynamic_cast<const CLI::RequiredError*>(&error) != nullptr;
    if (!missing && dynamic_cast<const CLI::ExtrasError*>(&error) == nullptr) return error.what();
    const std::vector<std::string> unknown = app_.remaining(true);
    if (!unknown.empty()) return complaintAbout(unknown);
    return name().empty() ? "a command is required" : error.what();
}

std::string CommandLineParser::complaintAbout(const std::vector<std::string>& unknown) const {
    const auto isOption = [](const std::string& word) { return word.substr(0, 1) == "-"; };
    const auto option = std::find_if(unknown.begin(), unknown.end(), isOption);
    if (option != unknown.end()) {
        const std::string written = option->substr(0, option->find('='));
        return (name().empty() ? "there is" : name() + " has") + " no option '" + written + "'" +
               didYouMean(written, optionNames());
    }
    if (!name().empty()) return name() + " takes no argument '" + unknown.front() + "'";
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
            addParsed([&value, &row](const std::string& word) {
                value = meaningOf(word, formats, row.name);
            });
        } else if constexpr (std::is_same_v<Field, std::optional<LogRequest>>) {
            addParsed([&value](const std::string& text) { value = parseLog(text); });
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
    // Options of the program may stand behind the command, too.
    added.fallthrough();
    added.group(row.command == Command::Operation ? "Operations" : "Overviews");
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
