#include "framework/logging/Logger.h"

#include <gmock/gmock.h>
#include <syslog.h>
#include <unistd.h>

#include <cerrno>
#include <filesystem>

#include "ZBLogger.h"
#include "tests/logging/LoggingSupport.h"

namespace {

using logging_test::everythingTo;
using logging_test::readFile;
using logging_test::record;
using logging_test::textsOf;
using testing::ElementsAre;
using ZBLog::Channel;
using ZBLog::Configuration;
using ZBLog::Destination;

constexpr const char* failure = "MESSAGE [File: Work.cpp, Line: 12]: it broke";

class LoggerTest : public testing::Test {
  protected:
    void write(const std::string& text, int level, Channel channel = Channel::log) {
        logger_.write(record(text, level, channel));
    }
    std::vector<std::string> logged() const { return textsOf(readFile(log_)); }
    std::vector<std::string> traced() const { return textsOf(readFile(trace_)); }

    logging_test::TemporaryFolder folder_;
    logging_test::FakeEnvironment environment_;
    ZBLog::Logger logger_{environment_};
    const std::string log_ = folder_ / "log";
    const std::string trace_ = folder_ / "trace";
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
    Configuration configuration;
    configuration.of(Channel::log) = everythingTo(Destination::file, log_);
    configuration.of(Channel::log).level = 3000;
    configuration.of(Channel::trace) = everythingTo(Destination::file, trace_);
    logger_.use(configuration);
    for (const int level : {-1, 0, 2999, 3000, 3001, 4000, 4001, 2147483647}) {
        write(std::to_string(level), level, Channel::log);
        write(std::to_string(level), level, Channel::trace);
    }
    EXPECT_THAT(logged(), ElementsAre("-1", "0", "2999", "3000"));
    EXPECT_THAT(traced(), ElementsAre("-1", "0", "2999", "3000", "3001", "4000"));
}

TEST_F(LoggerTest, LetsOnlyMessagesPassWhereOnlyFailuresAreWanted) {
    Configuration configuration;
    configuration.of(Channel::log) = everythingTo(Destination::file, log_);
    configuration.of(Channel::log).failuresOnly = true;
    logger_.use(configuration);
    for (const char* text : {failure, "MESSAGE [", "MESSAGE", "", " MESSAGE [", "METHOD: x"}) {
        write(text, 3000);
    }
    EXPECT_THAT(logged(), ElementsAre(failure, "MESSAGE ["));
}

TEST_F(LoggerTest, LetsOnlyWantedCategoriesPass) {
    Configuration configuration;
    configuration.of(Channel::log) = everythingTo(Destination::file, log_);
    configuration.of(Channel::log).categories.add("Zumbrel.OSStatusProvider");
    logger_.use(configuration);
    logger_.write({Channel::log, "f", "F.cpp", 1, "Zumbrel.OSStatusProvider", 3000, "one"});
    logger_.write({Channel::log, "f", "F.cpp", 1, "Zumbrel.OperatingSystemProvider", 3000, "two"});
    EXPECT_THAT(logged(), ElementsAre("one"));
}

TEST_F(LoggerTest, WritesBothChannelsToOneFileWithoutTearingLines) {
    Configuration configuration;
    configuration.of(Channel::log) = everythingTo(Destination::file, log_);
    configuration.of(Channel::trace) = everythingTo(Destination::file, log_);
    logger_.use(configuration);
    const std::size_t before = logging_test::openDescriptors();
    write("one", 3000, Channel::log);
    write("two", 3000, Channel::trace);
    EXPECT_EQ(logging_test::openDescriptors(), before + 1);
    EXPECT_THAT(logged(), ElementsAre("one", "two"));
    EXPECT_THAT(readFile(log_), testing::ContainsRegex(" log 3000 [^\n]* one\n"));
    EXPECT_THAT(readFile(log_), testing::ContainsRegex(" trace 3000 [^\n]* two\n"));
}

TEST_F(LoggerTest, WritesToStandardError) {
    Configuration configuration;
    configuration.of(Channel::trace) = everythingTo(Destination::standardError);
    logger_.use(configuration);
    testing::internal::CaptureStderr();
    write("one", 4000, Channel::trace);
    EXPECT_THAT(textsOf(testing::internal::GetCapturedStderr()), ElementsAre("one"));
}

TEST_F(LoggerTest, SendsEachChannelToItsOwnSink) {
    Configuration configuration;
    configuration.of(Channel::log) = everythingTo(Destination::standardError);
    configuration.of(Channel::trace) = everythingTo(Destination::systemLog);
    logger_.use(configuration);
    testing::internal::CaptureStderr();
    write("one", 3000, Channel::log);
    write("two", 3000, Channel::trace);
    EXPECT_THAT(textsOf(testing::internal::GetCapturedStderr()), ElementsAre("one"));
    EXPECT_THAT(environment_.takeSystemLog(), ElementsAre(testing::EndsWith(" two")));
}

TEST_F(LoggerTest, WritesNothingWhereTheSinkIsOff) {
    Configuration configuration;
    configuration.of(Channel::log) = everythingTo(Destination::off);
    logger_.use(configuration);
    write(failure, 3000);
    EXPECT_TRUE(environment_.takeSystemLog().empty());
}

TEST_F(LoggerTest, LeavesErrnoAlone) {
    Configuration configuration;
    configuration.of(Channel::log) = everythingTo(Destination::file, folder_ / "missing/log");
    logger_.use(configuration);
    errno = 4242;
    write("lost", 3000);
    EXPECT_EQ(errno, 4242);
    EXPECT_EQ(environment_.takeSystemLog().size(), 1u);
}

TEST_F(LoggerTest, LeavesErrnoAloneWhenItReadsItsConfiguration) {
    environment_.source = {folder_ / "missing.conf", true};
    errno = 4242;
    write("filtered", 4000);
    EXPECT_EQ(errno, 4242);
    EXPECT_EQ(environment_.takeSystemLog().size(), 2u);
}

TEST_F(LoggerTest, ClosesItsFilesAndDropsRecordsAfterItsEnd) {
    Configuration configuration;
    configuration.of(Channel::log) = everythingTo(Destination::file, log_);
    environment_.source = {folder_ / "zblog.conf", true};
    logging_test::writeFile(environment_.source.path, "log.sink = file:" + log_ + "\n");
    const std::size_t before = logging_test::openDescriptors();
    logger_.use(configuration);
    write("one", 3000);
    EXPECT_EQ(logging_test::openDescriptors(), before + 1);
    logger_.close();
    EXPECT_EQ(logging_test::openDescriptors(), before);
    write("two", 3000);
    logger_.use(configuration);
    write("three", 3000);
    environment_.advance(1000);
    write("four", 3000);
    logger_.close();
    EXPECT_THAT(logged(), ElementsAre("one"));
}

TEST_F(LoggerTest, ServesTheTwoCallsOfTheLibrary) {
    Configuration configuration;
    configuration.of(Channel::log) = everythingTo(Destination::file, log_);
    configuration.of(Channel::trace) = everythingTo(Destination::file, trace_);
    ZBLog::processLogger().use(configuration);
    const std::string category = "Zumbrel.OSStatusProvider";
    ZBLog::ZBLogger::logLevelMessage("f", "F.cpp", 1, category, 3000, nullptr, 0, 0, "one");
    ZBLog::ZBLogger::traceLevelMessage("g", "G.cpp", 2, category, 4000, nullptr, 0, 0, "two");
    ZBLog::ZBLogger::traceLevelMessage(nullptr, nullptr, 0, "", 4000, nullptr, 0, 0, "");
    EXPECT_THAT(readFile(log_),
                testing::EndsWith(" log 3000 Zumbrel.OSStatusProvider f F.cpp:1 one\n"));
    EXPECT_THAT(readFile(trace_), testing::EndsWith(" trace 4000 - - -:0 \n"));
    EXPECT_THAT(traced(), ElementsAre("two", ""));
}

}  // namespace
