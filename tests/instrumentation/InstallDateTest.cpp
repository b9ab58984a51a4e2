#include "framework/instrumentation/Linux/Dates.h"

#include <gtest/gtest.h>

#include "tests/instrumentation/HostParts.h"

namespace {

using VA::Linux::isPlausibleInstallDate;
using VA::NodeLexicon::InstallDate;

TEST(PlausibleInstallDate, LiesAfter1991) {
    EXPECT_FALSE(isPlausibleInstallDate(-1, 1700000000, 1700000001));
    EXPECT_FALSE(isPlausibleInstallDate(0, 1700000000, 1700000001));
    EXPECT_FALSE(isPlausibleInstallDate(694223999, 1700000000, 1700000001));
    EXPECT_TRUE(isPlausibleInstallDate(694224000, 1700000000, 1700000001));
}

TEST(PlausibleInstallDate, LiesNeitherAfterTheBootNorInTheFuture) {
    EXPECT_TRUE(isPlausibleInstallDate(1700000000, 1700000000, 1700000005));
    EXPECT_FALSE(isPlausibleInstallDate(1700000001, 1700000000, 1700000005));
    EXPECT_TRUE(isPlausibleInstallDate(1700000005, std::nullopt, 1700000005));
    EXPECT_FALSE(isPlausibleInstallDate(1700000006, std::nullopt, 1700000005));
    EXPECT_FALSE(isPlausibleInstallDate(1700000006, 1800000000, 1700000005));
}

// A host booted at 1700000000; 1650000000 is 2022-04-15-05:20:00, 1660000000 is
// 2022-08-08-23:06:40, 1670000000 is 2022-12-02-16:53:20.
class InstallDateOrder : public testing::Test {
  protected:
    InstallDateOrder() {
        host.tree().writeCompleteHost();
        host.files->fixedDates = {{"", {1650000000, 1699999999}},
                                  {"var/log/installer", {1655000000, 1660000000}},
                                  {"etc/machine-id", {1665000000, 1670000000}}};
    }

    FixtureHost host;
};

TEST_F(InstallDateOrder, BirthOfTheRootFolderComesFirst) {
    EXPECT_EQ(host.text(InstallDate), "2022-04-15-05:20:00");
    EXPECT_EQ(host.files->counts().count("look at /etc/machine-id"), 0u);
}

TEST_F(InstallDateOrder, ImplausibleBirthGivesWayToTheChangeOfTheInstallerFolder) {
    for (const std::int64_t birth : {std::int64_t{0}, std::int64_t{600000000},
                                     std::int64_t{1700000001}, std::int64_t{1800000000}}) {
        host.files->fixedDates[""].birth = birth;
        EXPECT_EQ(host.text(InstallDate), "2022-08-08-23:06:40") << birth;
    }
}

TEST_F(InstallDateOrder, FileSystemWithoutBirthTimesGivesWayToo) {
    host.files->fixedDates[""].birth = std::nullopt;
    EXPECT_EQ(host.text(InstallDate), "2022-08-08-23:06:40");
}

TEST_F(InstallDateOrder, ChangeOfTheMachineIdComesLast) {
    host.files->fixedDates.erase("");
    host.files->fixedDates.erase("var/log/installer");
    EXPECT_EQ(host.text(InstallDate), "2022-12-02-16:53:20");
    host.files->fixedDates["var/log/installer"] = {std::nullopt, 1700000001};
    EXPECT_EQ(host.text(InstallDate), "2022-12-02-16:53:20");
}

TEST_F(InstallDateOrder, IsAbsentWhereNothingIsPlausible) {
    host.files->fixedDates = {{"", {0, 0}}, {"etc/machine-id", {0, 1700000001}}};
    EXPECT_EQ(host.text(InstallDate), std::nullopt);
    host.files->fixedDates.clear();
    EXPECT_EQ(host.text(InstallDate), std::nullopt);
}

TEST_F(InstallDateOrder, WithoutABootTimeOnlyTheFutureIsImplausible) {
    host.tree().remove("proc/stat");
    host.kernel->fixedBootTime = std::nullopt;
    host.files->fixedDates[""].birth = 1700050000;
    EXPECT_EQ(host.text(InstallDate), "2023-11-15-12:06:40");
    host.files->fixedDates[""].birth = 1700100001;
    EXPECT_EQ(host.text(InstallDate), "2022-08-08-23:06:40");
}

TEST_F(InstallDateOrder, MayLieBeyond2038) {
    host.tree().write("proc/stat", "btime 2300000000\n");
    host.kernel->fixedNow = 2300000100;
    host.files->fixedDates[""].birth = 2200000000;
    EXPECT_EQ(host.text(InstallDate), "2039-09-18-23:06:40");
}

}  // namespace
