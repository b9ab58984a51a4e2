#ifndef FRAMEWORK_INSTRUMENTATION_LINUX_PARSING_H
#define FRAMEWORK_INSTRUMENTATION_LINUX_PARSING_H

#include <cstdint>
#include <limits>
#include <optional>
#include <string>
#include <string_view>

/// Texts as the kernel and systemd write them, and the 32-bit values that properties are made of.
/// Nothing here keeps state: any thread may call.
namespace VA::Linux {

/// Calls `visit(line, ended)` for each line of `text`, without its newline. `ended` is false only
/// for a last line that has none, which may have been cut short.
template <class Visit>
void forEachLine(std::string_view text, Visit visit) {
    while (!text.empty()) {
        const auto newline = text.find('\n');
        const bool ended = newline != std::string_view::npos;
        visit(text.substr(0, newline), ended);
        text.remove_prefix(ended ? newline + 1 : text.size());
    }
}

/// True for one or more decimal digits and nothing else.
bool isAllDigits(std::string_view text);

/// The value of a text that is all digits; nullopt for any other text, and for one past 64 bits.
std::optional<std::uint64_t> parseDecimal(std::string_view text);

/// `value`, or the largest 32-bit number where that is less.
constexpr std::uint32_t clampToUint32(std::uint64_t value) {
    constexpr std::uint32_t largest = std::numeric_limits<std::uint32_t>::max();
    return value < largest ? static_cast<std::uint32_t>(value) : largest;
}

/// The sum, or the largest 32-bit number where that is less.
constexpr std::uint32_t clampedSum(std::uint32_t first, std::uint32_t second) {
    return clampToUint32(std::uint64_t{first} + second);
}

/// True for text that can be shown and used as a key: 1 to 256 characters of valid UTF-8, none of
/// them a control character, not all of them blanks.
bool isPlainText(std::string_view text);

/// The value that `name` has in an environment file, shell-like assignments, one a line:
/// os-release, and the session files of systemd. The last assignment wins; nullopt if there is
/// none.
///
/// A value may stand in double quotes, where a backslash escapes $ " ` and itself; in single
/// quotes, where nothing is escaped; or bare, where a backslash escapes any character and blanks at
/// the end do not count. A comment starts with # at the start of a line or after a blank. A line
/// that is no such assignment counts as if it were not there.
std::optional<std::string> envFileValue(std::string_view text, std::string_view name);

}  // namespace VA::Linux

#endif
