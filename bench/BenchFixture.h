// Where requests are measured: one broker, the provider on a simulated host, the facade in front of
// it, and the baseline.
#ifndef BENCH_BENCH_FIXTURE_H
#define BENCH_BENCH_FIXTURE_H

#include "host/broker/Invoke.h"
#include "support/ComputerSystemService.h"
#include "support/Requests.h"
#include "support/SimulatedHost.h"

#include <memory>

namespace bench {

/// The requests that are measured: for each of the five classes EnumerateInstances,
/// EnumerateInstanceNames and GetInstance; for each hop of an association Associators and
/// AssociatorNames; for each class the six operations that are refused. They are named by operation
/// and class, or operation, source and association; paths are those of BenchFixture's one node.
const std::vector<NamedRequest>& requests();

/// The request of that name, which must be one of them.
const cmpihost::OperationRequest& requestNamed(const std::string& name);

/// Who answers.
enum class Answerer { Provider, Baseline, Facade };

/// "provider", "baseline" or "facade".
const char* nameOf(Answerer answerer) noexcept;

/// The built libraries under the strict broker with the schema. The provider sees a simulated host
/// with one node, and both its logging channels let nothing pass. One thread uses it.
class BenchFixture {
  public:
    BenchFixture();
    ~BenchFixture();
    BenchFixture(const BenchFixture&) = delete;
    BenchFixture& operator=(const BenchFixture&) = delete;

    /// Runs one request. Throws std::runtime_error when the broker has to complain.
    cmpihost::Outcome run(Answerer answerer, const cmpihost::OperationRequest& request);

    /// Gives the simulated host, and the baseline's enumerations, that many equal nodes.
    void setNodes(unsigned count);

    /// The provider sees the host that it runs on.
    void useRealHost();
    void useSimulatedHost();

    /// Throws std::runtime_error, naming the request, unless provider and baseline answer every
    /// request alike.
    void compareAnswers();

  private:
    const cmpihost::ProviderLibrary& library(Answerer answerer) const;

    std::shared_ptr<VA::SimulatedHost> host_;
    cmpihost::Broker broker_;
    cmpihost::ComputerSystemService computers_;
    cmpihost::ProviderLibrary provider_;
    cmpihost::ProviderLibrary facade_;
    cmpihost::ProviderLibrary baseline_;
};

}  // namespace bench

#endif
