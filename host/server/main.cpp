#include <malloc.h>
#include <time.h>
#include <unistd.h>

#include <cstdlib>
#include <exception>
#include <iostream>

#include "base/Utf8.h"
#include "host/InstallPaths.h"
#include "host/server/ServeCommandLine.h"

namespace {

using namespace cmpihost::server;

/// Shows the text that the command line asked for (help, version) or earned (a complaint).
ServiceStatus show(const ParsedServeCommandLine& parsed) {
    std::ostream& stream = parsed.status == serviceEnded ? std::cout : std::cerr;
    if (!(stream << parsed.text).flush()) return serviceFailed;
    return parsed.status;
}

ServiceStatus complain(ServiceStatus status, const std::string& text) {
    std::cerr << "cmpihost-serve: " << base::escapeForTerminal(text) << '\n';
    return status;
}

}  // namespace

int main(int argumentCount, char** arguments) {
    // Providers find the time zone set, as in a server that writes a log.
    tzset();
    // What a large request took goes back to the system with it.
    mallopt(M_MMAP_THRESHOLD, 65536);
    try {
        const ParsedServeCommandLine parsed = parseServeCommandLine(argumentCount, arguments);
        if (!parsed.options) return show(parsed);
        Log log(STDERR_FILENO, parsed.options->logLevel, std::getenv("JOURNAL_STREAM") != nullptr);
        const char* const invokedAs = argumentCount > 0 ? arguments[0] : "";
        return serve(*parsed.options, cmpihost::programFolder(invokedAs), log);
    } catch (const ServiceError& error) {
        return complain(error.status(), error.what());
    } catch (const std::exception& error) {
        return complain(serviceFailed, error.what());
    }
}
