#ifndef VA_LINUX_USERS_H
#define VA_LINUX_USERS_H

#include <cstdint>
#include <functional>
#include <optional>
#include <string_view>

namespace VA::Linux {

/// True for a session file of systemd that describes a session of a user (CLASS=user, or
/// user-early), be it active or not, that is not being closed (STATE=closing): its user has left.
bool isUserSession(std::string_view sessionFile);

/// The number of user sessions in a utmp file: its USER_PROCESS records whose process passes
/// `isAlive`. Nothing for a file that is not a whole number of records.
std::optional<std::uint32_t> countUtmpUsers(std::string_view utmp,
                                            const std::function<bool(std::uint64_t)>& isAlive);

}  // namespace VA::Linux

#endif
