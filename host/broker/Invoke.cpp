// The way of one operation: a request is opened, its context and path are made, the slot is called,
// and what the provider returned is taken out after the request has ended, when nobody else holds
// it.
#include "host/broker/Invoke.h"

#include "host/broker/BrokerCore.h"
#include "host/broker/ResultCollector.h"

namespace cmpihost {

namespace {

/// A null-terminated list over strings that live elsewhere.
class NameList {
  public:
    explicit NameList(const std::optional<std::vector<std::string>>& names) {
        if (!names) return;
        for (const std::string& name : *names) pointers_.push_back(name.c_str());
        pointers_.push_back(nullptr);
    }
    /// Null for no list.
    /// An empty list is not a null one: it asks for no properties, null for all.
    const char** get() noexcept { return pointers_.empty() ? nullptr : pointers_.data(); }

  private:
    std::vector<const char*> pointers_;
};

const char* textOf(const std::optional<std::string>& text) noexcept {
    return text ? text->c_str() : nullptr;
}

/// One request with everything that its slot takes.
class Call {
  public:
    Call(RequestScope& scope, const OperationRequest& request, const CMPIResult* result)
        : scope_(scope),
          request_(request),
          context_(scope.makeContext(request.context, request.path.nameSpace)),
          path_(scope.makePath(request.path)),
          result_(result),
          properties_(request.properties),
          out_(request.operation == Operation::InvokeMethod ? scope.makeArguments({}) : nullptr) {}

    CMPIStatus run(const ManagementInterfaces& interfaces) {
        const Interface which = interfaceFor(request_.operation);
        if (!interfaces.has(which)) return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
        switch (which) {
            case Interface::Instance:
                return runInstance(interfaces.instance);
            case Interface::Association:
                return runAssociation(interfaces.association);
            case Interface::Method:
                return slot(interfaces.method, interfaces.method->ft->invokeMethod,
                            request_.method.c_str(), scope_.makeArguments(request_.arguments),
                            out_);
            case Interface::Property:
                break;
        }
        return runProperty(interfaces.property);
    }

    /// The arguments that the provider has set. Before the request ends.
    std::vector<NamedValue> outArguments() const {
        return out_ == nullptr ? std::vector<NamedValue>() : valueOf(out_);
    }

  private:
    /// Calls a slot with the four arguments that all slots begin with and those of its own.
    template <class MI, class... Rest, class... Given>
    CMPIStatus slot(MI* interface,
                    CMPIStatus (*function)(MI*, const CMPIContext*, const CMPIResult*,
                                           const CMPIObjectPath*, Rest...),
                    Given... given) {
        if (function == nullptr) {
            scope_.broker().core().report(std::string("no function for ") +
                                          operationName(request_.operation));
            return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
        }
        return function(interface, context_, result_, path_, given...);
    }

    CMPIStatus runInstance(CMPIInstanceMI* mi) {
        const CMPIInstanceMIFT& table = *mi->ft;
        switch (request_.operation) {
            case Operation::EnumerateInstances:
                return slot(mi, table.enumerateInstances, properties_.get());
            case Operation::EnumerateInstanceNames:
                return slot(mi, table.enumerateInstanceNames);
            case Operation::GetInstance:
                return slot(mi, table.getInstance, properties_.get());
            case Operation::CreateInstance:
                return slot(mi, table.createInstance, scope_.makeInstance(request_.instance));
            case Operation::ModifyInstance:
                return slot(mi, table.modifyInstance, scope_.makeInstance(request_.instance),
                            properties_.get());
            case Operation::DeleteInstance:
                return slot(mi, table.deleteInstance);
            case Operation::ExecQuery:
                return slot(mi, table.execQuery, request_.query.c_str(),
                            request_.queryLanguage.c_str());
            default:
                return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
        }
    }

    CMPIStatus runAssociation(CMPIAssociationMI* mi) {
        const CMPIAssociationMIFT& table = *mi->ft;
        const char* const resultClass = textOf(request_.resultClass);
        const char* const role = textOf(request_.role);
        switch (request_.operation) {
            case Operation::Associators:
                return slot(mi, table.associators, textOf(request_.assocClass), resultClass, role,
                            textOf(request_.resultRole), properties_.get());
            case Operation::AssociatorNames:
                return slot(mi, table.associatorNames, textOf(request_.assocClass), resultClass,
                            role, textOf(request_.resultRole));
            case Operation::References:
                return slot(mi, table.references, resultClass, role, properties_.get());
            default:
                return slot(mi, table.referenceNames, resultClass, role);
        }
    }

    CMPIStatus runProperty(CMPIPropertyMI* mi) {
        const char* const name = request_.property.c_str();
        return request_.operation == Operation::GetProperty
                   ? slot(mi, mi->ft->getProperty, name)
                   : slot(mi, mi->ft->setProperty, name, scope_.makeData(request_.value));
    }

    RequestScope& scope_;
    const OperationRequest& request_;
    const CMPIContext* context_;
    const CMPIObjectPath* path_;
    const CMPIResult* result_;
    NameList properties_;
    /// Null for any other operation than a method.
    CMPIArgs* out_;
};

std::optional<std::string> messageOf(const CMPIStatus& status) {
    if (status.msg == nullptr) return std::nullopt;
    try {
        const char* const text = fromHandle(status.msg, {"CMPIStatus", "msg"}).body.get();
        return text == nullptr ? std::string() : std::string(text);
    } catch (const Failure&) {
        return std::nullopt;  // The violation is recorded.
    }
}

}  // namespace

Outcome invoke(const ManagementInterfaces& interfaces, Broker& broker,
               const OperationRequest& request, const CollectorSetup& setup) {
    RequestScope scope(broker);
    ResultCollector collector(scope);
    if (setup) setup(collector);

    Call call(scope, request, collector.cmpi());
    const CMPIStatus status = call.run(interfaces);

    Outcome outcome;
    outcome.rc = status.rc;
    outcome.message = messageOf(status);  // an object of the request, as are the arguments
    outcome.arguments = call.outArguments();
    scope.end();
    outcome.violations = scope.violations();
    // Last: with the objects gone, the contents are moved out instead of copied.
    Results results = collector.take();
    outcome.doneCount = results.doneCount;
    outcome.done = results.doneCount > 0;
    outcome.paths = std::move(results.paths);
    outcome.instances = std::move(results.instances);
    outcome.refusedPaths = std::move(results.refusedPaths);
    outcome.refusedInstances = std::move(results.refusedInstances);
    if (!results.data.empty()) outcome.value = std::move(results.data.front());
    return outcome;
}

Outcome invoke(const ProviderLibrary& library, Broker& broker, const OperationRequest& request,
               const CollectorSetup& setup) {
    Outcome outcome = invoke(library.interfaces(), broker, request, setup);
    const Interface which = interfaceFor(request.operation);
    if (!library.interfaces().has(which)) outcome.message = library.whyMissing(which);
    return outcome;
}

}  // namespace cmpihost
