#include "Users.h"

#include <utmpx.h>

#include <algorithm>
#include <cstring>
#include <iterator>
#include <string>

#include "Assignments.h"
#include "Numbers.h"

namespace VA::Linux {

bool isUserSession(std::string_view sessionFile) {
    // The early ones are root's, and may come before others are let in; the light ones have no
    // service manager of their own.
    constexpr std::string_view classes[] = {"user", "user-early", "user-light", "user-early-light"};
    const auto sessionClass = assignedValue(sessionFile, "CLASS");
    return std::find(std::begin(classes), std::end(classes), sessionClass) != std::end(classes) &&
           assignedValue(sessionFile, "STATE") != "closing";
}

UserSessions countUserSessions(SourceFiles& files) {
    const std::string folder = "run/systemd/sessions";
    const auto names = files.names(folder);
    if (!names) return {false, std::nullopt};
    std::uint64_t count = 0;
    for (const std::string& name : *names) {
        if (name.front() == '.') continue;  // a session file that is being written
        const auto file = files.read(folder + '/' + name);
        if (file && isUserSession(file->text)) ++count;
    }
    // A session that cannot be read may be one more.
    if (files.metFailure()) return {true, std::nullopt};
    return {true, saturated(count)};
}

std::optional<std::uint32_t> countUtmpUsers(std::string_view utmp,
                                            const std::function<bool(std::int32_t pid)>& isAlive) {
    // Only the layout is taken from the C library: its own reader is one shared cursor.
    struct utmpx record;
    if (utmp.size() % sizeof record != 0) return std::nullopt;
    std::uint64_t listed = 0;
    std::uint64_t alive = 0;
    for (std::size_t offset = 0; offset < utmp.size(); offset += sizeof record) {
        std::memcpy(&record, utmp.data() + offset, sizeof record);
        if (record.ut_type != USER_PROCESS || record.ut_pid <= 0) continue;
        ++listed;
        if (isAlive(record.ut_pid)) ++alive;
    }
    if (listed > 0 && alive == 0) return std::nullopt;
    return saturated(alive);
}

}  // namespace VA::Linux
