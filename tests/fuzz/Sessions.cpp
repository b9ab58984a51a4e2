// The files that tell who is logged in: the session files of systemd, and utmp.
#include <utmpx.h>

#include "framework/instrumentation/Linux/Parsing.h"
#include "framework/instrumentation/Linux/Sessions.h"
#include "fuzz/Invariant.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(fuzz::textOf(data, size));
    const bool counted = VA::Linux::isUserSession(text);
    const auto sessionClass = VA::Linux::envFileValue(text, "CLASS");
    if (counted)
        fuzz::expect(sessionClass && sessionClass->substr(0, 4) == "user",
                     "only sessions of users count");
    fuzz::expect(!VA::Linux::isUserSession(text + "\nSTATE=closing\n"),
                 "a session that is being closed does not count");

    const auto users = VA::Linux::countUtmpSessions(text, [](std::int32_t) { return true; });
    fuzz::expect(users.has_value() == (size % sizeof(utmpx) == 0), "utmp is made of whole records");
    const auto even =
        VA::Linux::countUtmpSessions(text, [](std::int32_t pid) { return pid % 2 == 0; });
    if (users) {
        fuzz::expect(*users <= size / sizeof(utmpx), "a record is one user at most");
        fuzz::expect(even.has_value() == (*users == 0 || even > 0U),
                     "who has a record, and no process that is known, is not known");
        fuzz::expect(even.value_or(0) <= *users, "a user's process is alive");
    }
    return 0;
}
