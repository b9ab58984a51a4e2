// All that surrounds one request: the host, the broker, what fails in them, and the request itself.
#ifndef TESTS_FUZZ_FUZZ_CASE_H
#define TESTS_FUZZ_FUZZ_CASE_H

#include <memory>
#include <string>
#include <vector>

#include "fuzz/Decoder.h"
#include "host/broker/Broker.h"
#include "host/broker/FaultPlan.h"
#include "host/broker/Invoke.h"
#include "support/SimulatedHost.h"

namespace fuzz {

/// Answers every up-call for computer systems alike.
class ComputerSystems final : public cmpihost::UpcallService {
  public:
    cmpihost::UpcallAnswer perform(cmpihost::Broker&, const cmpihost::OperationRequest&) override {
        return answer;
    }

    cmpihost::UpcallAnswer answer;
};

/// An exception of no type that the provider knows.
struct ForeignException {};

/// What the instrumentation throws.
enum class HostException : unsigned { None, Standard, Framework, NoMemory, Foreign };

struct FuzzCase {
    cmpihost::OperationRequest request;
    cmpihost::BrokerOptions options;
    std::shared_ptr<VA::SimulatedHost> host = std::make_shared<VA::SimulatedHost>();
    std::size_t nodes = 0;
    /// False: the broker knows nobody who serves computer systems.
    bool computersServed = true;
    ComputerSystems computers;
    /// Whether among them are instances of anything.
    bool oddComputers = false;
    std::vector<cmpihost::Fault> faults;
    /// From this call of the result on it fails; 0: none does.
    unsigned resultFailsFrom = 0;
    HostException exception = HostException::None;
    /// The first record that throws; 0: none does.
    std::uint64_t logThrowsFrom = 0;
};

/// Where the input ends, the rest is plain: one running node, one computer system, nothing fails.
FuzzCase decodeCase(Decoder& input);

/// For people: what is asked, of which host, under which faults.
std::string describe(const FuzzCase& fuzzCase);

}  // namespace fuzz

#endif
