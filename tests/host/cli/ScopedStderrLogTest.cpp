#include "host/cli/ScopedStderrLog.h"

#include <gmock/gmock.h>
#include <signal.h>
#include <sys/resource.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <system_error>

namespace {

using namespace cmpihost;

/// Lowers a limit of this process as long as it lives.
class LowLimit {
  public:
    LowLimit(decltype(RLIMIT_NOFILE) kind, rlim_t value) : kind_(kind) {
        getrlimit(kind_, &before_);
        const rlimit lowered{value, before_.rlim_max};
        setrlimit(kind_, &lowered);
    }
    ~LowLimit() { setrlimit(kind_, &before_); }
    LowLimit(const LowLimit&) = delete;
    LowLimit& operator=(const LowLimit&) = delete;

  private:
    decltype(RLIMIT_NOFILE) kind_;
    rlimit before_{};
};

/// The error number that making the object fails with; 0 when it does not.
int failure() {
    try {
        const ScopedStderrLog log;
    } catch (const std::system_error& error) {
        EXPECT_THAT(error.what(), testing::StartsWith("the records cannot be shown: "));
        return error.code().value();
    }
    return 0;
}

std::ptrdiff_t openFiles() {
    using Entries = std::filesystem::directory_iterator;
    return std::distance(Entries("/proc/self/fd"), Entries());
}

TEST(ScopedStderrLog, ConfiguresTheLogAsLongAsItLives) {
    const std::ptrdiff_t before = openFiles();
    {
        const ScopedStderrLog log;
        std::ostringstream configuration;
        configuration << std::ifstream(std::getenv("ZBLOG_CONF")).rdbuf();
        EXPECT_EQ(configuration.str(),
                  "log.sink = stderr\nlog.level = 4000\nlog.records = all\ntrace.sink = off\n");
    }
    EXPECT_EQ(std::getenv("ZBLOG_CONF"), nullptr);
    EXPECT_EQ(openFiles(), before);
}

TEST(ScopedStderrLog, TellsThatNoFileCanBeOpened) {
    const LowLimit none(RLIMIT_NOFILE, 0);
    EXPECT_EQ(failure(), EMFILE);
}

TEST(ScopedStderrLog, TellsThatNothingCanBeWrittenAndLeavesNoFileOpen) {
    signal(SIGXFSZ, SIG_IGN);
    const std::ptrdiff_t before = openFiles();
    {
        const LowLimit none(RLIMIT_FSIZE, 0);
        EXPECT_EQ(failure(), EFBIG);
    }
    EXPECT_EQ(openFiles(), before);
}

}  // namespace
