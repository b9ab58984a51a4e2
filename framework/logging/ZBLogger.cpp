// The two calls of the contract, on one logger for the whole process. It has to work before main
// and after it: other libraries write records from their own constructors and from threads that
// nobody joins.
#include "ZBLogger.h"

#include "Logger.h"

namespace ZBLog {

namespace {

HostEnvironment hostEnvironment;

/// The destructor is never run: threads that outlive the end of main may still call the logger.
union NoDestructor {
    constexpr NoDestructor() : logger(hostEnvironment) {}
    ~NoDestructor() {}  // NOLINT(modernize-use-equals-default): of a union, it would be deleted

    Logger logger;
} process;

/// When the library is unloaded or the process ends, all that the logger holds is given back.
struct AtUnload {
    ~AtUnload() { process.logger.close(); }
} const atUnload;

}  // namespace

Logger& processLogger() noexcept {
    return process.logger;
}

void ZBLogger::logLevelMessage(const char* function, const char* file, int line,
                               const std::string& category, int level, char*, int, int,
                               const std::string& text) {
    processLogger().write({Channel::log, function, file, line, category, level, text});
}

void ZBLogger::traceLevelMessage(const char* function, const char* file, int line,
                                 const std::string& category, int level, char*, int, int,
                                 const std::string& text) {
    processLogger().write({Channel::trace, function, file, line, category, level, text});
}

}  // namespace ZBLog
