#include <time.h>

#include <exception>
#include <iostream>

#include "host/CommandLine.h"
#include "host/Places.h"
#include "host/Run.h"

int main(int argumentCount, char** arguments) {
    using namespace cmpihost;
    // A provider finds the time zone set, as in a server that writes a log.
    tzset();
    try {
        const ParsedCommandLine parsed = parseCommandLine(argumentCount, arguments);
        if (!parsed.commandLine) {
            (parsed.status == exitDone ? std::cout : std::cerr) << parsed.text;
            return parsed.status;
        }
        return run(*parsed.commandLine, programFolder(), std::cout, std::cerr);
    } catch (const std::exception& error) {
        std::cerr << "cmpihost: " << error.what() << '\n';
        return exitUsage;
    }
}
