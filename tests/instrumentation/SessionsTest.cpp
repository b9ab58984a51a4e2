#include "framework/instrumentation/Linux/Sessions.h"

#include <gtest/gtest.h>

#include "support/TestHost.h"

namespace {

using VA::Linux::countUtmpSessions;
using VA::Linux::isUserSession;
using VA::NodeLexicon::NumberOfUsers;

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

TEST(UtmpSessions, AreTheUserProcessRecordsWhoseProcessLives) {
    const auto user = [](std::int32_t pid) { return utmpRecord(utmpUserProcess, pid, "ada"); };
    const std::string others = utmpRecord(utmpBootTime, 1, "reboot") +
                               utmpRecord(utmpLoginProcess, 700, "LOGIN") +
                               utmpRecord(utmpDeadProcess, 1300, "bob") + utmpRecord(0, 1, "");
    const auto livesOnly = [](std::int32_t living) {
        return [living](std::int32_t pid) { return pid == living; };
    };
    const struct {
        std::string utmp;
        std::function<bool(std::int32_t)> isAlive;
        std::optional<std::uint32_t> count;
    } rows[] = {
        {"", everyPidLives, 0u},
        {others + user(1200) + others + user(1400) + user(1), everyPidLives, 3u},
        {user(1200) + user(1201), livesOnly(1201), 1u},
        // records that name no process
        {user(0) + user(-1), everyPidLives, 0u},
        {user(0) + user(-1), noPidLives, 0u},
        // all processes unknown: those of another pid namespace
        {user(1200), noPidLives, std::nullopt},
        {user(1200) + user(1200), noPidLives, std::nullopt},
        {others, noPidLives, 0u},
        // no whole number of records
        {user(1200) + "x", everyPidLives, std::nullopt},
        {user(1200).substr(1), everyPidLives, std::nullopt},
        {"not a utmp file", everyPidLives, std::nullopt},
    };
    for (const auto& row : rows)
        EXPECT_EQ(countUtmpSessions(row.utmp, row.isAlive), row.count) << &row - rows;
}

// Those of a host

struct HostSessions : testing::Test {
    HostSessions() { host.tree().writeCompleteHost(); }
    const FixtureTree& tree() { return host.tree(); }
    std::optional<unsigned int> users() { return host.number(NumberOfUsers); }
    TestHost host;
};

TEST_F(HostSessions, UtmpStandsInForSessions) {
    tree().remove("run/systemd");
    EXPECT_EQ(users(), std::nullopt);
    tree().write("var/run/utmp", utmpRecord(utmpUserProcess, 20, "ada"));
    EXPECT_EQ(users(), 1u);
    tree().write("run/utmp", "");
    EXPECT_EQ(users(), 0u);
    tree().write("run/utmp", "broken");
    EXPECT_EQ(users(), 1u);
    tree().write("var/run/utmp", "broken too");
    EXPECT_EQ(users(), std::nullopt);
    tree().write("var/run/utmp", std::string(384 * 3000, '\0'));  // more than is read of a file
    EXPECT_EQ(users(), std::nullopt);
}

TEST_F(HostSessions, UsersAreThoseWhoseProcessTheKernelKnowsWhateverProcHides) {
    tree().remove("run/systemd");
    tree().write("run/utmp",
                 utmpRecord(utmpUserProcess, 20, "ada") + utmpRecord(utmpUserProcess, 21, "bob"));
    EXPECT_EQ(users(), 1u);
    tree().remove("proc");
    EXPECT_EQ(users(), 1u);
    host.kernel->livingPids.insert(21);
    EXPECT_EQ(users(), 2u);
}

TEST_F(HostSessions, UsersAreNotKnownFromTheUtmpOfAnotherPidNamespace) {
    tree().remove("run/systemd");
    tree().write("run/utmp",
                 utmpRecord(utmpUserProcess, 21, "ada") + utmpRecord(utmpUserProcess, 22, "bob"));
    EXPECT_EQ(users(), std::nullopt);
    tree().write("var/run/utmp", utmpRecord(utmpUserProcess, 20, "ada"));
    EXPECT_EQ(users(), 1u);
}

TEST_F(HostSessions, SessionFileThatIsBeingWrittenDoesNotCount) {
    tree().write("run/systemd/sessions/.#3abcdef", "UID=1002\nSTATE=active\nCLASS=user\n");
    EXPECT_EQ(users(), 2u);
}

TEST_F(HostSessions, UsersAreNeverTooFewByMistakeWhereASessionCannotBeRead) {
    tree().write("run/utmp", "");
    tree().write("large", std::string(1024 * 1024 + 1, '\n'));
    struct Case {
        const char* target;  // of the link in the session's place
        std::optional<unsigned int> users;
    };
    const Case cases[] = {
        {"/proc/self/mem", std::nullopt},  // opens, but cannot be read
        {"1", std::nullopt},               // a loop, which cannot be opened
        {"../../../large", std::nullopt},
        {"nowhere", 1u},
        {"/dev/null", 1u},
    };
    for (const Case& each : cases) {
        tree().remove("run/systemd/sessions/1");
        tree().makeLink("run/systemd/sessions/1", each.target);
        EXPECT_EQ(users(), each.users) << each.target;
    }
}

TEST_F(HostSessions, FolderWithoutSessionsMeansNobodyWhateverUtmpSays) {
    tree().write("run/utmp", utmpRecord(utmpUserProcess, 20, "ada"));
    tree().remove("run/systemd/sessions");
    tree().makeFolder("run/systemd/sessions");
    EXPECT_EQ(users(), 0u);
}

}  // namespace
