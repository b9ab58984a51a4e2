// Runs the request of an input against the handlers of a library.
#pragma once

#include "fuzz/RequestCheck.h"

namespace fuzz {

/// Calls the factories of the library, and the rules for how its requests end.
using Factories = cmpihost::ManagementInterfaces (*)(const CMPIBroker* broker);
using Check = void (*)(const Scene& scene, const Ending& ending, cmpihost::Broker& broker);

/// Under a strict broker with the schema, on a simulated host. With FUZZ_SHOW in the environment
/// the input and how it ended are told, for people.
void runRequest(const std::uint8_t* data, std::size_t size, Factories factories, Check check);

}  // namespace fuzz
