#include "Users.h"

#include <utmpx.h>

#include <cstring>

#include "Assignments.h"
#include "Numbers.h"

namespace VA::Linux {

bool isUserSession(std::string_view sessionFile) {
    // "user-early" is how newer versions call a session of root's.
    const auto sessionClass = assignedValue(sessionFile, "CLASS");
    return (sessionClass == "user" || sessionClass == "user-early") &&
           assignedValue(sessionFile, "STATE") != "closing";
}

std::optional<std::uint32_t> countUtmpUsers(std::string_view utmp,
                                            const std::function<bool(std::uint64_t)>& isAlive) {
    // Only the layout is taken from the C library: its own reader is one shared cursor.
    struct utmpx record;
    if (utmp.size() % sizeof record != 0) return std::nullopt;
    std::uint64_t count = 0;
    for (std::size_t offset = 0; offset < utmp.size(); offset += sizeof record) {
        std::memcpy(&record, utmp.data() + offset, sizeof record);
        if (record.ut_type != USER_PROCESS || record.ut_pid <= 0) continue;
        if (isAlive(static_cast<std::uint64_t>(record.ut_pid))) ++count;
    }
    return saturated(count);
}

}  // namespace VA::Linux
