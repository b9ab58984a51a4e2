#include "host/cli/CommandLine.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <map>

#include "host/cli/TerminalText.h"

namespace cmpihost {

namespace {

enum class Takes { Nothing, Properties, Assignments };
enum class Filters { None, References, Associators };

struct OperationWord {
    const char* word;
    Operation operation;
    const char* description;
    const char* pathDescription;
    Takes takes;
    Filters filters;
};

constexpr const char* classPath = "Path of the class: [NAMESPACE:]CLASS";
constexpr const char* instancePath = "Path of the instance: [NAMESPACE:]CLASS.KEY=VALUE,...";
constexpr const char* sourcePath = "Path of the instance to start from";

constexpr OperationWord words[] = {
    {"ei", Operation::EnumerateInstances, "Enumerate the instances of a class", classPath,
     Takes::Properties, Filters::None},
    {"ein", Operation::EnumerateInstanceNames, "Enumerate the names of the instances of a class",
     classPath, Takes::Nothing, Filters::None},
    {"gi", Operation::GetInstance, "Get one instance", instancePath, Takes::Properties,
     Filters::None},
    {"ci", Operation::CreateInstance, "Create an instance", classPath, Takes::Assignments,
     Filters::None},
    {"mi", Operation::ModifyInstance, "Modify an instance", instancePath, Takes::Assignments,
     Filters::None},
    {"di", Operation::DeleteInstance, "Delete an instance", instancePath, Takes::Nothing,
     Filters::None},
    {"ai", Operation::Associators, "Get the instances that are associated with an instance",
     sourcePath, Takes::Properties, Filters::Associators},
    {"ain", Operation::AssociatorNames, "Get the names of the associated instances", sourcePath,
     Takes::Nothing, Filters::Associators},
    {"ri", Operation::References, "Get the association instances that refer to an instance",
     sourcePath, Takes::Properties, Filters::References},
    {"rin", Operation::ReferenceNames, "Get the names of those association instances", sourcePath,
     Takes::Nothing, Filters::References},
};

constexpr const char* description =
    "Embedded CIM host: loads a CMPI provider library as an object manager does, runs one\n"
    "operation on it and prints what it returns. It loads the facade, which asks the provider\n"
    "and has the manners that WBEM clients expect.";

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

std::string withoutBlanksAround(const std::string& text) {
    constexpr const char* blanks = " \t\r\n";
    const std::size_t start = text.find_first_not_of(blanks);
    return start == std::string::npos
               ? std::string()
               : text.substr(start, text.find_last_not_of(blanks) - start + 1);
}

/// The names between commas; an empty text holds none.
void addNames(const std::string& list, std::vector<std::string>& to) {
    std::size_t start = 0;
    while (start < list.size()) {
        const std::size_t comma = std::min(list.find(',', start), list.size());
        const std::string name = withoutBlanksAround(list.substr(start, comma - start));
        if (!name.empty()) {
            to.push_back(name);
        }
        start = comma + 1;
    }
}

Format formatNamed(const std::string& word) {
    const std::map<std::string, Format> formats = {
        {"table", Format::Table}, {"mof", Format::Mof}, {"json", Format::Json}};
    const auto found = formats.find(word);
    if (found == formats.end()) {
        throw CLI::ValidationError("--format", "expected table, mof or json, found '" + word + "'");
    }
    return found->second;
}

CLI::Validator notEmpty() {
    return {[](const std::string& value) {
                return value.empty() ? std::string("the value is empty") : std::string();
            },
            {}};
}

/// The arguments behind the program's name, last one first. An empty value that stands behind a
/// sign of equality becomes an argument of its own: the parser would take the next argument for it.
std::vector<std::string> separated(int argumentCount, const char* const* arguments) {
    std::vector<std::string> result;
    bool options = true;
    for (int index = 1; index < argumentCount; ++index) {
        std::string argument = arguments[index];
        options = options && argument != "--";
        const bool emptyValue = options && argument.compare(0, 2, "--") == 0 &&
                                argument.find('=') == argument.size() - 1;
        if (emptyValue) {
            argument.pop_back();
        }
        result.push_back(std::move(argument));
        if (emptyValue) {
            result.emplace_back();
        }
    }
    std::reverse(result.begin(), result.end());
    return result;
}

/// The command line as CLI11 fills it, and the description of it all.
class Parser {
  public:
    Parser() : app_(description, "cmpihost") {
        app_.set_version_flag("--version", "cmpihost " KORVA_VERSION, "Print the version");
        app_.set_help_flag("-h,--help", "Print this help");
        app_.footer(std::string(pathHelp) + statusHelp);
        app_.require_subcommand(1);
        app_.get_formatter()->column_width(34);
        app_.get_formatter()->label("SUBCOMMAND", "OPERATION ARGUMENT...");
        addHostOptions();
        for (const OperationWord& word : words) {
            addOperation(word);
        }
        addQuery();
        addTree();
    }

