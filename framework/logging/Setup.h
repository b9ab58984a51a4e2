#ifndef ZBLOG_SETUP_H
#define ZBLOG_SETUP_H

#include <array>
#include <memory>

#include "Configuration.h"
#include "Sink.h"
#include "Surroundings.h"

namespace ZBLog {

/// A configuration in force: what it says, and the sinks that it needs. What readers look at never
/// changes.
struct Setup {
    Configuration configuration;
    std::array<std::shared_ptr<Sink>, channelCount> sinks;  ///< null: nowhere
    std::unique_ptr<Setup> older;  ///< replaced ones that somebody may still be reading
};

/// Sets up `configuration`. Channels with the same destination share one sink, so that their lines
/// do not get in each other's way, and a sink that `former` (may be null) has already is taken
/// over with all it knows. Nothing is opened yet. Throws std::bad_alloc.
std::unique_ptr<Setup> makeSetup(const Configuration& configuration, const Setup* former,
                                 Surroundings& surroundings);

}  // namespace ZBLog

#endif
