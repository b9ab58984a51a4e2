#ifndef HOST_SERVER_SERVE_COMMAND_LINE_H
#define HOST_SERVER_SERVE_COMMAND_LINE_H

#include <optional>
#include <string>

#include "host/server/Service.h"

namespace cmpihost::server {

/// Options to serve with, or else a text to show: on the standard output when the status is
/// serviceEnded (help, version), on the standard error otherwise.
struct ParsedServeCommandLine {
    std::optional<ServiceOptions> options{};
    std::string text{};
    ServiceStatus status = serviceEnded;
};

/// Reads the arguments, program name first. Never throws because of what they say.
ParsedServeCommandLine parseServeCommandLine(int argumentCount, const char* const* arguments);

}  // namespace cmpihost::server

#endif
