#include "host/cli/Sources.h"

#include <exception>

#include "base/Utf8.h"
#include "host/InstallPaths.h"
#include "host/broker/Router.h"
#include "host/cli/PathParser.h"

namespace cmpihost {

namespace fs = std::filesystem;

namespace {

/// The loader looks for a bare name in its own folders only, not in the current one.
std::string loaderPath(const std::string& given) {
    std::error_code error;
    const bool bare = given.find('/') == std::string::npos;
    return bare && fs::exists(given, error) ? "./" + given : given;
}

}  // namespace

Schema loadSchema(const std::vector<std::string>& given, const fs::path& programFolder) {
    try {
        if (given.empty()) return Schema::load(schemaFolder(programFolder));
        return Schema::load(std::vector<fs::path>(given.begin(), given.end()));
    } catch (const std::runtime_error& error) {
        const char* hint = given.empty() ? " (--schema PATH names others)" : "";
        throw UsageError(base::escapeForTerminal(error.what()) + hint);
    }
}

std::string soleLibrary(const CommandLine& commandLine, const std::vector<fs::path>& folders) {
    if (!commandLine.bare)
        return commandLine.provider.empty() ? std::string() : loaderPath(commandLine.provider);
    const std::string found = findLibrary("korzbosstatusprofileprovider", folders).string();
    if (found.find('/') != std::string::npos) return found;
    std::string text;
    for (const fs::path& folder : folders) text += (text.empty() ? "" : ", ") + folder.string();
    throw ProviderNotFound(
        base::escapeForTerminal(found + " was not found; looked for in " + text) +
        " (--provider FILE names a library, without --bare)");
}

Registrations readRegistrations(const CommandLine& commandLine, const fs::path& programFolder) {
    const auto& given = commandLine.registrations;
    const fs::path shipped = registrationFolder(programFolder);
    std::error_code error;
    const bool needsNone = commandLine.bare || !commandLine.provider.empty();
    std::string places = given.empty() ? shipped.string() : std::string();
    for (const std::string& path : given) places += (places.empty() ? "" : ", ") + path;
    const ProviderNotFound none("there are no registrations in " + base::escapeForTerminal(places) +
                                " (--registration PATH names others, --provider FILE a library)");
    if (given.empty() && !fs::is_directory(shipped, error)) {
        if (!needsNone) throw none;
        return {};
    }
    Registrations found;
    try {
        found =
            Registrations::read(given.empty() ? std::vector<fs::path>{shipped}
                                              : std::vector<fs::path>(given.begin(), given.end()));
    } catch (const std::runtime_error& wrong) {
        throw ProviderNotFound(base::escapeForTerminal(wrong.what()));
    }
    if (found.all().empty() && !needsNone) throw none;
    return found;
}

}  // namespace cmpihost
