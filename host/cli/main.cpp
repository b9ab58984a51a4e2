#include <time.h>

#include <exception>
#include <iostream>

#include "host/InstallPaths.h"
#include "host/cli/CommandLine.h"
#include "host/cli/Diagnostics.h"
#include "host/cli/Run.h"

namespace cmpihost {

namespace {

/// Shows the text that the command line asked for (help, version) or earned (a complaint).
ExitStatus show(const ParsedCommandLine& parsed) {
    std::ostream& stream = parsed.status == exitDone ? std::cout : std::cerr;
    if (!(stream << parsed.text).flush()) {
        std::cerr << "cmpihost: the text cannot be written\n";
        return parsed.status == exitDone ? exitCimStatus : parsed.status;
    }
    return parsed.status;
}

}  // namespace

}  // namespace cmpihost

int main(int argumentCount, char** arguments) {
    using namespace cmpihost;
    // A provider finds the time zone set, as in a server that writes a log.
    tzset();
    try {
        const ParsedCommandLine parsed = parseCommandLine(argumentCount, arguments);
        if (!parsed.commandLine) return show(parsed);
        const char* const invokedAs = argumentCount > 0 ? arguments[0] : "";
        return run(*parsed.commandLine, programFolder(invokedAs), std::cout, std::cerr);
    } catch (const std::exception& error) {
        std::cerr << messageLines(error.what());
        return exitUsage;
    }
}
