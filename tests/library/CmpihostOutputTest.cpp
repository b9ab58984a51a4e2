// What a person sees of an operating system, through cmpihost, the facade, the provider and the
// instrumentation as they ship, on a host that is the same everywhere. The expected outputs stand
// in cmpihost/, a file a run.
#include <gtest/gtest.h>

#include <ostream>
#include <string>
#include <vector>

#include "support/GoldenFile.h"
#include "support/ProgramRun.h"

namespace {

struct Run {
    const char* name;  ///< of the test, and of the file
    std::vector<std::string> arguments;
};

const Run runs[] = {
    {"Table", {"ei", "KORVA_OperatingSystem"}},
    {"Mof", {"--format", "mof", "ei", "KORVA_OperatingSystem"}},
    {"Json", {"--format", "json", "ei", "KORVA_OperatingSystem"}},
    {"Tree", {"tree"}},
};

void PrintTo(const Run& run, std::ostream* out) {
    *out << run.name;
}

class CmpihostOutput : public testing::TestWithParam<Run> {};

INSTANTIATE_TEST_SUITE_P(Of, CmpihostOutput, testing::ValuesIn(runs),
                         [](const auto& each) { return each.param.name; });

TEST_P(CmpihostOutput, IsTheSameOnEveryMachine) {
    const ProgramRun run = runProgram(
        KORVA_CMPIHOST, GetParam().arguments,
        {"LD_LIBRARY_PATH=" KORVA_BINARY_DIR "/fixture-host", "TZ=UTC", "LC_ALL=C", "COLUMNS=100"});
    EXPECT_EQ(run.status, 0);
    expectGolden(std::string(KORVA_TEST_DATA "/cmpihost/") + GetParam().name + ".txt",
                 run.err + run.out);
}

}  // namespace
