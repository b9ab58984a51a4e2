#include "host/broker/Conversion.h"
#include "host/broker/Entry.h"
#include "host/broker/ResultState.h"
#include "host/broker/SchemaCheck.h"

namespace cmpihost {

namespace {

using Result = const Object<CMPIResult>;

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
    const bool again = result.body->doneFault.calls > 0;
    const CMPIrc rc = result.body->doneFault.onCall();
    if (again) {
        result.core().report("returnDone called twice");
        return statusOf(CMPI_RC_ERR_FAILED);
    }
    return statusOf(rc);
}

CMPIStatus returnError(Result& result, const CallName& call, const CMPIError* error) {
    fromHandle(error, call);
    refuseAfterDone(result, "error returned");
    return statusOf(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIResult* noClone(Result&, CMPIStatus* status) {
    return refuse(status, CMPI_RC_ERR_NOT_SUPPORTED);
}

}  // namespace

template <>
Tables<CMPIResult>& tablesOf() {
    static Tables<CMPIResult> tables = [] {
        using FT = CMPIResultFT;
        Tables<CMPIResult> made;
        bindCommon(made);
        bind<&FT::clone, &noClone>(made, "clone");
        bind<&FT::returnData, &returnData>(made, "returnData");
        bind<&FT::returnInstance, &returnInstance>(made, "returnInstance");
        bind<&FT::returnObjectPath, &returnObjectPath>(made, "returnObjectPath");
        bind<&FT::returnDone, &returnDone>(made, "returnDone");
        bind<&FT::returnError, &returnError>(made, "returnError", Since::Level200);
        return made;
    }();
    return tables;
}

}  // namespace cmpihost
