#ifndef HOST_BROKER_RESULT_COLLECTOR_H
#define HOST_BROKER_RESULT_COLLECTOR_H

#include "host/broker/Request.h"

#include <memory>
#include <vector>

/// The CMPIResult of a request: takes what the provider returns.
namespace cmpihost {

struct ResultState;

/// Collects instances and paths in the order in which they come. Its CMPIResult dies with the
/// request (a later use is a violation); what was collected stays. Used by the thread of its
/// request.
class ResultCollector {
  public:
    /// The request is open.
    explicit ResultCollector(Request& request);
    ~ResultCollector();
    ResultCollector(const ResultCollector&) = delete;
    ResultCollector& operator=(const ResultCollector&) = delete;

    const CMPIResult* cmpi() const noexcept;

    /// From the n-th call (from 1) on, the call answers `rc` and its object counts as refused; 0:
    /// no call does.
    void failReturnInstance(unsigned from, CMPIrc rc);
    void failReturnObjectPath(unsigned from, CMPIrc rc);
    void failReturnDone(unsigned from, CMPIrc rc);

    std::size_t instanceCount() const noexcept;
    const InstanceValue& instance(std::size_t index) const;
    std::size_t pathCount() const noexcept;
    const ObjectPathValue& path(std::size_t index) const;
    /// What returnData handed over.
    const std::vector<Value>& data() const noexcept;
    /// Calls of returnDone, refused ones included.
    unsigned doneCount() const noexcept;

    /// Everything at once; moves it out, without a copy once the request has ended.
    std::vector<InstanceValue> takeInstances();
    std::vector<ObjectPathValue> takePaths();
    /// Objects whose call was made to fail by a setting of this collector.
    std::vector<InstanceValue> takeRefusedInstances();
    std::vector<ObjectPathValue> takeRefusedPaths();

  private:
    std::shared_ptr<ResultState> state_;
    const CMPIResult* result_;
};

}  // namespace cmpihost

#endif
