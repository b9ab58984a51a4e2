// CLI11 reads the words and prints the help from the same table.
#include "host/server/ServeCommandLine.h"

#include <CLI/CLI.hpp>
#include <functional>
#include <map>

#include "base/Utf8.h"

namespace cmpihost::server {

namespace {

const char* const help =
    "WBEM endpoint: answers CIM operations over HTTP with the CMPI providers that are\n"
    "registered, until SIGTERM ends it. SIGHUP reads certificate, key and users\n"
    "again, SIGUSR1 writes the counters to the log.";

const char* const footer =
    "\n"
    "An address that other hosts reach takes TLS and a users file. On loopback\n"
    "addresses and unix: sockets nobody is asked for a password unless --users is\n"
    "given.\n"
    "\n"
    "Exit status:\n"
    "  0  a signal ended it, after the requests that ran\n"
    "  1  it cannot listen, or a request did not end in time\n"
    "  2  wrong usage, a file that cannot be used, or an address that is not safe\n"
    "  3  the registrations or the classes cannot be read\n"
    "\n"
    "Example:\n"
    "  cmpihost-serve --listen localhost:5988 --log requests";

struct TextRow {
    const char* name;
    const char* valueName;
    std::string ServiceOptions::*field;
    const char* help;
};

struct ListRow {
    const char* name;
    const char* valueName;
    std::vector<std::string> ServiceOptions::*field;
    const char* help;
};

// Lines end where they do so that the help fits a terminal of the usual width.
const ListRow listRows[] = {
    {"--listen", "ADDRESS:PORT", &ServiceOptions::listen,
     "Listen there: a numeric address, localhost, or\n"
     "unix:PATH; can be given again. plain: before a\n"
     "loopback address: without TLS there. Without it\n"
     "localhost:5988, with TLS localhost:5989"},
    {"--registration", "PATH", &ServiceOptions::registrations,
     "File, or folder of *.reg, that says which provider\n"
     "serves which class; can be given again; without it\n"
     "the folder beside this program"},
    {"--schema", "PATH", &ServiceOptions::schemas,
     "MOF file or folder of MOF files; can be given\n"
     "again; without it the folder beside this program"},
    {"--host-name", "NAME", &ServiceOptions::hostNames,
     "A name by which clients may address this host,\n"
     "beside localhost and its own name; can be given\n"
     "again"},
};

const TextRow textRows[] = {
    {"--tls-cert", "FILE", &ServiceOptions::certificate,
     "PEM file of the certificate for TLS and those that\n"
     "vouch for it"},
    {"--tls-key", "FILE", &ServiceOptions::key,
     "PEM file of its key, which not everybody may read"},
    {"--users", "FILE", &ServiceOptions::users,
     "Who may ask: lines of name:hash, hashes as\n"
     "'openssl passwd -6' prints them; a file that not\n"
     "everybody may read"},
};

const std::map<std::string, LogLevel> logLevels = {
    {"none", LogLevel::None}, {"failures", LogLevel::Failures}, {"requests", LogLevel::Requests}};

constexpr unsigned mostConnections = 10000;

CLI::Validator validator(const std::function<std::string(const std::string&)>& complaint) {
    return {complaint, {}};
}

std::string whyNoText(const std::string& given) {
    return given.empty() ? "the value is empty" : "";
}

std::string whyNoHostName(const std::string& given) {
    const bool isName = !given.empty() && given.find_first_of(":/@ ") == std::string::npos;
    return isName ? "" : "expected a name, without a port, found '" + given + "'";
}

std::string whyNoNumber(const std::string& given) {
    const bool digits = !given.empty() && given.size() <= 5 &&
                        given.find_first_not_of("0123456789") == std::string::npos;
    const bool fits = digits && std::stoul(given) >= 1 && std::stoul(given) <= mostConnections;
    return fits ? "" : "expected a number from 1 to 10000, found '" + given + "'";
}

std::string whyNoLevel(const std::string& given) {
    return logLevels.count(given) == 1
               ? ""
               : "expected none, failures or requests, found '" + given + "'";
}

/// CLI11's own complaints about words that are too many or too few are hard to understand.
std::string complaintOf(const CLI::App& app, const CLI::ParseError& error) {
    const std::string text = error.what();
    const std::vector<std::string> unknown = app.remaining();
    if (dynamic_cast<const CLI::ExtrasError*>(&error) != nullptr && !unknown.empty()) {
        const bool isOption = unknown.front().substr(0, 1) == "-";
        return std::string("there is no ") + (isOption ? "option '" : "argument '") +
               unknown.front() + "'";
    }
    if (dynamic_cast<const CLI::ArgumentMismatch*>(&error) == nullptr) return text;
    const bool lacksValue = text.find("missing") != std::string::npos;
    return text.substr(0, text.find(':')) +
           (lacksValue ? ": the value is missing" : " stands more than once");
}

class ServeParser {
  public:
    ServeParser();
    ParsedServeCommandLine parse(int argumentCount, const char* const* arguments);

