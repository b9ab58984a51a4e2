#include <gmock/gmock.h>
#include <syslog.h>

#include <filesystem>
#include <limits>

#include "framework/logging/Logger.h"
#include "tests/logging/LoggingSupport.h"

namespace {

using namespace logging_test;
using testing::ElementsAre;
using testing::IsEmpty;

class LoggerReloadTest : public testing::Test {
  protected:
    LoggerReloadTest() { environment_.source = {path_, true}; }

    void configure(const std::string& content) { writeFile(path_, content); }
    void reconfigure(const std::string& content) {
        configure(content);
        environment_.advance(1000);
    }
    void write(const std::string& text) { logger_.write(record(text)); }

    TemporaryDirectory folder_;
    FakeEnvironment environment_;
    const std::string path_ = folder_.path("zblog.conf");
    const std::string notInForce_ = warningOf(path_ + ": not in force; the defaults hold");
    const std::string first_ = folder_.path("first");
    const std::string second_ = folder_.path("second");
    const std::string toFirst_ = "log.sink = file:" + first_ + "\nlog.records = all\n";
    const std::string toSecond_ = "log.sink = file:" + second_ + "\nlog.records = all\n";
    ZBLog::Logger logger_{environment_};
};

TEST_F(LoggerReloadTest, FollowsAChangeAfterOneSecondAndNotBefore) {
    configure(toFirst_);
    write("one");
    configure(toSecond_);
    environment_.advance(999);
    write("two");
    environment_.advance(1);
    write("three");
    EXPECT_THAT(textsOf(readFile(first_)), ElementsAre("one", "two"));
    EXPECT_THAT(textsOf(readFile(second_)), ElementsAre("three"));
    EXPECT_THAT(environment_.takeSystemLog(), IsEmpty());
}

TEST_F(LoggerReloadTest, FollowsAChangeWhenItsClockWrapsAround) {
    environment_.setMilliseconds(std::numeric_limits<std::uint32_t>::max() - 100);
    configure(toFirst_);
    write("one");
    reconfigure(toSecond_);
    write("two");
    EXPECT_THAT(textsOf(readFile(second_)), ElementsAre("two"));
}

TEST_F(LoggerReloadTest, ClosesAFileThatIsNoLongerWanted) {
    configure(toFirst_);
    write("one");
    const std::size_t before = openDescriptors();
    for (int round = 0; round < 20; ++round) {
        reconfigure(round % 2 == 0 ? toSecond_ : toFirst_);
        write("two");
        EXPECT_EQ(openDescriptors(), before);
    }
}

TEST_F(LoggerReloadTest, OpensAClosedChannelAndClosesAnOpenOne) {
    configure("log.sink = off\n");
    write(failure);
    reconfigure(toFirst_);
    write("one");
    reconfigure("log.sink = off\n");
    write("two");
    EXPECT_THAT(textsOf(readFile(first_)), ElementsAre("one"));
    EXPECT_THAT(environment_.takeSystemLog(), IsEmpty());
}

TEST_F(LoggerReloadTest, KeepsCountingLostRecordsWhenOnlyTheLevelChanges) {
    const std::string file = folder_.path("var/log");
    const std::string sink = "log.sink = file:" + file + "\nlog.records = all\n";
    configure(sink);
    write("lost");
    reconfigure(sink + "log.level = 4000\n");
    write("lost");
    std::filesystem::create_directory(folder_.path("var"));
    write("one");
    EXPECT_THAT(textsOf(readFile(file)),
                ElementsAre("2 records were dropped: No such file or directory", "one"));
    EXPECT_EQ(environment_.takeSystemLog().size(), 1u);
}

TEST_F(LoggerReloadTest, ReportsTheErrorsOfEachContentOnceAndKeepsTheDefaults) {
    configure(toFirst_ + "log.level = high\n");
    for (int count = 0; count < 10; ++count) {
        write(count == 5 ? failure : "one");
        environment_.advance(1000);
    }
    EXPECT_FALSE(std::filesystem::exists(first_));
    EXPECT_THAT(
        environment_.takeSystemLog(),
        ElementsAre(
            warningOf(path_ + ":3: log.level must be a number from 0 to 999999, not \"high\""),
            notInForce_,
            std::to_string(LOG_DAEMON | LOG_ERR) +
                " korva-osstatus: log 3000 Zumbrel.Test work Work.cpp:12 " + failure));
    reconfigure("y\n");
    write("one");
    EXPECT_THAT(
        environment_.takeSystemLog(),
        ElementsAre(warningOf(path_ + ":1: not of the form KEY = VALUE: \"y\""), notInForce_));
}

TEST_F(LoggerReloadTest, GoesBackToTheDefaultsWhenAGoodFileBecomesABadOne) {
    configure(toFirst_);
    write("one");
    reconfigure(toFirst_ + "nonsense\n");
    write("two");
    reconfigure(toFirst_);
    write("three");
    EXPECT_THAT(textsOf(readFile(first_)), ElementsAre("one", "three"));
}

TEST_F(LoggerReloadTest, LetsGoOfItsFileWhenAConfigurationIsPutInForce) {
    configure(toFirst_);
    const std::size_t before = openDescriptors();
    write("one");
    logger_.use(ZBLog::Configuration());
    EXPECT_EQ(openDescriptors(), before);
    reconfigure(toSecond_);
    write("two");
    EXPECT_FALSE(std::filesystem::exists(second_));
}

}  // namespace
