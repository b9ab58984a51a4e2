#include "host/cli/ProviderRecords.h"

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
        const ScopedLogConfiguration log("log.sink = off\n");
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

std::string contents(const std::filesystem::path& file) {
    std::ostringstream text;
    text << std::ifstream(file).rdbuf();
    return text.str();
}

TEST(ScopedLogConfiguration, ConfiguresTheLogAsLongAsItLives) {
    const std::ptrdiff_t before = openFiles();
    {
        const ScopedLogConfiguration log("log.sink = off\n");
        EXPECT_EQ(contents(std::getenv("ZBLOG_CONF")), "log.sink = off\n");
    }
    EXPECT_EQ(std::getenv("ZBLOG_CONF"), nullptr);
    EXPECT_EQ(openFiles(), before);
}

TEST(StderrConfiguration, ShowsOneChannelOfTheLibraryUpToTheLevel) {
    EXPECT_EQ(stderrConfiguration({}),
              "log.sink = stderr\nlog.level = 4000\nlog.records = all\ntrace.sink = off\n");
    EXPECT_EQ(stderrConfiguration({LogLevel::Calls, LogChannel::Log}),
              "log.sink = stderr\nlog.level = 3000\nlog.records = all\ntrace.sink = off\n");
    EXPECT_EQ(
        stderrConfiguration({LogLevel::Failures, LogChannel::Trace}),
        "trace.sink = stderr\ntrace.level = 3000\ntrace.records = failures\nlog.sink = off\n");
    EXPECT_EQ(stderrConfiguration({LogLevel::Everything, LogChannel::Cmpi}), "");
}

/// The file that a configuration of failures has them written to.
std::filesystem::path recordsFile(const std::string& configuration) {
    const std::size_t start = configuration.find("file:") + 5;
    return configuration.substr(start, configuration.find('\n', start) - start);
}

TEST(FailureRecords, AreWrittenBesidesWhatIsConfiguredUnlessThatUsesTheTrace) {
    const FailureRecords records;
    const std::filesystem::path folder =
        recordsFile(records.configuration("/nonexistent")).parent_path();
    std::ofstream(folder / "records") << "log.level = 4000\n # trace.sink = off";
    EXPECT_EQ(records.configuration(folder / "records"),
              "log.level = 4000\n # trace.sink = off\ntrace.sink = file:" +
                  (folder / "records").string() + "\ntrace.records = failures\n");
    std::ofstream(folder / "records") << "log.level = 4000\n trace.level = 1";
    EXPECT_EQ(records.configuration(folder / "records"), "");
}

TEST(FailureRecords, AreReadOnceEachAndGoWithTheirFolder) {
    std::filesystem::path file;
    {
        const FailureRecords records;
        EXPECT_THAT(records.texts(), testing::IsEmpty());
        file = recordsFile(records.configuration("/nonexistent"));
        const char* const line = "T 1 1 trace 3000 C f f.cpp:1 MESSAGE [File: f.cpp, Line: 1]: ";
        std::ofstream(file) << line << "no [x]: y\n"
                            << line << "other\n"
                            << "no record\n"
                            << line << "no [x]: y\n";
        EXPECT_THAT(records.texts(), testing::ElementsAre("no [x]: y", "other"));
    }
    EXPECT_FALSE(std::filesystem::exists(file.parent_path()));
}

TEST(FailureRecords, AreNoneWhereNoFolderCanBeMade) {
    setenv("TMPDIR", "/nonexistent", 1);
    const FailureRecords records;
    unsetenv("TMPDIR");
    EXPECT_EQ(records.configuration("/nonexistent"), "");
    EXPECT_THAT(records.texts(), testing::IsEmpty());
}

TEST(ScopedLogConfiguration, TellsThatNoFileCanBeOpened) {
    const LowLimit none(RLIMIT_NOFILE, 0);
    EXPECT_EQ(failure(), EMFILE);
}

TEST(ScopedLogConfiguration, TellsThatNothingCanBeWrittenAndLeavesNoFileOpen) {
    signal(SIGXFSZ, SIG_IGN);
    const std::ptrdiff_t before = openFiles();
    {
        const LowLimit none(RLIMIT_FSIZE, 0);
        EXPECT_EQ(failure(), EFBIG);
    }
    EXPECT_EQ(openFiles(), before);
}

/// What is shown of one message of each kind.
std::string shown(const std::optional<LogRequest>& request) {
    std::ostringstream stream;
    BrokerMessages messages(request, stream);
    messages.take({false, CMPI_SEV_ERROR, "disk", "is full\n"});
    messages.take({false, CMPI_SEV_INFO, "", "started"});
    messages.take({true, CMPI_LEV_VERBOSE, "reader", "line 1"});
    messages.take({false, 7, "", "odd"});
    EXPECT_THAT(messages.failures(), testing::ElementsAre("is full\n"));
    return stream.str();
}

TEST(BrokerMessages, AreShownAsFarAsTheRequestWantsThem) {
    const std::string error = "cmpi log error disk: is full\\n\n";
    const std::string logged = "cmpi log info started\n";
    EXPECT_EQ(shown(std::nullopt), "");
    EXPECT_EQ(shown(LogRequest()),
              error + logged + "cmpi trace verbose reader: line 1\ncmpi log 7 odd\n");
    EXPECT_EQ(shown(LogRequest{LogLevel::Calls, LogChannel::Cmpi}),
              error + logged + "cmpi log 7 odd\n");
    EXPECT_EQ(shown(LogRequest{LogLevel::Failures, std::nullopt}), error);
    EXPECT_EQ(shown(LogRequest{LogLevel::Everything, LogChannel::Log}), "");
}

}  // namespace
