#include "ZBLogger.h"

#include "Logger.h"

namespace ZBLog {

namespace {

HostSurroundings hostSurroundings;

/// The logger's destructor is never run: threads that outlive the end of main may still call it.
union Permanent {
    constexpr Permanent() : logger(hostSurroundings) {}
    ~Permanent() {}

    Logger logger;
} permanent;

/// When the library is unloaded or the process ends, all that the logger holds is given back.
struct AtUnload {
    ~AtUnload() { permanent.logger.close(); }
} const atUnload;

}  // namespace

Logger& processLogger() noexcept {
    return permanent.logger;
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
