// What passes and where it goes, with a configuration that is set from the start and stays.
#include "framework/logging/Logger.h"

#include <gmock/gmock.h>
#include <syslog.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <filesystem>
#include <set>
#include <thread>

#include "ZBLogger.h"
#include "tests/logging/LoggingSupport.h"

namespace {

using namespace ZBLog;
using namespace logging_test;
using testing::ElementsAre;

class LoggerTest : public testing::Test {
  protected:
    static Configuration configurationOf(const ChannelConfiguration& log,
                                         const ChannelConfiguration& trace = {}) {
        Configuration configuration;
        configuration.of(Channel::log) = log;
        configuration.of(Channel::trace) = trace;
        return configuration;
    }

    /// A file that takes everything up to level 4000.
    static ChannelConfiguration to(const std::string& path) {
        return everythingTo(Destination::file, path);
    }

    void use(const ChannelConfiguration& log, const ChannelConfiguration& trace = {}) {
        logger_.use(configurationOf(log, trace));
    }
    void write(const std::string& text, int level, Channel channel = Channel::log) {
        logger_.write(record(text, level, channel));
    }
    std::vector<std::string> logged() const { return textsOf(readFile(log_)); }
    std::vector<std::string> traced() const { return textsOf(readFile(trace_)); }

    TemporaryDirectory folder_;
    FakeEnvironment environment_;
    Logger logger_{environment_};
    const std::string log_ = folder_.path("log");
    const std::string trace_ = folder_.path("trace");
};

TEST_F(LoggerTest, SendsFailuresToTheSystemsLogWithoutAnyConfiguration) {
    for (const Channel channel : {Channel::log, Channel::trace}) {
        write(failure, 3000, channel);
        write(failure, 4000, channel);
        write("ENTERING: G() in A [Line: 3],Parameters List: P", 3000, channel);
        write("ENTERING: G() in A [Line: 3]", 4000, channel);
    }
    EXPECT_THAT(environment_.takeSystemLog(),
                ElementsAre(std::to_string(LOG_DAEMON | LOG_ERR) +
                            " korva-osstatus: log 3000 Zumbrel.Test work Work.cpp:12 MESSAGE "
                            "[File: Work.cpp, Line: 12]: it broke"));
}

TEST_F(LoggerTest, LetsLevelsUpToTheThresholdPass) {
    ChannelConfiguration coarse = to(log_);
    coarse.level = 3000;
    use(coarse, to(trace_));
    for (const int level : {-1, 0, 2999, 3000, 3001, 4000, 4001, 2147483647}) {
        write(std::to_string(level), level, Channel::log);
        write(std::to_string(level), level, Channel::trace);
    }
    EXPECT_THAT(logged(), ElementsAre("-1", "0", "2999", "3000"));
    EXPECT_THAT(traced(), ElementsAre("-1", "0", "2999", "3000", "3001", "4000"));
}

TEST_F(LoggerTest, LetsOnlyMessagesPassWhereOnlyFailuresAreWanted) {
    ChannelConfiguration failures = to(log_);
    failures.failuresOnly = true;
    use(failures);
    for (const char* text : {failure, "MESSAGE [", "MESSAGE", "", " MESSAGE [", "METHOD: x"}) {
        write(text, 3000);
    }
    EXPECT_THAT(logged(), ElementsAre(failure, "MESSAGE ["));
}

TEST_F(LoggerTest, LetsOnlyWantedCategoriesPass) {
    ChannelConfiguration one = to(log_);
    one.categories.add("Zumbrel.OSStatusProvider");
    use(one);
    logger_.write({Channel::log, "f", "F.cpp", 1, "Zumbrel.OSStatusProvider", 3000, "one"});
    logger_.write({Channel::log, "f", "F.cpp", 1, "Zumbrel.OperatingSystemProvider", 3000, "two"});
    EXPECT_THAT(logged(), ElementsAre("one"));
}

TEST_F(LoggerTest, WritesBothChannelsToOneFileWithoutTearingLines) {
    use(to(log_), to(log_));
    const std::size_t before = openDescriptors();
    write("one", 3000, Channel::log);
    write("two", 3000, Channel::trace);
    EXPECT_EQ(openDescriptors(), before + 1);
    EXPECT_THAT(readFile(log_), testing::MatchesRegex(
                                    "[^\n]* log 3000 [^\n]* one\n[^\n]* trace 3000 [^\n]* two\n"));
}

TEST_F(LoggerTest, SendsEachChannelToItsOwnSink) {
    use(everythingTo(Destination::standardError), everythingTo(Destination::systemLog));
    testing::internal::CaptureStderr();
    write("one", 3000, Channel::log);
    write("two", 3000, Channel::trace);
    EXPECT_THAT(textsOf(testing::internal::GetCapturedStderr()), ElementsAre("one"));
    EXPECT_THAT(environment_.takeSystemLog(), ElementsAre(testing::EndsWith(" two")));
}

TEST_F(LoggerTest, LeavesErrnoAloneWhenItWritesAndWhenItReadsItsConfiguration) {
    use(to(folder_.path("missing/log")));
    errno = 4242;
    write("lost", 3000);
    EXPECT_EQ(errno, 4242);
    EXPECT_EQ(environment_.takeSystemLog().size(), 1u);

    environment_.source = {folder_.path("missing.conf"), true};
    Logger reading(environment_);
    errno = 4242;
    reading.write(record("filtered", 4000));
    EXPECT_EQ(errno, 4242);
    EXPECT_EQ(environment_.takeSystemLog().size(), 2u);
}

TEST_F(LoggerTest, ClosesItsFilesAndDropsRecordsAfterItsEnd) {
    environment_.source = {folder_.path("zblog.conf"), true};
    writeFile(environment_.source.path, "log.sink = file:" + log_ + "\n");
    const std::size_t before = openDescriptors();
    use(to(log_));
    write("one", 3000);
    EXPECT_EQ(openDescriptors(), before + 1);
    logger_.close();
    EXPECT_EQ(openDescriptors(), before);
    write("two", 3000);
    use(to(log_));
    write("three", 3000);
    environment_.advance(1000);
    write("four", 3000);
    logger_.close();
    EXPECT_THAT(logged(), ElementsAre("one"));
}

TEST_F(LoggerTest, ServesTheTwoCallsOfTheLibrary) {
    processLogger().use(configurationOf(to(log_), to(trace_)));
    const std::string category = "Zumbrel.OSStatusProvider";
    ZBLogger::logLevelMessage("f", "F.cpp", 1, category, 3000, nullptr, 0, 0, "one");
    ZBLogger::traceLevelMessage("g", "G.cpp", 2, category, 4000, nullptr, 0, 0, "two");
    ZBLogger::traceLevelMessage(nullptr, nullptr, 0, "", 4000, nullptr, 0, 0, "");
    EXPECT_THAT(readFile(log_),
                testing::EndsWith(" log 3000 Zumbrel.OSStatusProvider f F.cpp:1 one\n"));
    EXPECT_THAT(readFile(trace_), testing::EndsWith(" trace 4000 - - -:0 \n"));
    EXPECT_THAT(traced(), ElementsAre("two", ""));
}

TEST_F(LoggerTest, LosesNothingWhileTheConfigurationChangesUnderManyThreads) {
    constexpr int threads = 8, recordsEach = 300;
    environment_.source = {folder_.path("zblog.conf"), true};
    const auto configure = [&](int round) {
        const std::string path = environment_.source.path;
        writeFile(path + ".new", "log.sink = file:" + log_ + std::to_string(round % 3) +
                                     "\nlog.records = all\nlog.category = Zumbrel.*\n");
        std::filesystem::rename(path + ".new", path);
        environment_.advance(1000);
    };
    configure(0);
    std::atomic<int> running{threads};
    std::multiset<std::string> expected, found;
    std::vector<std::thread> writers;
    for (int writer = 0; writer < threads; ++writer) {
        const std::string start = std::to_string(writer) + "/";
        for (int count = 0; count < recordsEach; ++count) {
            expected.insert(start + std::to_string(count));
        }
        writers.emplace_back([&, start] {
            for (int count = 0; count < recordsEach; ++count) {
                write(start + std::to_string(count), 3000);
                write("filtered", 4000);
            }
            --running;
        });
    }
    for (int round = 1; running > 0; ++round) configure(round);
    for (std::thread& writer : writers) writer.join();

    for (int file = 0; file < 3; ++file) {
        for (std::string& text : textsOf(readFile(log_ + std::to_string(file)))) {
            found.insert(std::move(text));
        }
    }
    EXPECT_TRUE(found == expected) << found.size() << " of " << expected.size();
    EXPECT_TRUE(environment_.takeSystemLog().empty());
}

TEST_F(LoggerTest, LosesNoRecordOfThreadsThatAllComeFirst) {
    constexpr std::size_t threads = 8;
    environment_.source = {folder_.path("zblog.conf"), true};
    writeFile(environment_.source.path, "log.sink = file:" + log_ + "\nlog.records = all\n");
    std::vector<std::thread> writers;
    while (writers.size() < threads) writers.emplace_back([&] { write("first", 3000); });
    for (std::thread& writer : writers) writer.join();
    EXPECT_EQ(logged(), std::vector<std::string>(threads, "first"));
}

TEST_F(LoggerTest, EndsCleanlyWhileThreadsWrite) {
    use(to(log_));
    std::atomic<bool> stop{false};
    std::vector<std::thread> writers;
    for (int writer = 0; writer < 4; ++writer) {
        writers.emplace_back([&] {
            while (!stop) write("one", 3000);
        });
    }
    while (logged().size() < 10) std::this_thread::yield();
    logger_.close();
    const std::uintmax_t size = std::filesystem::file_size(log_);
    stop = true;
    for (std::thread& writer : writers) writer.join();
    EXPECT_LE(std::filesystem::file_size(log_), size + 4 * 4096);
}

TEST_F(LoggerTest, GoesOnInAChildProcess) {
    use(to(log_));
    write("parent", 3000);
    const std::string parent = "[^ ]* " + std::to_string(::getpid()) + " [^\n]* parent\n";
    const int status = inChildProcess([&] {
        write("child", 3000);
        writeFile(trace_, std::to_string(::getpid()));
        return 0;
    });
    EXPECT_EQ(status, 0);
    const std::string child = readFile(trace_);
    EXPECT_NE(child, std::to_string(::getpid()));
    EXPECT_THAT(readFile(log_),
                testing::MatchesRegex(parent + "[^ ]* " + child + " [^\n]* child\n"));
}

}  // namespace
