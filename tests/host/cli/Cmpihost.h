#ifndef TESTS_HOST_CLI_CMPIHOST_H
#define TESTS_HOST_CLI_CMPIHOST_H

#include <sys/utsname.h>

#include "support/ProgramRun.h"

using Words = std::vector<std::string>;

/// Runs the built cmpihost, in UTC unless the environment names another zone.
inline ProgramRun cmpihost(const Words& arguments, const Words& environment = {"TZ=UTC0"}) {
    return runProgram(KORVA_CMPIHOST, arguments, environment);
}

/// The host's name, as uname tells it.
inline std::string nodeName() {
    utsname names{};
    uname(&names);
    return names.nodename;
}

#endif
