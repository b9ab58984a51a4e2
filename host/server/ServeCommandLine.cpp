// CLI11 reads the words and prints the help from the same table.
#include "host/server/ServeCommandLine.h"

#include <CLI/CLI.hpp>
#include <map>

#include "base/Utf8.h"

namespace cmpihost::server {

namespace {

const char* const help =
    "WBEM endpoint: answers CIM operations over HTTP with the CMPI providers that are\n"
    "registered, until SIGTERM ends it. SIGHUP reads certificate, key and users again,\n"
    "SIGUSR1 writes the counters to the log.";

const char* const footer =
    "\n"
    "Whom clients reach it from other hosts by takes TLS and a users file. On loopback\n"
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
    "  cmpihost-serve --listen 127.0.0.1:5988";

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

const ListRow listRows[] = {
    {"--listen", "ADDRESS:PORT", &ServiceOptions::listen,
     "Listen there: a numeric address, localhost, or unix:PATH; can be given again; without it "
     "localhost:5988, with TLS localhost:5989. plain: before a loopback address: without TLS "
     "there"},
    {"--registration", "PATH", &ServiceOptions::registrations,
     "File, or folder of *.reg, that says which provider serves which class; can be given again; "
     "without it the folder beside this program"},
    {"--schema", "PATH", &ServiceOptions::schemas,
     "MOF file or folder of MOF files; can be given again; without it the folder beside this "
     "program"},
    {"--host-name", "NAME", &ServiceOptions::hostNames,
     "A name by which clients may address this host, beside localhost and its own name; can be "
     "given again"},
};

const TextRow textRows[] = {
    {"--tls-cert", "FILE", &ServiceOptions::certificate, "Certificates for TLS, as PEM"},
    {"--tls-key", "FILE", &ServiceOptions::key,
     "Key of the first of them, as PEM; not readable by everybody"},
    {"--users", "FILE", &ServiceOptions::users,
     "Who may ask: lines of name:hash, as crypt(5) has them"},
};

const std::map<std::string, LogLevel> logLevels = {
    {"none", LogLevel::None}, {"failures", LogLevel::Failures}, {"requests", LogLevel::Requests}};

std::string nonEmpty(const std::string& given) {
    return given.empty() ? "the value is empty" : "";
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
    const CLI::Validator check(nonEmpty, {});
    for (const ListRow& row : listRows)
        app_.add_option(row.name, options_.*row.field, row.help)
            ->check(check)
            ->allow_extra_args(false)
            ->option_text(row.valueName);
    for (const TextRow& row : textRows)
        app_.add_option(row.name, options_.*row.field, row.help)
            ->check(check)
            ->option_text(row.valueName);
    app_.get_option("--tls-cert")->needs("--tls-key")->option_text("FILE");
    app_.get_option("--tls-key")->needs("--tls-cert")->option_text("FILE");
    addNumber("--connections", options_.limits.connections,
              "How many connections an address takes at once (64)");
    addNumber("--connections-per-address", options_.limits.connectionsOfAnAddress,
              "How many of them one client may have (16)");
    app_.add_option_function<std::string>(
            "--log", [this](const std::string& word) { options_.logLevel = logLevels.at(word); },
            "What is logged of requests: none, failures (the default) or requests")
        ->check(CLI::IsMember(logLevels))
        ->option_text("LEVEL");
}

template <class Field>
void ServeParser::addNumber(const char* name, Field& field, const char* text) {
    app_.add_option(name, field, text)->check(CLI::Range(1, 10000))->option_text("N");
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
        return refused(error.what());
    }
    return {options_, {}, serviceEnded};
}

}  // namespace

ParsedServeCommandLine parseServeCommandLine(int argumentCount, const char* const* arguments) {
    return ServeParser().parse(argumentCount, arguments);
}

}  // namespace cmpihost::server
