// What a client sends is made into objects here, past the slots, so that no fault plan counts it.
#include "host/broker/RequestScope.h"

#include "host/broker/Conversion.h"

#include <stdexcept>

namespace cmpihost {

RequestScope::RequestScope(Broker& broker) : scope_(std::make_unique<ObjectScope>(broker.core())) {}
RequestScope::~RequestScope() = default;

void RequestScope::end() noexcept {
    scope_->end();
}
Broker& RequestScope::broker() const noexcept {
    return scope_->core().owner();
}
const std::vector<std::string>& RequestScope::violations() const noexcept {
    return scope_->violations();
}

CMPIObjectPath* RequestScope::makePath(const ObjectPathValue& value) {
    return scope_->core().make<CMPIObjectPath>(std::make_shared<ObjectPathValue>(value));
}

CMPIInstance* RequestScope::makeInstance(const InstanceValue& value) {
    return cmpihost::makeInstance(scope_->core(), std::make_shared<InstanceValue>(value));
}

CMPIString* RequestScope::makeString(const std::optional<std::string>& text) {
    return scope_->core().make<CMPIString>(text ? Characters(*text) : Characters());
}

CMPIArgs* RequestScope::makeArguments(const std::vector<NamedValue>& values) {
    return scope_->core().make<CMPIArgs>(values);
}

CMPIData RequestScope::makeData(const Value& value) {
    return writeValue(scope_->core(), value);
}

CMPIContext* RequestScope::makeContext(const RequestContext& context, const std::string& nameSpace,
                                       const std::vector<NamedValue>& more) {
    // The entry is there without a value, too: that is how a client without a name looks.
    const auto text = [](const std::optional<std::string>& given) {
        return given ? Value(*given) : Value::null(CMPI_string);
    };
    std::vector<NamedValue> entries = {
        {CMPIInvocationFlags, Value::fromUnsigned(context.flags, CMPI_uint32)},
        {CMPIPrincipal, text(context.principal)}};
    BrokerCore& core = scope_->core();
    // Providers must not count on entries that only some object managers hand out.
    if (!core.isSparse()) {
        entries.push_back({CMPIInitNameSpace, nameSpace});
        entries.push_back({CMPIRole, text(context.role)});
    }
    entries.insert(entries.end(), more.begin(), more.end());
    return core.make<CMPIContext>(std::move(entries));
}

namespace {

template <class Edt>
const Object<Edt>& alive(const Edt* handle) {
    try {
        return fromHandle(handle, {"cmpihost", "valueOf"});
    } catch (const Failure&) {
        throw std::invalid_argument(std::string("no living ").append(kindName<Edt>));
    }
}

}  // namespace

ObjectPathValue valueOf(const CMPIObjectPath* path) {
    return *alive(path).body;
}
InstanceValue valueOf(const CMPIInstance* instance) {
    return *alive(instance).body.value;
}
std::vector<NamedValue> valueOf(const CMPIArgs* arguments) {
    return alive(arguments).body;
}

}  // namespace cmpihost
