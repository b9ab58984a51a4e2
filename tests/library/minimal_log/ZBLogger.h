#ifndef MINIMAL_LOG_ZBLOGGER_H
#define MINIMAL_LOG_ZBLOGGER_H

#include <string>

namespace ZBLog {

/// The two channels of a logging layer that is not the framework's: they end in recording::.
class ZBLogger {
  public:
    static void logLevelMessage(const char*, const char*, int, const std::string&, int, char*, int,
                                int, const std::string&);
    static void traceLevelMessage(const char*, const char*, int, const std::string&, int, char*,
                                  int, int, const std::string&);
};

}  // namespace ZBLog

#endif
