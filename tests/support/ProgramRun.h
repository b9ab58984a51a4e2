#ifndef TESTS_SUPPORT_PROGRAM_RUN_H
#define TESTS_SUPPORT_PROGRAM_RUN_H

#include <string>
#include <vector>

/// What a program left behind.
struct ProgramRun {
    /// The exit status; -1 when a signal ended the program or it could not be started.
    int status = -1;
    std::string out;
    std::string err;
};

/// Runs a program to its end. `environment` holds NAME=VALUE texts that are added to this
/// process's environment.
ProgramRun runProgram(const std::string& file, const std::vector<std::string>& arguments,
                      const std::vector<std::string>& environment = {});

/// The lines of what a program wrote, without their ends.
std::vector<std::string> lines(const std::string& text);

#endif
