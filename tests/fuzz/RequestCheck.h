// What a request must leave behind, whatever it held.
#pragma once

#include <optional>

#include "fuzz/Scene.h"
#include "host/broker/Broker.h"
#include "host/broker/Invoke.h"

namespace fuzz {

/// How a request ended.
struct Ending {
    /// None: an exception left the handler.
    std::optional<cmpihost::Outcome> outcome;
    bool foreignException = false;
    unsigned faultsFired = 0;
};

/// Ends the program where the broker has something to complain of.
void checkManners(const Scene& scene, cmpihost::Broker& broker);

/// Ends the program where the request to the provider broke a rule; the records are those of
/// StrictLog.
void checkEnding(const Scene& scene, const Ending& ending, cmpihost::Broker& broker);

}  // namespace fuzz
