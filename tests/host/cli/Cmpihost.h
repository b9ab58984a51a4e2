#ifndef TESTS_HOST_CLI_CMPIHOST_H
#define TESTS_HOST_CLI_CMPIHOST_H

#include <sys/utsname.h>

#include "support/ProgramRun.h"

using Words = std::vector<std::string>;

/// Runs the built cmpihost, in UTC and with UTF-8 unless the environment says otherwise.
inline ProgramRun cmpihost(const Words& arguments, Words environment = {}) {
    // The first of two variables of one name counts.
    environment.insert(environment.end(), {"TZ=UTC0", "LC_ALL=C.UTF-8"});
    return runProgram(KORVA_CMPIHOST, arguments, environment);
}

/// The host's name, as uname tells it.
inline std::string nodeName() {
    utsname names{};
    uname(&names);
    return names.nodename;
}

#endif
