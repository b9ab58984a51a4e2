// CMPIBrokerEncFT: makes objects and examines them.
#include "host/broker/AnyObject.h"
#include "host/broker/BrokerTables.h"
#include "host/broker/Conversion.h"
#include "host/broker/DateTimeText.h"
#include "host/broker/Entry.h"
#include "host/broker/MessageText.h"
#include "host/broker/NamedItems.h"
#include "host/broker/SelectQuery.h"

#include <chrono>
#include <cstring>

namespace cmpihost {

namespace {

/// More elements than any array of a provider has; beyond it lies a mistake, not memory.
constexpr CMPICount mostElements = 1u << 24;

CMPIInstance* newInstance(BrokerCore& core, const CallName& call, const CMPIObjectPath* path,
                          CMPIStatus* status) {
    const ObjectPathValue& given = *fromHandle(path, call).body;
    InstanceBody body;
    body.declaration = core.declaration(given.className);
    if (core.catalogue() != nullptr && body.declaration == nullptr) {
        core.report("newInstance of " + given.className + ", a class that is not declared");
        return refuse(status, CMPI_RC_ERR_INVALID_CLASS);
    }
    body.value = std::make_shared<InstanceValue>();
    body.value->path = given;
    if (core.options().keysBecomeProperties) {
        for (const KeyBinding& key : given.keys) {
            putNamed(body.value->properties, key.name, key.value);
        }
    }
    return core.make<CMPIInstance>(std::move(body));
}

CMPIObjectPath* newObjectPath(BrokerCore& core, const CallName& call, const char* nameSpace,
                              const char* className, CMPIStatus*) {
    auto path = std::make_shared<ObjectPathValue>();
    path->className = required(core, className, call, "class name");
    if (nameSpace != nullptr) path->nameSpace = nameSpace;
    return core.make<CMPIObjectPath>(std::move(path));
}

CMPIArgs* newArgs(BrokerCore& core, CMPIStatus*) {
    return core.make<CMPIArgs>({});
}

CMPIString* newString(BrokerCore& core, const CallName& call, const char* text, CMPIStatus*) {
    return makeString(core, required(core, text, call, "text"));
}

CMPIArray* newArray(BrokerCore& core, CMPICount size, CMPIType type, CMPIStatus* status) {
    if (size > mostElements || (type & CMPI_ARRAY) != 0 || type == CMPI_null) {
        return refuse(status, CMPI_RC_ERR_INVALID_PARAMETER);
    }
    const CMPIType stored =
        type == CMPI_chars || type == CMPI_charsptr ? CMPIType{CMPI_string} : type;
    return core.make<CMPIArray>(
        {stored, std::make_shared<std::vector<Value>>(size, Value::null(stored))});
}

CMPIDateTime* dateTime(BrokerCore& core, CMPIUint64 microseconds, bool interval,
                       CMPIStatus* status) {
    auto text = formatDateTime(microseconds, interval);
    if (!text) return refuse(status, CMPI_RC_ERR_INVALID_PARAMETER);
    return core.make<CMPIDateTime>(std::move(*text));
}

CMPIDateTime* newDateTime(BrokerCore& core, CMPIStatus* status) {
    using namespace std::chrono;
    const auto now = duration_cast<microseconds>(system_clock::now().time_since_epoch());
    return dateTime(core, static_cast<CMPIUint64>(now.count()), false, status);
}

CMPIDateTime* newDateTimeFromBinary(BrokerCore& core, CMPIUint64 binTime, CMPIBoolean interval,
                                    CMPIStatus* status) {
    return dateTime(core, binTime, interval != 0, status);
}

CMPIDateTime* newDateTimeFromChars(BrokerCore& core, const CallName& call, const char* text,
                                   CMPIStatus* status) {
    const std::string_view given = required(core, text, call, "text");
    if (!parseDateTime(given)) return refuse(status, CMPI_RC_ERR_INVALID_PARAMETER);
    return core.make<CMPIDateTime>(std::string(given));
}

CMPISelectExp* newSelectExp(BrokerCore& core, const CallName& call, const char* query,
                            const char* language, CMPIArray** projection, CMPIStatus* status) {
    const std::string_view dialect = required(core, language, call, "language");
    if (!equalNames(dialect, "WQL") && !equalNames(dialect, "CIM:CQL") &&
        !equalNames(dialect, "DMTF:CQL")) {
        return refuse(status, CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED);
    }
    const std::string text = required(core, query, call, "query");
    const auto parsed = parseSelect(text);
    if (!parsed) return refuse(status, CMPI_RC_ERR_INVALID_QUERY);
    if (projection != nullptr) {
        const auto& names = parsed->projection;
        *projection = names.empty()
                          ? nullptr
                          : core.make<CMPIArray>({CMPI_string, std::make_shared<std::vector<Value>>(
                                                                   names.begin(), names.end())});
    }
    return core.make<CMPISelectExp>({text, parsed->className, parsed->hasCondition});
}

CMPIBoolean classPathIsA(BrokerCore& core, const CallName& call, const CMPIObjectPath* path,
                         const char* className, CMPIStatus*) {
    const ObjectPathValue& given = *fromHandle(path, call).body;
    const Kinship kin =
        kinship(core.catalogue(), given.className, required(core, className, call, "class name"));
    return kin == Kinship::Same || kin == Kinship::Below;
}

CMPIString* objectText(BrokerCore& core, const CallName& call, const void* object, CMPIStatus*) {
    return makeString(core, anyObject(object, call).text);
}

CMPIBoolean isOfType(BrokerCore& core, const CallName& call, const void* object, const char* name,
                     CMPIStatus*) {
    return std::strcmp(anyObject(object, call).kind, required(core, name, call, "type name")) == 0;
}

CMPIString* getType(BrokerCore& core, const CallName& call, const void* object, CMPIStatus*) {
    return makeString(core, anyObject(object, call).kind);
}

/// A text, or the string in its place.
std::string textOf(const char* text, const CMPIString* string, const CallName& call) {
    if (text != nullptr) return text;
    if (string == nullptr) return {};
    const char* const characters = fromHandle(string, call).body.get();
    return characters == nullptr ? "" : characters;
}

template <LogRecord::Channel Channel>
CMPIStatus record(BrokerCore& core, const CallName& call, int severity, const char* id,
                  const char* text, const CMPIString* string) {
    core.log({Channel, severity, id == nullptr ? "" : id, textOf(text, string, call)});
    return statusOf(CMPI_RC_OK);
}

CMPIError* newCMPIError(BrokerCore& core, const char* owner, const char* id, const char* message,
                        CMPIErrorSeverity severity, CMPIErrorProbableCause cause, CMPIrc code,
                        CMPIStatus*) {
    ErrorBody body;
    body.owner = optionalText(owner);
    body.id = optionalText(id);
    body.message = optionalText(message);
    body.severity = severity;
    body.cause = cause;
    body.code = code;
    return core.make<CMPIError>(std::move(body));
}

/// There are no message files: texts come from the provider's defaults.
CMPIStatus openMessageFile(BrokerCore&, const char*, CMPIMsgFileHandle* handle) {
    if (handle != nullptr) *handle = nullptr;
    return statusOf(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIStatus closeMessageFile(BrokerCore&, CMPIMsgFileHandle) {
    return statusOf(CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIString* expanded(const CMPIBroker* broker, const CallName& call, const char* text,
                     CMPIStatus* status, CMPICount count, std::va_list& arguments) noexcept {
    return guarded<CMPIString*>(status, [&]() -> CMPIString* {
        BrokerCore& core = target(broker, call);
        return reporting<CMPIString*>(core.countCall(call), status, [&] {
            const char* const message = required(core, text, call, "default message");
            return makeString(core,
                              expandMessage(message, messageArguments(count, arguments, call)));
        });
    });
}

CMPIString* getMessage(const CMPIBroker* broker, const char*, const char* text, CMPIStatus* status,
                       CMPICount count, ...) {
    std::va_list arguments;
    va_start(arguments, count);
    CMPIString* const result =
        expanded(broker, {"CMPIBrokerEncFT", "getMessage"}, text, status, count, arguments);
    va_end(arguments);
    return result;
}

CMPIString* getMessage2(const CMPIBroker* broker, const char*, CMPIMsgFileHandle, const char* text,
                        CMPIStatus* status, CMPICount count, ...) {
    std::va_list arguments;
    va_start(arguments, count);
    CMPIString* const result =
        expanded(broker, {"CMPIBrokerEncFT", "getMessage2"}, text, status, count, arguments);
    va_end(arguments);
    return result;
}

using FT = CMPIBrokerEncFT;

void bindConstructors(FT& table) {
    bind<&FT::newInstance, &newInstance>(table, "newInstance");
    bind<&FT::newObjectPath, &newObjectPath>(table, "newObjectPath");
    bind<&FT::newArgs, &newArgs>(table, "newArgs");
    bind<&FT::newString, &newString>(table, "newString");
    bind<&FT::newArray, &newArray>(table, "newArray");
    bind<&FT::newDateTime, &newDateTime>(table, "newDateTime");
    bind<&FT::newDateTimeFromBinary, &newDateTimeFromBinary>(table, "newDateTimeFromBinary");
    bind<&FT::newDateTimeFromChars, &newDateTimeFromChars>(table, "newDateTimeFromChars");
    bind<&FT::newSelectExp, &newSelectExp>(table, "newSelectExp");
    bind<&FT::newCMPIError, &newCMPIError>(table, "newCMPIError");
}

}  // namespace

CMPIBrokerEncFT factoryTable() {
    FT table{};
    table.ftVersion = CMPICurrentVersion;
    bindConstructors(table);
    bind<&FT::classPathIsA, &classPathIsA>(table, "classPathIsA");
    bind<&FT::toString, &objectText>(table, "toString");
    bind<&FT::isOfType, &isOfType>(table, "isOfType");
    bind<&FT::getType, &getType>(table, "getType");
    bind<&FT::logMessage, &record<LogRecord::Channel::Log>>(table, "logMessage");
    bind<&FT::trace, &record<LogRecord::Channel::Trace>>(table, "trace");
    bind<&FT::openMessageFile, &openMessageFile>(table, "openMessageFile");
    bind<&FT::closeMessageFile, &closeMessageFile>(table, "closeMessageFile");
    table.getMessage = &getMessage;
    table.getMessage2 = &getMessage2;
    return table;
}

}  // namespace cmpihost
