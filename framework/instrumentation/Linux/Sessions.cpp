// A number that is too small would pass for the truth: where one session cannot be read, or where
// utmp is that of others, the number is not known.
#include "Sessions.h"

#include <utmpx.h>

#include <algorithm>
#include <cstring>
#include <iterator>
#include <string>

#include "Parsing.h"

namespace VA::Linux {

namespace {

std::optional<std::uint32_t> readUtmp(const std::string& path, const HostFiles& files,
                                      const Kernel& kernel) {
    const auto file = TrackedFiles(files, kernel.now()).read(path);
    if (!file || !file->whole) return std::nullopt;
    return countUtmpSessions(file->text,
                             [&kernel](std::int32_t pid) { return kernel.isAlive(pid); });
}

}  // namespace

bool isUserSession(std::string_view sessionFile) {
    // The early ones are root's, and may come before others are let in; the light ones have no
    // service manager of their own.
    constexpr std::string_view classes[] = {"user", "user-early", "user-light", "user-early-light"};
    const auto sessionClass = envFileValue(sessionFile, "CLASS");
    return std::find(std::begin(classes), std::end(classes), sessionClass) != std::end(classes) &&
           envFileValue(sessionFile, "STATE") != "closing";
}

SessionCount countSystemdSessions(TrackedFiles& files) {
    const std::string directory = "run/systemd/sessions/";
    const auto names = files.names("run/systemd/sessions");
    if (!names) return {false, std::nullopt};
    std::uint64_t count = 0;
    for (const std::string& name : *names) {
        if (name.front() == '.') continue;  // a session file that is being written
        const auto file = files.read(directory + name);
        if (file && isUserSession(file->text)) ++count;
    }
    // A session that cannot be read may be one more.
    if (files.failed()) return {true, std::nullopt};
    return {true, clampToUint32(count)};
}

std::optional<std::uint32_t> countUtmpSessions(
    std::string_view utmp, const std::function<bool(std::int32_t pid)>& isAlive) {
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
    return clampToUint32(alive);
}

std::optional<std::uint32_t> countSessions(const HostFiles& files, const Kernel& kernel,
                                           FileCache<SessionCount>& cache) {
    const auto sessions = cache.get(files, kernel, countSystemdSessions);
    if (sessions->listed) return sessions->number;
    const auto users = readUtmp("run/utmp", files, kernel);
    return users ? users : readUtmp("var/run/utmp", files, kernel);
}

}  // namespace VA::Linux
