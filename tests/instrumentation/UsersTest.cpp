#include "framework/instrumentation/Linux/Sessions.h"

#include <gtest/gtest.h>

#include "tests/instrumentation/UtmpFile.h"

namespace {

using VA::Linux::countUtmpSessions;
using VA::Linux::isUserSession;

bool everyPidLives(std::int32_t) {
    return true;
}

bool noPidLives(std::int32_t) {
    return false;
}

TEST(UserSessions, AreThoseOfClassUserThatAreNotClosing) {
    EXPECT_TRUE(isUserSession("UID=0\nCLASS=user\n"));
    EXPECT_TRUE(isUserSession("UID=0\nSTATE=active\nCLASS=user\n"));
    EXPECT_TRUE(isUserSession("STATE=online\nCLASS=user\n"));
    for (const char* kind : {"user", "user-early", "user-light", "user-early-light"}) {
        EXPECT_TRUE(isUserSession(std::string("STATE=active\nCLASS=") + kind + "\n")) << kind;
        EXPECT_FALSE(isUserSession(std::string("STATE=closing\nCLASS=") + kind + "\n")) << kind;
    }
    for (const char* other : {"greeter", "lock-screen", "background", "background-light", "manager",
                              "manager-early", "user-incomplete", "light", "USER", ""}) {
        EXPECT_FALSE(isUserSession(std::string("STATE=active\nCLASS=") + other + "\n")) << other;
    }
    EXPECT_FALSE(isUserSession("STATE=active\n"));
    EXPECT_FALSE(isUserSession(""));
}

TEST(UtmpUsers, AreTheUserProcessRecords) {
    const std::string utmp =
        utmpRecord(utmpBootTime, 0, "reboot") + utmpRecord(utmpLoginProcess, 700, "LOGIN") +
        utmpRecord(utmpUserProcess, 1200, "ada") + utmpRecord(utmpDeadProcess, 1300, "bob") +
        utmpRecord(utmpUserProcess, 1400, "ada") + utmpRecord(0, 0, "");
    EXPECT_EQ(countUtmpSessions(utmp, everyPidLives), 2u);
}

TEST(UtmpUsers, ThoseWhoseProcessHasGoneDoNotCount) {
    const std::string utmp =
        utmpRecord(utmpUserProcess, 1200, "ada") + utmpRecord(utmpUserProcess, 1201, "bob");
    EXPECT_EQ(countUtmpSessions(utmp, [](std::int32_t pid) { return pid == 1201; }), 1u);
}

TEST(UtmpUsers, AreNotKnownWhereRecordsAreThereAndNoneOfTheirProcesses) {
    const std::string ada = utmpRecord(utmpUserProcess, 1200, "ada");
    EXPECT_EQ(countUtmpSessions(ada, noPidLives), std::nullopt);
    EXPECT_EQ(countUtmpSessions(ada + ada, noPidLives), std::nullopt);
    EXPECT_EQ(countUtmpSessions(utmpRecord(utmpDeadProcess, 1200, "ada"), noPidLives), 0u);
}

TEST(UtmpUsers, RecordWithoutAProcessDoesNotCount) {
    for (const std::int32_t none : {0, -1}) {
        EXPECT_EQ(countUtmpSessions(utmpRecord(utmpUserProcess, none, "ada"), everyPidLives), 0u);
        EXPECT_EQ(countUtmpSessions(utmpRecord(utmpUserProcess, none, "ada"), noPidLives), 0u);
    }
    EXPECT_EQ(countUtmpSessions(utmpRecord(utmpUserProcess, 1, "ada"), everyPidLives), 1u);
}

TEST(UtmpUsers, EmptyFileTellsOfNobody) {
    EXPECT_EQ(countUtmpSessions("", everyPidLives), 0u);
}

TEST(UtmpUsers, FileThatIsNotAWholeNumberOfRecordsTellsNothing) {
    const std::string utmp = utmpRecord(utmpUserProcess, 1200, "ada");
    EXPECT_EQ(countUtmpSessions(utmp + "x", everyPidLives), std::nullopt);
    EXPECT_EQ(countUtmpSessions(utmp.substr(1), everyPidLives), std::nullopt);
    EXPECT_EQ(countUtmpSessions("not a utmp file", everyPidLives), std::nullopt);
}

}  // namespace
