#include "host/broker/ResultCollector.h"

#include "host/broker/BrokerCore.h"
#include "host/broker/ResultState.h"

namespace cmpihost {

namespace {

/// Moves the content out where nobody else holds it any more.
template <class Content>
std::vector<Content> taken(std::vector<std::shared_ptr<Content>>& shared) {
    std::vector<Content> result;
    result.reserve(shared.size());
    for (const auto& content : shared) {
        if (content.use_count() == 1) {
            result.push_back(std::move(*content));
        } else {
            result.push_back(*content);
        }
    }
    shared.clear();
    return result;
}

}  // namespace

ResultCollector::ResultCollector(Request& request)
    : state_(std::make_shared<ResultState>()),
      result_(request.broker().core().make<CMPIResult>(state_)) {}

ResultCollector::~ResultCollector() = default;

const CMPIResult* ResultCollector::cmpi() const noexcept {
    return result_;
}

void ResultCollector::failReturnInstance(unsigned from, CMPIrc rc) {
    state_->instanceFault = {from, rc, 0};
}
void ResultCollector::failReturnObjectPath(unsigned from, CMPIrc rc) {
    state_->pathFault = {from, rc, 0};
}
void ResultCollector::failReturnDone(unsigned from, CMPIrc rc) {
    state_->doneFault = {from, rc, state_->doneFault.calls};
}

std::size_t ResultCollector::instanceCount() const noexcept {
    return state_->instances.size();
}
const InstanceValue& ResultCollector::instance(std::size_t index) const {
    return *state_->instances.at(index);
}
std::size_t ResultCollector::pathCount() const noexcept {
    return state_->paths.size();
}
const ObjectPathValue& ResultCollector::path(std::size_t index) const {
    return *state_->paths.at(index);
}
const std::vector<Value>& ResultCollector::data() const noexcept {
    return state_->data;
}
unsigned ResultCollector::doneCount() const noexcept {
    return state_->doneFault.calls;
}

std::vector<InstanceValue> ResultCollector::takeInstances() {
    return taken(state_->instances);
}
std::vector<ObjectPathValue> ResultCollector::takePaths() {
    return taken(state_->paths);
}
std::vector<InstanceValue> ResultCollector::takeRefusedInstances() {
    return taken(state_->refusedInstances);
}
std::vector<ObjectPathValue> ResultCollector::takeRefusedPaths() {
    return taken(state_->refusedPaths);
}

}  // namespace cmpihost
