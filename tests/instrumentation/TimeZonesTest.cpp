// Dates in the zone of the process, which other code sets up or not, as it pleases.
#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <ctime>

#include "tests/instrumentation/HostParts.h"

namespace {

using namespace VA::NodeLexicon;

// Seconds since the epoch of "YYYY-MM-DD-HH:MM:SS", read as UTC; by counting days, as the C
// library's own conversions would touch the zone under test.
std::int64_t utcInstant(const std::string& text) {
    int year = 0, month = 0, day = 0, hour = 0, minute = 0, second = 0;
    char end = 0;
    EXPECT_EQ(std::sscanf(text.c_str(), "%4d-%2d-%2d-%2d:%2d:%2d%c", &year, &month, &day, &hour,
                          &minute, &second, &end),
              6)
        << text;
    const int lengths[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
    const auto leap = [](int y) { return y % 4 == 0 && (y % 100 != 0 || y % 400 == 0); };
    std::int64_t days = day - 1;
    for (int y = 1970; y < year; ++y) days += leap(y) ? 366 : 365;
    for (int m = 1; m < month; ++m) days += lengths[m - 1] + (m == 2 && leap(year) ? 1 : 0);
    return ((days * 24 + hour) * 60 + minute) * 60 + second;
}

// Sets TZ, and puts it back.
class ScopedZone {
  public:
    explicit ScopedZone(const char* zone) {
        if (const char* before = std::getenv("TZ")) before_ = before;
        ::setenv("TZ", zone, 1);
    }
    ~ScopedZone() {
        if (before_) {
            ::setenv("TZ", before_->c_str(), 1);
        } else {
            ::unsetenv("TZ");
        }
        ::tzset();
    }
    ScopedZone(const ScopedZone&) = delete;
    ScopedZone& operator=(const ScopedZone&) = delete;

  private:
    std::optional<std::string> before_;
};

struct TimeZones : testing::Test {
    TimeZones() {
        host.tree().writeCompleteHost();
        host.files->fixedDates = {{"", {1650000000, 0}}};
    }
    FixtureHost host;
};

struct Zone {
    const char* tz;
    long timezone;
    const char* bootText;  // of the instant 1700000000, 2023-11-14-22:13:20 UTC
};

const Zone zones[] = {
    {"CET-1", -3600, "2023-11-14-21:13:20"},       {"UTC0", 0, "2023-11-14-22:13:20"},
    {"EST5", 18000, "2023-11-15-03:13:20"},        {"EST5EDT", 18000, "2023-11-15-03:13:20"},
    {"XXX14", 50400, "2023-11-15-12:13:20"},       {"<+1245>-12:45", -45900, "2023-11-14-09:28:20"},
    {"IST-5:30", -19800, "2023-11-14-16:43:20"},   {"NST3:30", 12600, "2023-11-15-01:43:20"},
    {"<-0930>9:30", 34200, "2023-11-15-07:43:20"}, {"LMT-0:19:32", -1172, "2023-11-14-21:54:20"},
};

TEST_F(TimeZones, TextMinusTheZonesMinutesIsTheTrueInstant) {
    for (const Zone& zone : zones) {
        const ScopedZone scoped(zone.tz);
        ::tzset();
        ASSERT_EQ(::timezone, zone.timezone) << zone.tz;
        EXPECT_EQ(host.text(LastBootUpTime), zone.bootText) << zone.tz;
        const std::int64_t offset = zone.timezone / 60 * 60;
        for (const auto& [id, instant] : {std::pair(LastBootUpTime, std::int64_t{1700000000}),
                                          std::pair(InstallDate, std::int64_t{1650000000})}) {
            EXPECT_EQ(utcInstant(host.text(id).value_or("")) - offset, instant) << zone.tz << id;
        }
    }
}

TEST_F(TimeZones, BootTimeOfThisMachineIsTheSameInstantInEachZone) {
    const auto machine = VA::makeLinuxHost();
    std::optional<std::int64_t> first;
    for (const Zone& zone : zones) {
        const ScopedZone scoped(zone.tz);
        ::tzset();
        auto cursor = machine->openCursor();
        cursor->select(OperatingSystemNode);
        std::string text;
        ASSERT_TRUE(cursor->readProperty(LastBootUpTime, text));
        const std::int64_t instant = utcInstant(text) - ::timezone / 60 * 60;
        EXPECT_EQ(first.value_or(instant), instant) << zone.tz;
        first = instant;
    }
    struct timespec sinceBoot {};
    ASSERT_EQ(::clock_gettime(CLOCK_BOOTTIME, &sinceBoot), 0);
    EXPECT_NEAR(static_cast<double>(*first),
                static_cast<double>(std::time(nullptr) - sinceBoot.tv_sec), 2.0);
}

// Whoever wants the zone set up does it: a value that nobody set stays, and is the one that counts.
TEST_F(TimeZones, NoReadSetsUpTheZoneOfTheProcess) {
    const ScopedZone scoped("EST5");
    for (const long untouched : {0L, -3600L, 12345L}) {
        ::timezone = untouched;
        auto cursor = host.cursor();
        std::string text;
        unsigned int number = 0;
        bool flag = false;
        for (unsigned int id = 100; id < 160; ++id) {
            cursor->readProperty(Properties(id), text);
            cursor->readProperty(Properties(id), number);
            cursor->readProperty(Properties(id), flag);
        }
        cursor->readComputerName(text);
        cursor->nodeStatus();
        EXPECT_EQ(::timezone, untouched);
        EXPECT_EQ(utcInstant(host.text(LastBootUpTime).value_or("")),
                  1700000000 + untouched / 60 * 60);
    }
}

TEST_F(TimeZones, ZoneCountsAsItStandsWhenThePropertyIsReadNotWhenTheWalkBegan) {
    const ScopedZone scoped("UTC0");
    ::tzset();
    auto cursor = host.cursor();
    std::string text;
    ASSERT_TRUE(cursor->readProperty(LastBootUpTime, text));
    EXPECT_EQ(text, "2023-11-14-22:13:20");
    ::setenv("TZ", "IST-5:30", 1);
    ASSERT_TRUE(cursor->readProperty(LastBootUpTime, text));
    EXPECT_EQ(text, "2023-11-14-22:13:20");
    ::tzset();
    ASSERT_TRUE(cursor->readProperty(LastBootUpTime, text));
    EXPECT_EQ(text, "2023-11-14-16:43:20");
}

}  // namespace
