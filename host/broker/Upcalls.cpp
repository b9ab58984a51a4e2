// CMPIBrokerFT: operations that the provider asks of the object manager. Each becomes a request as
// a value, so that whoever answers (another library or this host) sees the same as for a client.
#include "host/broker/Conversion.h"

namespace cmpihost {

namespace {

/// An entry that is absent, null or no text counts as not given: which ones a context has differs
/// between object managers.
std::optional<std::string> contextText(const std::vector<NamedValue>& entries, const char* name) {
    const NamedValue* const entry = findNamed(entries, name);
    return entry != nullptr && entry->value.isText() ? std::optional(entry->value.text())
                                                     : std::nullopt;
}

/// The provider's context goes on to who answers: it says on whose behalf the question is asked.
RequestContext readContext(const CMPIContext* context, const CallName& call) {
    const auto& entries = fromHandle(context, call).body;
    RequestContext result;
    const NamedValue* const flags = findNamed(entries, CMPIInvocationFlags);
    if (flags != nullptr && flags->value.type() == CMPI_uint32 && !flags->value.isNull()) {
        result.flags = static_cast<CMPIFlags>(flags->value.unsignedInteger());
    }
    result.principal = contextText(entries, CMPIPrincipal);
    result.role = contextText(entries, CMPIRole);
    return result;
}

OperationRequest requestOf(Operation operation, const CallName& call, const CMPIContext* context,
                           const CMPIObjectPath* path) {
    OperationRequest request;
    request.operation = operation;
    request.context = readContext(context, call);
    request.path = *fromHandle(path, call).body;
    return request;
}

/// Asks for the answer; a failure becomes the status of the call, with its message.
std::optional<UpcallAnswer> answerTo(BrokerCore& core, const OperationRequest& request,
                                     CMPIStatus* status) {
    UpcallAnswer answer = core.perform(request);
    if (answer.rc == CMPI_RC_OK) return answer;
    if (status != nullptr) {
        // Not setStatus: the message is an object of the caller's request, too.
        status->rc = answer.rc;
        status->msg = answer.message ? makeString(core, *answer.message) : nullptr;
    }
    return std::nullopt;
}

CMPIStatus statusAnswer(BrokerCore& core, const OperationRequest& request) {
    CMPIStatus status = statusOf(CMPI_RC_OK);
    answerTo(core, request, &status);
    return status;
}

bool answersPaths(Operation operation) noexcept {
    return operation == Operation::EnumerateInstanceNames ||
           operation == Operation::AssociatorNames || operation == Operation::ReferenceNames;
}

/// Items stay values until getNext hands them out: an enumeration that is given up early costs no
/// objects.
CMPIEnumeration* enumeration(BrokerCore& core, const OperationRequest& request,
                             CMPIStatus* status) {
    std::optional<UpcallAnswer> answer = answerTo(core, request, status);
    if (!answer) return nullptr;

    EnumerationBody body;
    body.failAt = answer->failAt;
    body.failRc = answer->failRc;
    if (answersPaths(request.operation)) {
        body.itemType = CMPI_ref;
        for (auto& path : answer->paths)
            body.items.push_back(Value::fromReference(std::move(path)));
    } else {
        body.itemType = CMPI_instance;
        for (auto& item : answer->instances)
            body.items.push_back(Value::fromInstance(std::move(item)));
    }
    return core.make<CMPIEnumeration>(std::move(body));
}

CMPIEnumeration* enumerateInstanceNames(BrokerCore& core, const CallName& call,
                                        const CMPIContext* context, const CMPIObjectPath* path,
                                        CMPIStatus* status) {
    return enumeration(core, requestOf(Operation::EnumerateInstanceNames, call, context, path),
                       status);
}

CMPIEnumeration* enumerateInstances(BrokerCore& core, const CallName& call,
                                    const CMPIContext* context, const CMPIObjectPath* path,
                                    const char** properties, CMPIStatus* status) {
    OperationRequest request = requestOf(Operation::EnumerateInstances, call, context, path);
    request.properties = readNames(properties);
    return enumeration(core, request, status);
}

CMPIInstance* getInstance(BrokerCore& core, const CallName& call, const CMPIContext* context,
                          const CMPIObjectPath* path, const char** properties, CMPIStatus* status) {
    OperationRequest request = requestOf(Operation::GetInstance, call, context, path);
    request.properties = readNames(properties);
    std::optional<UpcallAnswer> answer = answerTo(core, request, status);
    if (!answer) return nullptr;
    // A provider that delivers nothing and reports success has no such instance.
    if (answer->instances.empty()) return failWith(status, CMPI_RC_ERR_NOT_FOUND);
    return makeInstance(core,
                        std::make_shared<InstanceValue>(std::move(answer->instances.front())));
}

CMPIObjectPath* createInstance(BrokerCore& core, const CallName& call, const CMPIContext* context,
                               const CMPIObjectPath* path, const CMPIInstance* instance,
                               CMPIStatus* status) {
    OperationRequest request = requestOf(Operation::CreateInstance, call, context, path);
    request.instance = *fromHandle(instance, call).body.value;
    std::optional<UpcallAnswer> answer = answerTo(core, request, status);
    if (!answer) return nullptr;
    // Success without a path is of no use: the caller could not find what it made.
    if (answer->paths.empty()) return failWith(status, CMPI_RC_ERR_FAILED);
    return core.make<CMPIObjectPath>(
        std::make_shared<ObjectPathValue>(std::move(answer->paths.front())));
}

CMPIStatus modifyInstance(BrokerCore& core, const CallName& call, const CMPIContext* context,
                          const CMPIObjectPath* path, const CMPIInstance* instance,
                          const char** properties) {
    OperationRequest request = requestOf(Operation::ModifyInstance, call, context, path);
    request.instance = *fromHandle(instance, call).body.value;
    request.properties = readNames(properties);
    return statusAnswer(core, request);
}

CMPIStatus deleteInstance(BrokerCore& core, const CallName& call, const CMPIContext* context,
                          const CMPIObjectPath* path) {
    return statusAnswer(core, requestOf(Operation::DeleteInstance, call, context, path));
}

CMPIEnumeration* execQuery(BrokerCore& core, const CallName& call, const CMPIContext* context,
                           const CMPIObjectPath* path, const char* query, const char* language,
                           CMPIStatus* status) {
    OperationRequest request = requestOf(Operation::ExecQuery, call, context, path);
    request.query = required(core, query, call, "query");
    request.queryLanguage = required(core, language, call, "language");
    return enumeration(core, request, status);
}

/// What narrows an association operation down; null: nothing.
struct Filters {
    const char* assocClass = nullptr;
    const char* resultClass = nullptr;
    const char* role = nullptr;
    const char* resultRole = nullptr;
    const char** properties = nullptr;
};

CMPIEnumeration* related(BrokerCore& core, OperationRequest request, const Filters& filters,
                         CMPIStatus* status) {
    request.assocClass = optionalText(filters.assocClass);
    request.resultClass = optionalText(filters.resultClass);
    request.role = optionalText(filters.role);
    request.resultRole = optionalText(filters.resultRole);
    request.properties = readNames(filters.properties);
    return enumeration(core, request, status);
}

CMPIEnumeration* associatorNames(BrokerCore& core, const CallName& call, const CMPIContext* context,
                                 const CMPIObjectPath* path, const char* assocClass,
                                 const char* resultClass, const char* role, const char* resultRole,
                                 CMPIStatus* status) {
    return related(core, requestOf(Operation::AssociatorNames, call, context, path),
                   {assocClass, resultClass, role, resultRole}, status);
}

CMPIEnumeration* associators(BrokerCore& core, const CallName& call, const CMPIContext* context,
                             const CMPIObjectPath* path, const char* assocClass,
                             const char* resultClass, const char* role, const char* resultRole,
                             const char** properties, CMPIStatus* status) {
    return related(core, requestOf(Operation::Associators, call, context, path),
                   {assocClass, resultClass, role, resultRole, properties}, status);
}

CMPIEnumeration* referenceNames(BrokerCore& core, const CallName& call, const CMPIContext* context,
                                const CMPIObjectPath* path, const char* resultClass,
                                const char* role, CMPIStatus* status) {
    return related(core, requestOf(Operation::ReferenceNames, call, context, path),
                   {nullptr, resultClass, role}, status);
}

CMPIEnumeration* references(BrokerCore& core, const CallName& call, const CMPIContext* context,
                            const CMPIObjectPath* path, const char* resultClass, const char* role,
                            const char** properties, CMPIStatus* status) {
    return related(core, requestOf(Operation::References, call, context, path),
                   {nullptr, resultClass, role, nullptr, properties}, status);
}

/// The arguments that come out take the place of those of the same name.
CMPIData invokeMethod(BrokerCore& core, const CallName& call, const CMPIContext* context,
                      const CMPIObjectPath* path, const char* method, const CMPIArgs* in,
                      CMPIArgs* out, CMPIStatus* status) {
    OperationRequest request = requestOf(Operation::InvokeMethod, call, context, path);
    request.method = required(core, method, call, "method");
    // Providers leave lists out that would be empty.
    if (in != nullptr) request.arguments = fromHandle(in, call).body;
    auto* const outArguments = out == nullptr ? nullptr : &fromHandle(out, call).body;
    std::optional<UpcallAnswer> answer = answerTo(core, request, status);
    if (!answer) return noData(CMPI_badValue);
    if (outArguments != nullptr) {
        for (NamedValue& each : answer->arguments)
            putNamed(*outArguments, each.name, std::move(each.value));
    }
    return answer->value ? writeValue(core, *answer->value) : noData(CMPI_nullValue);
}

CMPIStatus setProperty(BrokerCore& core, const CallName& call, const CMPIContext* context,
                       const CMPIObjectPath* path, const char* name, const CMPIValue* value,
                       CMPIType type) {
    OperationRequest request = requestOf(Operation::SetProperty, call, context, path);
    request.property = required(core, name, call, "name");
    request.value = readValue(value, type, call);
    return statusAnswer(core, request);
}

CMPIData getProperty(BrokerCore& core, const CallName& call, const CMPIContext* context,
                     const CMPIObjectPath* path, const char* name, CMPIStatus* status) {
    OperationRequest request = requestOf(Operation::GetProperty, call, context, path);
    request.property = required(core, name, call, "name");
    const std::optional<UpcallAnswer> answer = answerTo(core, request, status);
    if (!answer) return noData(CMPI_badValue);
    // Success without data: the provider does not have the property.
    return answer->value ? writeValue(core, *answer->value) : missingItem(core, status);
}

CMPIBrokerFT completeUpcalls() {
    using FT = CMPIBrokerFT;
    using Context = const CMPIContext*;
    using Text = const char*;
    FT table{};
    table.brokerCapabilities = CMPI_MB_InstanceManipulation | CMPI_MB_AssociationTraversal;
    table.brokerVersion = CMPICurrentVersion;
    table.brokerName = "cmpihost";
    bindAttachment(table);
    bind<&FT::enumerateInstanceNames, &enumerateInstanceNames>(table, "enumerateInstanceNames");
    bind<&FT::enumerateInstances, &enumerateInstances>(table, "enumerateInstances");
    bind<&FT::getInstance, &getInstance>(table, "getInstance");
    bind<&FT::createInstance, &createInstance>(table, "createInstance");
    bind<&FT::modifyInstance, &modifyInstance>(table, "modifyInstance");
    bind<&FT::deleteInstance, &deleteInstance>(table, "deleteInstance");
    bind<&FT::execQuery, &execQuery>(table, "execQuery");
    bind<&FT::associators, &associators>(table, "associators");
    bind<&FT::associatorNames, &associatorNames>(table, "associatorNames");
    bind<&FT::references, &references>(table, "references");
    bind<&FT::referenceNames, &referenceNames>(table, "referenceNames");
    bind<&FT::deliverIndication,
         &notSupported<CMPIStatus, BrokerCore, Context, Text, const CMPIInstance*>>(
        table, "deliverIndication");
    bind<&FT::setProperty, &setProperty>(table, "setProperty");
    bind<&FT::getProperty, &getProperty>(table, "getProperty");
    bind<&FT::invokeMethod, &invokeMethod>(table, "invokeMethod");
    return table;
}

}  // namespace

CMPIBrokerFT upcallTable(bool sparse) {
    static const CMPIBrokerFT complete = completeUpcalls();
    CMPIBrokerFT table = complete;
    // No version is lower, so whoever goes by the number takes the oldest ways.
    if (sparse) table.brokerVersion = 0;
    return table;
}

}  // namespace cmpihost
