#ifndef HOST_BROKER_RESULT_COLLECTOR_H
#define HOST_BROKER_RESULT_COLLECTOR_H

#include "host/broker/RequestScope.h"

#include <memory>
#include <vector>

/// The CMPIResult of a request: takes what the provider returns.
namespace cmpihost {

struct ResultState;

/// What a provider returned, in the order in which it came.
struct Results {
    std::vector<ObjectPathValue> paths{};
    std::vector<InstanceValue> instances{};
    /// Objects whose call was made to fail by a setting of the collector.
    std::vector<ObjectPathValue> refusedPaths{};
    std::vector<InstanceValue> refusedInstances{};
    /// What returnData handed over.
    std::vector<Value> data{};
    /// Calls of returnDone, refused ones included.
    unsigned doneCount = 0;
};

/// Collects instances and paths in the order in which they come. Its CMPIResult dies with the
/// request (a later use is a violation); what was collected stays. Used by the thread of its
/// request.
class ResultCollector {
  public:
    /// The request is open.
    explicit ResultCollector(RequestScope& request);
    ~ResultCollector();
    ResultCollector(const ResultCollector&) = delete;
    ResultCollector& operator=(const ResultCollector&) = delete;

    const CMPIResult* cmpi() const noexcept;

    /// From the n-th call (from 1) on, the call answers `rc` and its object counts as refused; 0:
    /// no call does.
    void failReturnInstance(unsigned from, CMPIrc rc);
    void failReturnObjectPath(unsigned from, CMPIrc rc);
    void failReturnDone(unsigned from, CMPIrc rc);

    /// Everything so far; moves it out, without a copy once the request has ended.
    Results take();

  private:
    std::shared_ptr<ResultState> state_;
    const CMPIResult* result_;
};

}  // namespace cmpihost

#endif
