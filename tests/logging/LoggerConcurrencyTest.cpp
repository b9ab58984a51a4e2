#include <gmock/gmock.h>
#include <unistd.h>

#include <atomic>
#include <filesystem>
#include <set>
#include <thread>

#include "framework/logging/Logger.h"
#include "tests/logging/LoggingSupport.h"

namespace {

using logging_test::everythingTo;
using logging_test::readFile;
using logging_test::record;
using logging_test::textsOf;
using ZBLog::Channel;
using ZBLog::Destination;

class LoggerConcurrencyTest : public testing::Test {
  protected:
    logging_test::TemporaryFolder folder_;
    logging_test::FakeEnvironment environment_;
    ZBLog::Logger logger_{environment_};
};

TEST_F(LoggerConcurrencyTest, LosesNothingWhileTheConfigurationChangesUnderManyThreads) {
    constexpr int threads = 8, recordsEach = 300;
    environment_.source = {folder_ / "zblog.conf", true};
    const auto configure = [&](int round) {
        const std::string path = environment_.source.path;
        logging_test::writeFile(path + ".new",
                                "log.sink = file:" + (folder_ / "log") + std::to_string(round % 3) +
                                    "\nlog.records = all\nlog.category = Zumbrel.*\n");
        std::filesystem::rename(path + ".new", path);
        environment_.advance(1000);
    };
    configure(0);
    std::atomic<int> running{threads};
    std::vector<std::thread> writers;
    for (int writer = 0; writer < threads; ++writer) {
        writers.emplace_back([&, writer] {
            for (int count = 0; count < recordsEach; ++count) {
                logger_.write(record(std::to_string(writer) + "/" + std::to_string(count)));
                logger_.write(record("filtered", 4000));
            }
            --running;
        });
    }
    for (int round = 1; running > 0; ++round) configure(round);
    for (std::thread& writer : writers) writer.join();

    std::set<std::string> found;
    std::size_t lines = 0;
    for (int file = 0; file < 3; ++file) {
        for (const std::string& text :
             textsOf(readFile((folder_ / "log") + std::to_string(file)))) {
            found.insert(text);
            ++lines;
        }
    }
    EXPECT_EQ(lines, static_cast<std::size_t>(threads * recordsEach));
    for (int writer = 0; writer < threads; ++writer) {
        for (int count = 0; count < recordsEach; ++count) {
            EXPECT_EQ(found.count(std::to_string(writer) + "/" + std::to_string(count)), 1u);
        }
    }
    EXPECT_TRUE(environment_.takeSystemLog().empty());
}

TEST_F(LoggerConcurrencyTest, LosesNoRecordOfThreadsThatAllComeFirst) {
    constexpr int threads = 8;
    environment_.source = {folder_ / "zblog.conf", true};
    logging_test::writeFile(environment_.source.path,
                            "log.sink = file:" + (folder_ / "log") + "\nlog.records = all\n");
    std::vector<std::thread> writers;
    for (int writer = 0; writer < threads; ++writer) {
        writers.emplace_back([&] { logger_.write(record("first")); });
    }
    for (std::thread& writer : writers) writer.join();
    EXPECT_EQ(textsOf(readFile(folder_ / "log")).size(), static_cast<std::size_t>(threads));
}

TEST_F(LoggerConcurrencyTest, EndsCleanlyWhileThreadsWrite) {
    ZBLog::Configuration configuration;
    configuration.of(Channel::log) = everythingTo(Destination::file, folder_ / "log");
    logger_.use(configuration);
    std::atomic<bool> stop{false};
    std::vector<std::thread> writers;
    for (int writer = 0; writer < 4; ++writer) {
        writers.emplace_back([&] {
            while (!stop) logger_.write(record("one"));
        });
    }
    while (textsOf(readFile(folder_ / "log")).size() < 10) std::this_thread::yield();
    logger_.close();
    const std::uintmax_t size = std::filesystem::file_size(folder_ / "log");
    stop = true;
    for (std::thread& writer : writers) writer.join();
    EXPECT_LE(std::filesystem::file_size(folder_ / "log"), size + 4 * 4096);
}

TEST_F(LoggerConcurrencyTest, GoesOnInAChildProcess) {
    ZBLog::Configuration configuration;
    configuration.of(Channel::log) = everythingTo(Destination::file, folder_ / "log");
    logger_.use(configuration);
    logger_.write(record("parent"));
    const int status = logging_test::inChildProcess([&] {
        logger_.write(record("child"));
        return 0;
    });
    EXPECT_EQ(status, 0);
    const auto lines = logging_test::linesOf(readFile(folder_ / "log"));
    ASSERT_EQ(lines.size(), 2u);
    const auto process = [](const std::string& line) {
        const std::size_t start = line.find(' ') + 1;
        return line.substr(start, line.find(' ', start) - start);
    };
    EXPECT_EQ(process(lines[0]), std::to_string(::getpid()));
    EXPECT_NE(process(lines[1]), process(lines[0]));
}

}  // namespace