  private:
    template <class Field>
    void addNumber(const char* name, Field& field, const char* text);
    static ParsedServeCommandLine refused(const std::string& complaint);

    CLI::App app_;
    ServiceOptions options_;
};

ServeParser::ServeParser() : app_(help, "cmpihost-serve") {
    app_.set_version_flag("--version", "cmpihost-serve " KORVA_VERSION, "Print the version");
    app_.set_help_flag("-h,--help", "Print this help");
    app_.footer(footer);
    app_.get_formatter()->column_width(28);
    for (const ListRow& row : listRows)
        app_.add_option(row.name, options_.*row.field, row.help)
            ->check(validator(whyNoText))
            ->allow_extra_args(false)
            ->option_text(row.valueName);
    for (const TextRow& row : textRows)
        app_.add_option(row.name, options_.*row.field, row.help)
            ->check(validator(whyNoText))
            ->option_text(row.valueName);
    app_.get_option("--host-name")->check(validator(whyNoHostName));
    app_.get_option("--tls-cert")->needs("--tls-key")->option_text("FILE");
    app_.get_option("--tls-key")->needs("--tls-cert")->option_text("FILE");
    addNumber("--connections", options_.limits.connections,
              "So many connections at each of the addresses at\n"
              "once; 64 without it");
    addNumber("--connections-per-address", options_.limits.connectionsOfAnAddress,
              "So many of them for one client address; 16 without\n"
              "it");
    app_.add_option_function<std::string>(
            "--log", [this](const std::string& word) { options_.logLevel = logLevels.at(word); },
            "Which requests are logged: none, failures (the\n"
            "default) or requests, which is all of them")
        ->check(validator(whyNoLevel))
        ->option_text("LEVEL");
}

template <class Field>
void ServeParser::addNumber(const char* name, Field& field, const char* text) {
    app_.add_option(name, field, text)->check(validator(whyNoNumber))->option_text("N");
}

ParsedServeCommandLine ServeParser::refused(const std::string& complaint) {
    return {std::nullopt,
            "cmpihost-serve: " + base::escapeForTerminal(complaint) +
                "\ncmpihost-serve: note: cmpihost-serve --help tells more\n",
            serviceRefused};
}

ParsedServeCommandLine ServeParser::parse(int argumentCount, const char* const* arguments) {
    try {
        app_.parse(argumentCount, arguments);
    } catch (const CLI::CallForVersion& version) {
        return {std::nullopt, std::string(version.what()) + "\n", serviceEnded};
    } catch (const CLI::CallForHelp&) {
        return {std::nullopt, app_.help(), serviceEnded};
    } catch (const CLI::ParseError& error) {
        return refused(complaintOf(app_, error));
    }
    return {options_, {}, serviceEnded};
}

}  // namespace

ParsedServeCommandLine parseServeCommandLine(int argumentCount, const char* const* arguments) {
    return ServeParser().parse(argumentCount, arguments);
}

}  // namespace cmpihost::server
