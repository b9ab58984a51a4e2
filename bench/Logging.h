// How the logging behaves while something is measured.
#ifndef BENCH_LOGGING_H
#define BENCH_LOGGING_H

#include <string>

#include "tests/support/TemporaryDirectory.h"

namespace bench {

/// The logging library follows a configuration of this program's, kept in a folder that goes with
/// the object. One at a time; made before the first record is written.
class LoggingConfiguration {
  public:
    /// What holds without any configuration.
    static constexpr const char* failuresOnly = "log.sink = syslog\nlog.records = failures\n";

    /// Nothing but failures passes, as without any configuration.
    LoggingConfiguration();

    /// Puts settings in force; returns when they are.
    void use(const std::string& settings);

    const std::string& folder() const noexcept { return folder_.path(); }

  private:
    TemporaryDirectory folder_;
};

}  // namespace bench

#endif
