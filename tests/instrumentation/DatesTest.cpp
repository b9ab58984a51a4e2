// When the host was booted and installed, and the texts of it, in the zone of the process: which
// other code sets up or not, as it pleases.
#include "framework/instrumentation/Linux/Dates.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <limits>

#include "support/TestHost.h"

namespace {

using namespace VA::Linux;
using namespace VA::NodeLexicon;

constexpr std::int64_t earliest = std::numeric_limits<std::int64_t>::min();
constexpr std::int64_t latest = std::numeric_limits<std::int64_t>::max();

TEST(DateText, IsThatOfTheInstantMovedByTheWholeMinutesOfTheZone) {
    const struct {
        std::int64_t instant;
        long secondsWest;
        std::optional<std::string> text;
    } rows[] = {
        {0, 0, "1970-01-01-00:00:00"},
        {-1, 0, "1969-12-31-23:59:59"},
        {1709251199, 0, "2024-02-29-23:59:59"},
        {4107542400, 0, "2100-03-01-00:00:00"},
        {-62167219200, 0, "0000-01-01-00:00:00"},
        {-62167219201, 0, std::nullopt},
        {253402300799, 0, "9999-12-31-23:59:59"},
        {253402300800, 0, std::nullopt},
        {latest, 3600, std::nullopt},
        {earliest, -3600, std::nullopt},
        {1700000000, -3600, "2023-11-14-21:13:20"},
        {1700000000, 50400, "2023-11-15-12:13:20"},
        {1700000000, -45900, "2023-11-14-09:28:20"},
        // parts of a minute are cut towards zero
        {1700000000, 59, "2023-11-14-22:13:20"},
        {1700000000, -59, "2023-11-14-22:13:20"},
        {1700000000, 1172, "2023-11-14-22:32:20"},
        {1700000000, -1172, "2023-11-14-21:54:20"},
        // a zone may lead out of the calendar, but not back into it
        {253402300799, 60, std::nullopt},
        {253402300799, -60, "9999-12-31-23:58:59"},
        {-62167219200, -60, std::nullopt},
        {253402300800, -60, std::nullopt},
        {-62167219201, 60, std::nullopt},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(zonedDateText(row.instant, row.secondsWest), row.text)
            << row.instant << ' ' << row.secondsWest;
        if (row.secondsWest == 0) {
            EXPECT_EQ(civilDateText(row.instant), row.text) << row.instant;
        }
    }
}

// The boot time

TEST(BootTime, IsTheNumberOfTheBtimeLine) {
    EXPECT_EQ(parseBootTime("cpu  1 2\nbtime 1700000000\nprocesses 1\n"), 1700000000);
    EXPECT_EQ(parseBootTime("btime 18\nbtime 19\n"), 18);
    EXPECT_EQ(parseBootTime("btime 4102444800\n"), 4102444800);
    std::string interrupts = "intr 1";
    for (int i = 0; i < 200000; ++i) interrupts += " 0";
    EXPECT_EQ(parseBootTime(interrupts + "\nbtime 1700000000\n"), 1700000000);
}

TEST(BootTime, IsNotKnownFromALineThatIsNotWhole) {
    for (const char* text :
         {"", "btime", "btime ", "btime \n", "btime x\n", "btime -5\n", "btime 0\n", "btime 17000",
          "cpu\nbtime 1700000000", "xbtime 17\n", "btime 9223372036854775808\n",
          "btime 99999999999999999999999\n", "btime 17 18\n"}) {
        EXPECT_EQ(parseBootTime(text), std::nullopt) << '"' << text << '"';
    }
}

// The install date

TEST(PlausibleInstallDate, LiesAfter1991NotAfterTheBootAndNotInTheFuture) {
    const struct {
        std::int64_t instant;
        std::optional<std::int64_t> boot;
        bool plausible;
    } rows[] = {
        {-1, 1700000000, false},          {0, 1700000000, false},
        {694223999, 1700000000, false},   {694224000, 1700000000, true},
        {1700000000, 1700000000, true},   {1700000001, 1700000000, false},
        {1700000005, std::nullopt, true}, {1700000006, std::nullopt, false},
        {1700000006, 1800000000, false},
    };
    for (const auto& row : rows)
        EXPECT_EQ(isPlausibleInstallDate(row.instant, row.boot, 1700000005), row.plausible)
            << row.instant << testing::PrintToString(row.boot);
}

using Birth = std::optional<std::int64_t>;

TEST(InstallDate, IsTheFirstPlausibleOneOfRootInstallerAndMachineId) {
    // 1650000000 is 2022-04-15-05:20:00, 1660000000 is 2022-08-08-23:06:40, 1670000000 is
    // 2022-12-02-16:53:20; the host was booted at 1700000000. Births count of the root alone.
    const CountingFiles::Dates root{1650000000, 1699999999}, installer{1655000000, 1660000000},
        machineId{1665000000, 1670000000};
    const auto born = [](Birth birth) { return CountingFiles::Dates{birth, 1699999999}; };
    const struct {
        std::map<std::string, CountingFiles::Dates> dates;
        std::optional<std::string> text;
    } rows[] = {
        {{{"", root}, {"var/log/installer", installer}, {"etc/machine-id", machineId}},
         "2022-04-15-05:20:00"},
        {{{"", born(0)}, {"var/log/installer", installer}}, "2022-08-08-23:06:40"},
        {{{"", born(600000000)}, {"var/log/installer", installer}}, "2022-08-08-23:06:40"},
        {{{"", born(1700000001)}, {"var/log/installer", installer}}, "2022-08-08-23:06:40"},
        {{{"", born(1800000000)}, {"var/log/installer", installer}}, "2022-08-08-23:06:40"},
        {{{"", born(std::nullopt)},
          {"var/log/installer", installer},
          {"etc/machine-id", machineId}},
         "2022-08-08-23:06:40"},
        {{{"etc/machine-id", machineId}}, "2022-12-02-16:53:20"},
        {{{"var/log/installer", {std::nullopt, 1700000001}}, {"etc/machine-id", machineId}},
         "2022-12-02-16:53:20"},
        {{{"", born(0)}, {"etc/machine-id", {0, 1700000001}}}, std::nullopt},
        {{}, std::nullopt},
    };
    TestHost host;
    host.tree().writeCompleteHost();
    for (const auto& row : rows) {
        host.files->fixedDates = row.dates;
        EXPECT_EQ(host.text(InstallDate), row.text) << &row - rows;
    }
    host.files->fixedDates = rows[0].dates;
    host.files->resetCounts();
    host.text(InstallDate);
    EXPECT_EQ(host.files->counts().count("look at /etc/machine-id"), 0u);
}

TEST(InstallDate, MayLieBeyond2038AndWithoutABootTimeUpToNow) {
    TestHost host;
    host.files->fixedDates[""].birth = 1700050000;
    host.kernel->fixedBootTime = std::nullopt;
    EXPECT_EQ(host.text(InstallDate), "2023-11-15-12:06:40");
    host.files->fixedDates[""].birth = 1700100001;
    EXPECT_EQ(host.text(InstallDate), std::nullopt);
    host.tree().write("proc/stat", "btime 2300000000\n");
    host.kernel->fixedNow = 2300000100;
    host.files->fixedDates[""].birth = 2200000000;
    EXPECT_EQ(host.text(InstallDate), "2039-09-18-23:06:40");
}

// Zones

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
    TestHost host;
};

