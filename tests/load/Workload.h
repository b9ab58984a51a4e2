#ifndef TESTS_LOAD_WORKLOAD_H
#define TESTS_LOAD_WORKLOAD_H

#include <atomic>
#include <random>
#include <vector>

#include "host/broker/ProviderLibrary.h"
#include "support/ComputerSystemService.h"
#include "support/Requests.h"

namespace load {

/// What a soak does between two readings: it loads the provider or the facade, asks it, and unloads
/// it, over and over, on this machine and on simulated hosts of 1, 20 and no nodes in turn. The
/// requests come from mixedRequests() or mixedFacadeRequests(), each as often as any other, in an
/// order that changes.
class Workload {
  public:
    /// Finds out this machine's names by asking the provider. Throws cmpihost::LoadError.
    Workload();

    /// Loads the one whose turn it is, sends `count` requests, shared out between `threads`
    /// threads, and unloads it. With one thread the caller's own sends them. Throws
    /// cmpihost::LoadError, and std::runtime_error when a request has another status than it
    /// should, when objects of the broker are left over, or when a library stays in the process.
    void runOnce(unsigned long count, unsigned int threads);

  private:
    void findOutNames();
    std::vector<const MixedRequest*> pick(const std::vector<MixedRequest>& from,
                                          unsigned long count);
    void send(const cmpihost::ProviderLibrary& to, const std::vector<const MixedRequest*>& picked,
              unsigned int threads);
    void sendShare(const cmpihost::ProviderLibrary& to,
                   const std::vector<const MixedRequest*>& picked, std::atomic<std::size_t>& next);
    void checkLeftovers();

    cmpihost::ComputerSystemService computers_;
    cmpihost::Broker broker_;
    cmpihost::ProviderLibrary provider_;
    cmpihost::ProviderLibrary facade_;
    /// What either of them is asked.
    struct Requests {
        std::vector<MixedRequest> ofThisMachine;
        std::vector<MixedRequest> ofSimulatedHosts;
    };
    Requests forProvider_;
    Requests forFacade_;
    std::mt19937 random_{1};
    unsigned long turn_ = 0;
    std::atomic<const MixedRequest*> wrong_{nullptr};
};

}  // namespace load

#endif
