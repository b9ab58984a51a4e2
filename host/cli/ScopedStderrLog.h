#ifndef HOST_CLI_SCOPED_STDERR_LOG_H
#define HOST_CLI_SCOPED_STDERR_LOG_H

#include "base/FileDescriptor.h"

namespace cmpihost {

/// Makes the provider's logging library write every record to the standard error of this process,
/// by a configuration that it finds in the environment. To be made before the library is loaded;
/// the configuration stays readable, and the variable ZBLOG_CONF set, until the object goes.
/// Not for use by several threads, as the environment is not.
class ScopedStderrLog {
  public:
    /// Throws std::system_error.
    ScopedStderrLog();
    ~ScopedStderrLog();
    ScopedStderrLog(const ScopedStderrLog&) = delete;
    ScopedStderrLog& operator=(const ScopedStderrLog&) = delete;

  private:
    base::FileDescriptor configuration_;
};

}  // namespace cmpihost

#endif
