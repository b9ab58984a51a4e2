#ifndef HOST_BROKER_REQUEST_SCOPE_H
#define HOST_BROKER_REQUEST_SCOPE_H

#include "host/broker/Broker.h"

#include <memory>
#include <string>
#include <vector>

/// The scope in which the objects of a broker live.
namespace cmpihost {

class ObjectScope;

/// While a request is open on a thread, objects made by its broker on that thread belong to it.
/// Requests nest: objects live until the outermost one of the broker on the thread ends. A use
/// after that is a violation. Opened and ended on one thread, in reverse order of opening.
class RequestScope {
  public:
    explicit RequestScope(Broker& broker);
    ~RequestScope();
    RequestScope(const RequestScope&) = delete;
    RequestScope& operator=(const RequestScope&) = delete;

    /// Ends the request before its scope does; later calls do nothing.
    void end() noexcept;

    Broker& broker() const noexcept;
    /// What the broker caught on this thread since the request was opened, nested requests
    /// included.
    const std::vector<std::string>& violations() const noexcept;

    /// Objects for the provider, made without a call of the provider: no fault and no count
    /// applies.
    CMPIObjectPath* makePath(const ObjectPathValue& value);
    CMPIInstance* makeInstance(const InstanceValue& value);
    /// None: a string without characters (its pointer is null), as some object managers hand out.
    CMPIString* makeString(const std::optional<std::string>& text);
    CMPIArgs* makeArguments(const std::vector<NamedValue>& values);
    CMPIData makeData(const Value& value);
    /// CMPIInvocationFlags, CMPIPrincipal, CMPIInitNameSpace and CMPIRole, then `more`.
    CMPIContext* makeContext(const RequestContext& context, const std::string& nameSpace,
                             const std::vector<NamedValue>& more = {});

  private:
    std::unique_ptr<ObjectScope> scope_;
};

/// The content of an object of any broker. The object must be alive: else std::invalid_argument.
ObjectPathValue valueOf(const CMPIObjectPath* path);
InstanceValue valueOf(const CMPIInstance* instance);
std::vector<NamedValue> valueOf(const CMPIArgs* arguments);

}  // namespace cmpihost

#endif
