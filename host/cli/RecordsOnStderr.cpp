#include "host/cli/RecordsOnStderr.h"

#include <sys/mman.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <string>
#include <system_error>

namespace cmpihost {

namespace {

constexpr const char* variable = "ZBLOG_CONF";

/// The log channel alone: the trace channel carries the same records once more.
constexpr const char* configuration =
    "log.sink = stderr\n"
    "log.level = 4000\n"
    "log.records = all\n"
    "trace.sink = off\n";

}  // namespace

RecordsOnStderr::RecordsOnStderr() : descriptor_(memfd_create("cmpihost-log", MFD_CLOEXEC)) {
    const std::string text = configuration;
    const bool written = descriptor_ >= 0 && ::write(descriptor_, text.data(), text.size()) ==
                                                 static_cast<ssize_t>(text.size());
    const std::string file = "/proc/self/fd/" + std::to_string(descriptor_);
    if (!written || ::setenv(variable, file.c_str(), 1) != 0) {
        const std::system_error failure(errno, std::generic_category(),
                                        "the records cannot be shown");
        if (descriptor_ >= 0) {
            ::close(descriptor_);
        }
        throw failure;
    }
}

RecordsOnStderr::~RecordsOnStderr() {
    ::unsetenv(variable);
    ::close(descriptor_);
}

}  // namespace cmpihost
