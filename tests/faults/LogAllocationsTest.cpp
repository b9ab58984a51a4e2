// std::bad_alloc from the n-th allocation that the log makes for the first record of a process, n
// counted up until none fails any more.
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <iterator>

#include "ZBLogger.h"
#include "faults/CountUp.h"
#include "support/FixtureTree.h"

namespace {

enum Exit : int { NothingFailed = 0, Failed = 1, Thrown = 2 };

void write(const std::string& text) {
    ZBLog::ZBLogger::traceLevelMessage("function", "file", 1, "Zumbrel.OperatingSystemProvider",
                                       4000, nullptr, 0, 0, text);
}

// The first record is written while memory is short, the second one when there is enough again.
Exit writeTwice(std::size_t n, bool andLater) {
    const std::string first = "the first record, which needs the configuration";
    bool thrown = false;
    allocations::failFrom(n, andLater);
    try {
        write(first);
    } catch (...) {
        thrown = true;
    }
    const bool failed = allocations::release() != 0;
    write("the second record");
    if (thrown) return Thrown;
    return failed ? Failed : NothingFailed;
}

// What a process exits with that has written nothing yet; -1 when it died.
int inNewProcess(std::size_t n, bool andLater) {
    const pid_t child = ::fork();
    if (child == 0) ::_exit(writeTwice(n, andLater));
    int status = 0;
    if (child < 0 || ::waitpid(child, &status, 0) != child) return -1;
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

std::string contentOf(const std::string& path) {
    std::ifstream file(path);
    return {std::istreambuf_iterator<char>(file), {}};
}

TEST(LogAllocationFaults, AreKeptInsideAndTheNextRecordIsWritten) {
    FixtureTree tree;
    const std::string output = tree.path("trace.log");
    tree.write("zblog.conf", "trace.sink = file:" + output +
                                 "\ntrace.level = 4000\ntrace.records = all\n"
                                 "trace.category = Zumbrel.*\n");
    ASSERT_EQ(::setenv("ZBLOG_CONF", tree.path("zblog.conf").c_str(), 1), 0);
    for (const bool andLater : {false, true}) {
        const std::size_t end = countUp("allocation", [&](std::size_t n) {
            tree.remove("trace.log");
            const int exit = inNewProcess(n, andLater);
            const std::string written = contentOf(output);
            EXPECT_TRUE(exit == NothingFailed || exit == Failed) << exit;
            EXPECT_NE(written.find("the second record"), std::string::npos);
            if (exit != NothingFailed) return exit == Failed;
            EXPECT_NE(written.find("the first record"), std::string::npos);
            return false;
        });
        EXPECT_GT(end, 3U);
    }
    ::unsetenv("ZBLOG_CONF");
}

}  // namespace
