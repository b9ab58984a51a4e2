#include <gtest/gtest.h>
#include <stdlib.h>
#include <time.h>

#include <string>

#include "Linux/OperatingSystem.h"
#include "provider/SimulatedFixture.h"

namespace {

using VA::NodeLexicon::InstallDate;
using VA::NodeLexicon::LastBootUpTime;
using VA::OSStatusProvider::OperatingSystem;

/// Sets libc's zone for one test, as it would stand in the host process.
class DateTime : public SimulatedFixture {
  protected:
    ~DateTime() override { timezone = before_; }

    std::string converted(const std::string& text, long zone) {
        timezone = zone;
        VA::SimulatedHost::Node node;
        node.properties[InstallDate] = text;
        node.properties[LastBootUpTime] = text;
        host->clearNodes();
        host->addNode(node);
        OperatingSystem element;
        std::string installed;
        std::string booted;
        EXPECT_TRUE(element.getInstallDate(installed));
        EXPECT_TRUE(element.getLastBootUpTime(booted));
        EXPECT_EQ(installed, booted);
        return installed;
    }

  private:
    long before_ = timezone;
};

TEST_F(DateTime, SignIsMinusEastOfUTCAndPlusWestOfIt) {
    EXPECT_EQ(converted("2009-03-17-08:15:42", -3600), "20090317081542.000000-060");
    EXPECT_EQ(converted("2009-03-17-08:15:42", 0), "20090317081542.000000+000");
    EXPECT_EQ(converted("2009-03-17-08:15:42", 18000), "20090317081542.000000+300");
    EXPECT_EQ(converted("2009-03-17-08:15:42", 50400), "20090317081542.000000+840");
    EXPECT_EQ(converted("2009-03-17-08:15:42", -45900), "20090317081542.000000-765");
}

TEST_F(DateTime, OffsetIsTruncatedTowardsZero) {
    EXPECT_EQ(converted("2009-03-17-08:15:42", -59), "20090317081542.000000-000");
    EXPECT_EQ(converted("2009-03-17-08:15:42", 119), "20090317081542.000000+001");
}

TEST_F(DateTime, LargestFieldsFillTheBuffer) {
    EXPECT_EQ(converted("9999-99-99-99:99:99", 59940), "99999999999999.000000+999");
}

TEST_F(DateTime, TextThatIsTooLongForTheBufferIsCut) {
    EXPECT_EQ(converted("2009-03-17-08:15:42", 86340), "20090317081542.000000+143");
    // A signed field is read as a huge number: its ten digits push the rest out of the buffer.
    EXPECT_EQ(converted("2009--1-17-08:15:42", 0), "2009429496729517081542.00");
}

TEST_F(DateTime, SpaceIsNoSeparator) {
    EXPECT_EQ(converted("2009-03-17 18:15:42", 0), "20090317081542.000000+000");
    EXPECT_EQ(converted("2009-03-17 08:15:42", 0), "20090317081542.000000+000");
}

TEST_F(DateTime, AnyOtherCharacterSeparates) {
    EXPECT_EQ(converted("2009/03/17T08.15.42", 0), "20090317081542.000000+000");
    EXPECT_EQ(converted("  2009 - 03 - 17 - 08 : 15 : 42 trailing", 0),
              "20090317081542.000000+000");
}

TEST_F(DateTime, TextThatDoesNotParseGivesYearZeroInAFieldOfFour) {
    EXPECT_EQ(converted("never", 0), "   00000000000.000000+000");
    EXPECT_EQ(converted("", 18000), "   00000000000.000000+300");
}

TEST_F(DateTime, FieldsThatAreNotReachedStayZero) {
    EXPECT_EQ(converted("2009", 0), "20090000000000.000000+000");
    EXPECT_EQ(converted("2009-03", 0), "20090300000000.000000+000");
    EXPECT_EQ(converted("2009-03-17-08:1", 0), "20090317080100.000000+000");
    EXPECT_EQ(converted("2009-xx-17", 0), "20090000000000.000000+000");
}

TEST_F(DateTime, HugeTextIsReadAsFarAsItParses) {
    EXPECT_EQ(converted("2009-03-17-08:15:42" + std::string(1000000, '9'), 0),
              "20090317081542.000000+000");
}

TEST_F(DateTime, WithoutThePropertyThereIsNoDate) {
    host->clearNodes();
    host->addNode({});
    OperatingSystem element;
    std::string text = "untouched";
    EXPECT_FALSE(element.getInstallDate(text));
    EXPECT_FALSE(element.getLastBootUpTime(text));
    EXPECT_EQ(text, "untouched");
}

TEST_F(DateTime, ZoneIsTakenAsItStandsWithoutInitialisation) {
    setenv("TZ", "EST5", 1);
    EXPECT_EQ(converted("2009-03-17-08:15:42", -3600), "20090317081542.000000-060");
    EXPECT_EQ(timezone, -3600);
    unsetenv("TZ");
}

}  // namespace
