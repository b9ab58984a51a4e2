#ifndef ZBLOG_CONFIGURATION_H
#define ZBLOG_CONFIGURATION_H

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

enum class Destination { nowhere, standardError, systemLog, file };

/// What one channel writes, and where to.
struct ChannelConfiguration {
    Destination destination = Destination::nowhere;
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

}  // namespace ZBLog

#endif
