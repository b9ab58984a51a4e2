#ifndef FRAMEWORK_LOGGING_CONFIGURATION_H
#define FRAMEWORK_LOGGING_CONFIGURATION_H

#include <array>
#include <string>
#include <string_view>
#include <vector>

#include "Record.h"

namespace ZBLog {

/// Which categories pass: all of them, or those that match one of some patterns. A pattern is a
/// category's name, or the beginning of one followed by '*'. Letter case matters.
class CategoryFilter {
  public:
    /// Adds a pattern; with the first one, only what matches passes.
    void add(std::string_view pattern);

    bool passes(std::string_view category) const noexcept;

  private:
    std::vector<std::string> patterns_;  // none: everything passes
};

enum class Destination { off, standardError, systemLog, file };

/// What one channel writes, and where to.
struct ChannelConfiguration {
    Destination destination = Destination::off;
    std::string path;           ///< of the file, absolute; else empty
    int level = 4000;           ///< the finest level that passes, 0 to 999999
    bool failuresOnly = false;  ///< whether only message records pass
    CategoryFilter categories;
};

/// What holds where nothing is configured: failures go to the system's log, nothing is traced.
struct Configuration {
    Configuration();

    std::array<ChannelConfiguration, channelCount> channels;

    ChannelConfiguration& of(Channel channel) { return channels[indexOf(channel)]; }
    const ChannelConfiguration& of(Channel channel) const { return channels[indexOf(channel)]; }
};

/// One thing that is wrong with a configuration.
struct ConfigurationError {
    unsigned line;        ///< counted from 1; 0 when it is the whole text that is wrong
    std::string message;  ///< printable, without an end of line
};

struct ParsedConfiguration {
    Configuration configuration;
    std::vector<ConfigurationError> errors;
};

/// Most bytes that a configuration may have, and most errors that are reported of one.
constexpr std::size_t configurationSizeLimit = 64 * 1024;
constexpr std::size_t configurationErrorLimit = 10;

/// Reads a configuration. The text consists of lines, each of which ends in a newline; the last one
/// may lack it. Blanks are space, tab and carriage return; those around a line, a key, a value and
/// an item of a list do not count. A line is one of
///
///     nothing              passed over
///     # anything           a comment, on a line of its own; '#' elsewhere is an ordinary character
///     KEY = VALUE          a setting; each key at most once, in any order
///
/// Keys, by channel, and what their values are; letter case matters everywhere:
///
///     log.sink             off | stderr | syslog | file:PATH        (when not set: syslog)
///     log.level            one to six decimal digits                (3000)
///     log.records          all | failures                           (failures)
///     log.category         PATTERN, PATTERN, ...                    (*)
///     trace.sink           as above                                 (off)
///     trace.level                                                   (4000)
///     trace.records                                                 (all)
///     trace.category                                                (*)
///
/// PATH is absolute, does not end in '/' and has at most 4095 bytes. `level` is the finest level
/// that passes. `failures` lets only message records pass. PATTERN is a category's name without
/// blanks; a '*' at its end, and only there, stands for any continuation. Control characters are
/// allowed in comments alone.
///
/// Any error leaves the whole configuration at its defaults: half a configuration is none. A text
/// of more than configurationSizeLimit bytes is one error and is not looked into; after
/// configurationErrorLimit errors reading stops, with one more that says so.
/// A pure function; throws std::bad_alloc only.
ParsedConfiguration parseConfiguration(std::string_view text);

}  // namespace ZBLog

#endif
