#ifndef FRAMEWORK_INSTRUMENTATION_LINUX_SESSIONS_H
#define FRAMEWORK_INSTRUMENTATION_LINUX_SESSIONS_H

#include <cstdint>
#include <functional>
#include <optional>
#include <string_view>

#include "Files.h"
#include "Kernel.h"

/// Who is logged in. Counts are at most 4294967295.
namespace VA::Linux {

/// True for a session file of systemd that describes a session of a user (CLASS=user, user-early,
/// user-light or user-early-light), be it active or not, that is not being closed (STATE=closing):
/// its user has left.
bool isUserSession(std::string_view sessionFile);

/// The sessions that systemd lists.
struct SessionCount {
    bool listed = false;                  ///< false where run/systemd/sessions cannot be read
    std::optional<std::uint32_t> number;  ///< nullopt also if a file in it cannot be read
};

/// Counts such files in run/systemd/sessions. One that has gone since it was listed does not count.
SessionCount countSystemdSessions(TrackedFiles& files);

/// The number of user sessions in a utmp file: its USER_PROCESS records whose process passes
/// `isAlive`. Returns nullopt for a file that is not a whole number of records, and for one with
/// such records of which none is alive: it may list the processes of another pid namespace.
std::optional<std::uint32_t> countUtmpSessions(
    std::string_view utmp, const std::function<bool(std::int32_t pid)>& isAlive);

/// The user sessions of a host: those that systemd lists or, where it lists none at all, those of
/// run/utmp or var/run/utmp. Returns nullopt if neither is known.
std::optional<std::uint32_t> countSessions(const HostFiles& files, const Kernel& kernel,
                                           FileCache<SessionCount>& cache);

}  // namespace VA::Linux

#endif
