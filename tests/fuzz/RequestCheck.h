// Runs the request of an input against the handlers of a library, and what it must leave behind.
#ifndef TESTS_FUZZ_REQUEST_CHECK_H
#define TESTS_FUZZ_REQUEST_CHECK_H

#include <optional>

#include "fuzz/FuzzCase.h"
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
void checkViolations(const FuzzCase& fuzzCase, cmpihost::Broker& broker);

/// Ends the program where the request to the provider broke a rule; the records are those of
/// StrictLog.
void checkEnding(const FuzzCase& fuzzCase, const Ending& ending, cmpihost::Broker& broker);

/// Calls the factories of the library, and the rules for how its requests end.
using Factories = cmpihost::ManagementInterfaces (*)(const CMPIBroker* broker);
using Check = void (*)(const FuzzCase& fuzzCase, const Ending& ending, cmpihost::Broker& broker);

/// Under a strict broker with the schema, on a simulated host. With FUZZ_SHOW in the environment
/// the input and how it ended are told, for people.
void runRequest(const std::uint8_t* data, std::size_t size, Factories factories, Check check);

}  // namespace fuzz

#endif
