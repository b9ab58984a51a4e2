#ifndef VA_LINUX_ASSIGNMENTS_H
#define VA_LINUX_ASSIGNMENTS_H

#include <optional>
#include <string>
#include <string_view>

namespace VA::Linux {

/// The value that `name` has in a file of shell-like assignments, one a line: os-release, and the
/// session files of systemd. The last assignment wins; nothing where there is none.
///
/// A value may stand in double quotes, where a backslash escapes $ " ` and itself; in single
/// quotes, where nothing is escaped; or bare, where a backslash escapes any character and blanks at
/// the end do not count. A comment starts with # at the start of a line or after a blank. A line
/// that is no such assignment counts as if it were not there.
std::optional<std::string> assignedValue(std::string_view text, std::string_view name);

}  // namespace VA::Linux

#endif
