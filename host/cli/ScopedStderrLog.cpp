// The configuration is a file in memory: the logging library reads files only, and one on a disk
// would need a folder that can be written and would stay behind when the process is killed.
#include "host/cli/ScopedStderrLog.h"

#include <sys/mman.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <string>
#include <string_view>
#include <system_error>

namespace cmpihost {

namespace {

constexpr const char* logVariable = "ZBLOG_CONF";

/// The log channel alone: the trace channel carries the same records once more.
constexpr std::string_view logConfiguration =
    "log.sink = stderr\n"
    "log.level = 4000\n"
    "log.records = all\n"
    "trace.sink = off\n";

}  // namespace

ScopedStderrLog::ScopedStderrLog() : configuration_(::memfd_create("cmpihost-log", MFD_CLOEXEC)) {
    const int file = configuration_.number();
    const bool written = configuration_.isOpen() &&
                         ::write(file, logConfiguration.data(), logConfiguration.size()) ==
                             static_cast<ssize_t>(logConfiguration.size());
    const std::string name = "/proc/self/fd/" + std::to_string(file);
    if (!written || ::setenv(logVariable, name.c_str(), 1) != 0) {
        throw std::system_error(errno, std::generic_category(), "the records cannot be shown");
    }
}

ScopedStderrLog::~ScopedStderrLog() {
    ::unsetenv(logVariable);
}

}  // namespace cmpihost