struct Zone {
    const char* tz;
    long timezone;
    const char* boot;     // of the instant 1700000000, 2023-11-14-22:13:20 UTC
    const char* install;  // of the instant 1650000000, 2022-04-15-05:20:00 UTC
};

const Zone zones[] = {
    {"CET-1", -3600, "2023-11-14-21:13:20", "2022-04-15-04:20:00"},
    {"UTC0", 0, "2023-11-14-22:13:20", "2022-04-15-05:20:00"},
    {"EST5EDT", 18000, "2023-11-15-03:13:20", "2022-04-15-10:20:00"},
    {"XXX14", 50400, "2023-11-15-12:13:20", "2022-04-15-19:20:00"},
    {"<+1245>-12:45", -45900, "2023-11-14-09:28:20", "2022-04-14-16:35:00"},
    {"LMT-0:19:32", -1172, "2023-11-14-21:54:20", "2022-04-15-05:01:00"},
};

TEST_F(TimeZones, TextIsTheInstantInUtcPlusTheZonesMinutes) {
    for (const Zone& zone : zones) {
        const ScopedZone scoped(zone.tz);
        ::tzset();
        ASSERT_EQ(::timezone, zone.timezone) << zone.tz;
        EXPECT_EQ(host.text(LastBootUpTime), zone.boot) << zone.tz;
        EXPECT_EQ(host.text(InstallDate), zone.install) << zone.tz;
    }
}

// Whoever wants the zone set up does it: a value that nobody set stays, and is the one that counts.
TEST_F(TimeZones, NoReadSetsUpTheZoneOfTheProcess) {
    const ScopedZone scoped("EST5");
    const std::pair<long, const char*> untouched[] = {
        {0, "2023-11-14-22:13:20"}, {-3600, "2023-11-14-21:13:20"}, {12345, "2023-11-15-01:38:20"}};
    for (const auto& [zone, boot] : untouched) {
        ::timezone = zone;
        readEverything(*host.cursor());
        EXPECT_EQ(::timezone, zone);
        EXPECT_EQ(host.text(LastBootUpTime), boot);
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