    ParsedCommandLine parse(int argumentCount, const char* const* arguments) {
        try {
            app_.parse(separated(argumentCount, arguments));
        } catch (const CLI::CallForVersion& version) {
            return {std::nullopt, std::string(version.what()) + "\n", exitDone};
        } catch (const CLI::CallForHelp&) {
            return {std::nullopt, help(), exitDone};
        } catch (const CLI::ParseError& error) {
            return refused(app_.get_subcommands().empty() ? withoutOperation(error) : error.what());
        }
        if (result_.tree && result_.format != Format::Table) {
            return refused("--format: tree draws a picture, it has no other form");
        }
        collectProperties();
        return {result_, {}, exitDone};
    }

  private:
    static ParsedCommandLine refused(const std::string& complaint) {
        return {std::nullopt,
                "cmpihost: " + terminalText(complaint) +
                    "\nRun cmpihost --help for more information.\n",
                exitUsage};
    }
    std::string withoutOperation(const CLI::ParseError& error) const;
    void addHostOptions();
    CLI::App* addWord(const char* word, const char* purpose, Operation operation);
    void addOperation(const OperationWord& word);
    void addFilters(CLI::App& operation, Filters filters);
    void addQuery();
    void addTree();
    void collectProperties();
    std::string help();

    CLI::App app_;
    CommandLine result_;
    std::vector<std::string> propertyArguments_;
    std::optional<std::string> propertyOption_;
};

/// The complaint about arguments among which there is no operation.
std::string Parser::withoutOperation(const CLI::ParseError& error) const {
    if (dynamic_cast<const CLI::RequiredError*>(&error) == nullptr) {
        return error.what();
    }
    const std::vector<std::string> unknown = app_.remaining();
    return unknown.empty() ? "An operation is required"
                           : "There is no operation '" + unknown.front() + "'";
}

void Parser::addHostOptions() {
    CLI::Option* provider =
        app_.add_option("--provider", result_.provider,
                        "Library of the provider; without it the facade beside this program,\n"
                        "which asks the provider")
            ->type_name("FILE")
            ->check(notEmpty());
    app_.add_flag("--bare", result_.bare,
                  "Ask the provider itself, and complete no path that lacks keys")
        ->excludes(provider);
    app_.add_option_function<std::string>(
            "--format", [this](const std::string& word) { result_.format = formatNamed(word); },
            "How results are printed: table (the default), mof or json;\n"
            "not for tree")
        ->type_name("FORMAT");
    app_.add_flag("--log", result_.log, "Show the records of the provider on the standard error");
    app_.add_option("--schema", result_.schema,
                    "Folder of the MOF files; without it the one beside this program")
        ->type_name("DIR")
        ->check(notEmpty());
    CLI::Option* companion =
        app_.add_option("--companion", result_.companion,
                        "Library that serves the computer system; without it the one beside this\n"
                        "program, else this program itself")
            ->type_name("FILE")
            ->check(notEmpty());
    app_.add_option("--computer-systems", result_.computerSystems,
                    "Answer for so many computer systems without that library, 0 to 1000, to see\n"
                    "what then happens")
        ->check(CLI::Range(0, 1000))
        ->excludes(companion)
        ->type_name("N");
}

CLI::App* Parser::addWord(const char* word, const char* purpose, Operation operation) {
    CLI::App* added = app_.add_subcommand(word, purpose);
    added->fallthrough();
    added->group("Operations");
    added->footer(pathHelp);
    added->callback([this, operation] { result_.operation = operation; });
    return added;
}

void Parser::addOperation(const OperationWord& word) {
    CLI::App* operation = addWord(word.word, word.description, word.operation);
    operation->add_option("PATH", result_.path, word.pathDescription)->required()->type_name("");
    if (word.takes == Takes::Properties) {
        operation
            ->add_option("PROPERTY", propertyArguments_, "Print these properties and the keys only")
            ->type_name("");
        operation
            ->add_option("--properties", propertyOption_,
                         "The same as a list with commas; an empty list prints the keys only")
            ->type_name("LIST");
    } else if (word.takes == Takes::Assignments) {
        operation
            ->add_option("NAME=VALUE", result_.assignments,
                         "Values of properties; a list stands in braces: NAME={1, 2}")
            ->type_name("");
    }
    addFilters(*operation, word.filters);
}

void Parser::addFilters(CLI::App& operation, Filters filters) {
    if (filters == Filters::None) {
        return;
    }
    if (filters == Filters::Associators) {
        operation.add_option("--assoc-class", result_.assocClass, "Class of the association")
            ->type_name("CLASS")
            ->check(notEmpty());
    }
    operation
        .add_option(
            "--result-class", result_.resultClass,
            filters == Filters::Associators ? "Class of the far end" : "Class of the association")
        ->type_name("CLASS")
        ->check(notEmpty());
    operation.add_option("--role", result_.role, "Reference that points to the source")
        ->type_name("NAME")
        ->check(notEmpty());
    if (filters == Filters::Associators) {
        operation
            .add_option("--result-role", result_.resultRole, "Reference that points to the far end")
            ->type_name("NAME")
            ->check(notEmpty());
    }
}

void Parser::addQuery() {
    CLI::App* query = addWord("xq", "Execute a query", Operation::ExecQuery);
    query->add_option("QUERY", result_.query, "Text of the query")
        ->required()
        ->check(notEmpty())
        ->type_name("");
    query->add_option("--lang", result_.queryLanguage, "Language of the query")
        ->type_name("NAME")
        ->check(notEmpty())
        ->capture_default_str();
    query->add_option("--namespace", result_.nameSpace, "Namespace of the query")
        ->type_name("NAME")
        ->check(notEmpty())
        ->capture_default_str();
}

void Parser::addTree() {
    CLI::App* tree =
        app_.add_subcommand("tree", "Draw the host, what is installed and running on it");
    tree->fallthrough();
    tree->group("Pictures");
    tree->callback([this] { result_.tree = true; });
    tree->add_option("--namespace", result_.nameSpace, "Namespace of the classes")
        ->type_name("NAME")
        ->check(notEmpty())
        ->capture_default_str();
}

void Parser::collectProperties() {
    if (!propertyOption_ && propertyArguments_.empty()) {
        return;
    }
    result_.properties.emplace();
    for (const std::string& argument : propertyArguments_) {
        addNames(argument, *result_.properties);
    }
    addNames(propertyOption_.value_or(std::string()), *result_.properties);
}

std::string Parser::help() {
    const std::vector<CLI::App*> chosen = app_.get_subcommands();
    return chosen.empty() ? app_.help("", CLI::AppFormatMode::All)
                          : chosen.front()->help("cmpihost");
}

}  // namespace

ParsedCommandLine parseCommandLine(int argumentCount, const char* const* arguments) {
    return Parser().parse(argumentCount, arguments);
}

}  // namespace cmpihost
