// The state is shared with the CMPIResult, which a provider may keep longer than the collector
// lives.
#include "host/broker/ResultCollector.h"

#include "host/broker/Conversion.h"
#include "host/broker/SchemaCheck.h"

#include <utility>

namespace cmpihost {

/// Makes the calls of one kind fail from the n-th on.
struct ReturnFault {
    unsigned from = 0;
    CMPIrc rc = CMPI_RC_OK;
    unsigned calls = 0;

    /// Counts a call and says how it answers.
    CMPIrc onCall() noexcept {
        ++calls;
        return from != 0 && calls >= from ? rc : CMPI_RC_OK;
    }
};

struct ResultState {
    ReturnFault instanceFault{};
    ReturnFault pathFault{};
    ReturnFault doneFault{};
    std::vector<std::shared_ptr<InstanceValue>> instances{};
    std::vector<std::shared_ptr<ObjectPathValue>> paths{};
    std::vector<std::shared_ptr<InstanceValue>> refusedInstances{};
    std::vector<std::shared_ptr<ObjectPathValue>> refusedPaths{};
    std::vector<Value> data{};
};

namespace {

using Result = const Object<CMPIResult>;

/// What comes after returnDone never reaches a client, so it must not reach a test either.
void refuseAfterDone(Result& result, const std::string& what) {
    if (result.body->doneFault.calls == 0) return;
    result.core().report(what + " after returnDone");
    throw Failure{CMPI_RC_ERR_FAILED};
}

/// Takes a returned object into one of two lists, as the collector's settings say.
template <class Content>
CMPIStatus take(ReturnFault& fault, std::shared_ptr<Content> content,
                std::vector<std::shared_ptr<Content>>& accepted,
                std::vector<std::shared_ptr<Content>>& refused) {
    const CMPIrc rc = fault.onCall();
    (rc == CMPI_RC_OK ? accepted : refused).push_back(std::move(content));
    return statusOf(rc);
}

/// The content with the keys that its properties give, shared as long as there is nothing to add.
std::shared_ptr<InstanceValue> completed(const InstanceBody& body) {
    ObjectPathValue path = body.value->path;
    completeKeys(body.declaration, body.value->properties, path);
    if (path.keys.size() == body.value->path.keys.size()) return body.value;
    auto copy = std::make_shared<InstanceValue>(*body.value);
    copy->path = std::move(path);
    return copy;
}

CMPIStatus returnInstance(Result& result, const CallName& call, const CMPIInstance* instance) {
    const auto& returned = fromHandle(instance, call);
    refuseAfterDone(result, returned.describe() + " returned");
    std::shared_ptr<InstanceValue> content = completed(returned.body);
    checkInstance(result.core(), *content);
    ResultState& state = *result.body;
    return take(state.instanceFault, std::move(content), state.instances, state.refusedInstances);
}

CMPIStatus returnObjectPath(Result& result, const CallName& call, const CMPIObjectPath* path) {
    const auto& returned = fromHandle(path, call);
    refuseAfterDone(result, returned.describe() + " returned");
    checkPath(result.core(), *returned.body);
    ResultState& state = *result.body;
    return take(state.pathFault, returned.body, state.paths, state.refusedPaths);
}

CMPIStatus returnData(Result& result, const CallName& call, const CMPIValue* value, CMPIType type) {
    refuseAfterDone(result, "data returned");
    result.body->data.push_back(readValue(value, type, call));
    return statusOf(CMPI_RC_OK);
}

CMPIStatus returnDone(Result& result) {
    // Counted even when it is one too many: callers want to see how many there were.
    const bool again = result.body->doneFault.calls > 0;
    const CMPIrc rc = result.body->doneFault.onCall();
    if (again) {
        result.core().report("returnDone called twice");
        return statusOf(CMPI_RC_ERR_FAILED);
    }
    return statusOf(rc);
}

CMPIStatus returnError(Result&, const CallName& call, const CMPIError* error) {
    refuseNeverMade(error, call, "CMPIError");
}

/// Moves the content out where nobody else holds it any more.
template <class Content>
std::vector<Content> taken(std::vector<std::shared_ptr<Content>>& shared) {
    std::vector<Content> result;
    result.reserve(shared.size());
    for (const auto& content : shared) {
        // A provider that is still at work may hold the object and change it later.
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

void bindSlots(Tables<CMPIResult>& tables) {
    using FT = CMPIResultFT;
    bindCommon(tables);
    bind<&FT::clone, &notSupported<CMPIResult*, const Object<CMPIResult>, CMPIStatus*>>(tables,
                                                                                        "clone");
    bind<&FT::returnData, &returnData>(tables, "returnData");
    bind<&FT::returnInstance, &returnInstance>(tables, "returnInstance");
    bind<&FT::returnObjectPath, &returnObjectPath>(tables, "returnObjectPath");
    bind<&FT::returnDone, &returnDone>(tables, "returnDone");
    bind<&FT::returnError, &returnError>(tables, "returnError");
    tables.sparse.returnError = nullptr;
}

ResultCollector::ResultCollector(RequestScope& request)
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

Results ResultCollector::take() {
    return {taken(state_->paths),
            taken(state_->instances),
            taken(state_->refusedPaths),
            taken(state_->refusedInstances),
            std::exchange(state_->data, {}),
            state_->doneFault.calls};
}

}  // namespace cmpihost
