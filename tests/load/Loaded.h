#ifndef TESTS_LOAD_LOADED_H
#define TESTS_LOAD_LOADED_H

#include <string>

#include "host/broker/ComputerSystemService.h"
#include "host/broker/Invoke.h"
#include "load/Requests.h"

namespace load {

/// A built library with the framework's own logging, under a strict broker with the schema that
/// serves one computer system, "host1". Several threads may ask at once.
class Loaded {
  public:
    explicit Loaded(const Server& server);

    cmpihost::Outcome answer(const cmpihost::OperationRequest& request);

    /// Calls both factories again with the same broker, and both cleanups without terminating.
    /// Returns what is wrong with what they answered, empty when nothing is.
    std::string callEntryPointsAgain();

  private:
    std::string name_;
    cmpihost::ComputerSystemService computers_{"host1"};
    cmpihost::Broker broker_;
    cmpihost::ProviderLibrary library_;
};

/// Whether a request had the same effect twice: status, results, calls of returnDone and what the
/// broker caught.
bool sameAnswer(const cmpihost::Outcome& left, const cmpihost::Outcome& right);

}  // namespace load

#endif
