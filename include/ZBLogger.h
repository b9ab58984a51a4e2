#ifndef ZBLOG_ZBLOGGER_H
#define ZBLOG_ZBLOGGER_H

#include <string>

namespace ZBLog {

/// The two channels that every record goes to: the log, for those who run the system, and the
/// trace, for those who look into it. Where each goes, and which levels and categories pass, is
/// configured outside the caller.
///
/// Both calls may come from any number of threads, never throw, and keep nothing of their
/// arguments after they return.
class __attribute__((visibility("default"))) ZBLogger {
  public:
    /// `function` and `file` (not null) and `line` tell where the record was written; `category`
    /// names the unit; a higher `level` is a finer one (3000, 4000); the three arguments after it
    /// are reserved (null, 0, 0); `text` is the record, of any length and content.
    static void logLevelMessage(const char* function, const char* file, int line,
                                const std::string& category, int level, char* reserved,
                                int reserved1, int reserved2, const std::string& text);

    static void traceLevelMessage(const char* function, const char* file, int line,
                                  const std::string& category, int level, char* reserved,
                                  int reserved1, int reserved2, const std::string& text);
};

}  // namespace ZBLog

#endif
