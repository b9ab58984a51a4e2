#include "host/broker/Request.h"

#include "host/broker/Conversion.h"
#include "host/broker/RequestScope.h"

#include <stdexcept>

namespace cmpihost {

struct Request::State {
    explicit State(BrokerCore& core) : scope(core, false) {}
    RequestScope scope;
};

Request::Request(Broker& broker) : state_(std::make_unique<State>(broker.core())) {}
Request::~Request() = default;

void Request::end() noexcept {
    state_->scope.end();
}
Broker& Request::broker() const noexcept {
    return state_->scope.core().owner();
}
const std::vector<std::string>& Request::violations() const noexcept {
    return state_->scope.violations();
}

CMPIObjectPath* Request::makePath(const ObjectPathValue& value) {
    return state_->scope.core().make<CMPIObjectPath>(std::make_shared<ObjectPathValue>(value));
}

CMPIInstance* Request::makeInstance(const InstanceValue& value) {
    return cmpihost::makeInstance(state_->scope.core(), std::make_shared<InstanceValue>(value));
}

CMPIString* Request::makeString(const std::optional<std::string>& text) {
    return state_->scope.core().make<CMPIString>(text ? Characters(*text) : Characters());
}

CMPIContext* Request::makeContext(const RequestContext& context, const std::string& nameSpace) {
    const auto text = [](const std::optional<std::string>& given) {
        return given ? Value(*given) : Value::null(CMPI_string);
    };
    std::vector<NamedValue> entries = {
        {CMPIInvocationFlags, Value::fromUnsigned(context.flags, CMPI_uint32)},
        {CMPIPrincipal, text(context.principal)}};
    BrokerCore& core = state_->scope.core();
    if (core.options().fullContext) {
        entries.push_back({CMPIInitNameSpace, nameSpace});
        entries.push_back({CMPIRole, text(context.role)});
    }
    return core.make<CMPIContext>(std::move(entries));
}

namespace {

template <class Edt>
const Object<Edt>& alive(const Edt* handle) {
    try {
        return fromHandle(handle, {"cmpihost", "valueOf"});
    } catch (const Failure&) {
        throw std::invalid_argument(std::string("no living ") + Kind<Edt>::name);
    }
}

}  // namespace

ObjectPathValue valueOf(const CMPIObjectPath* path) {
    return *alive(path).body;
}
InstanceValue valueOf(const CMPIInstance* instance) {
    return *alive(instance).body.value;
}

}  // namespace cmpihost
