// CMPIBrokerEncFT: makes objects, tells about objects of any kind, and takes messages.
#include "host/broker/ClassCatalogue.h"
#include "host/broker/Conversion.h"
#include "host/broker/DateTimeText.h"

#include <chrono>
#include <cstdarg>
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
    if (core.isSparse()) {
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
    const CMPIType stored = storedType(type);
    return makeArray(core, stored, std::vector<Value>(size, Value::null(stored)));
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

/// Queries go to providers as text; the broker itself understands none.
CMPISelectExp* newSelectExp(BrokerCore& core, const CallName& call, const char* query,
                            const char* language, CMPIArray** projection, CMPIStatus* status) {
    required(core, language, call, "language");
    required(core, query, call, "query");
    if (projection != nullptr) *projection = nullptr;
    return refuse(status, CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIBoolean classPathIsA(BrokerCore& core, const CallName& call, const CMPIObjectPath* path,
                         const char* className, CMPIStatus*) {
    const ObjectPathValue& given = *fromHandle(path, call).body;
    const ClassRelation relation = classRelation(core.catalogue(), given.className,
                                                 required(core, className, call, "class name"));
    return relation == ClassRelation::Same || relation == ClassRelation::Subclass;
}

std::string render(const Value& value) {
    return value.isText() ? '"' + value.text() + '"' : value.toText();
}

template <class Items>
std::string renderItems(const Items& items) {
    std::string text = "{";
    for (const auto& item : items) {
        if (text.size() > 1) text += ", ";
        text += item.name + '=' + render(item.value);
    }
    return text + "}";
}

/// A rendering of an object for people.
template <class Edt>
std::string render(const Object<Edt>& object) {
    if constexpr (std::is_same_v<Edt, CMPIString>) {
        return object.body.get() == nullptr ? "" : object.body.get();
    } else if constexpr (std::is_same_v<Edt, CMPIObjectPath>) {
        return toString(*object.body);
    } else if constexpr (std::is_same_v<Edt, CMPIInstance>) {
        const InstanceValue& value = *object.body.value;
        return toString(value.path) + ' ' + renderItems(value.properties);
    } else if constexpr (std::is_same_v<Edt, CMPIArray>) {
        return Value::fromArray(object.body.elementType, object.body.elements).toText();
    } else if constexpr (std::is_same_v<Edt, CMPIArgs> || std::is_same_v<Edt, CMPIContext>) {
        return renderItems(object.body);
    } else if constexpr (std::is_same_v<Edt, CMPIDateTime>) {
        return object.body;
    } else {
        return object.describe();
    }
}

/// What a question about an object of any kind is answered with.
struct ObjectFacts {
    std::string_view kind;
    std::string text;
};

/// Looks at the handle as one of that kind; none if its table is that of another kind.
template <class Edt>
std::optional<ObjectFacts> asKind(const void* handle, const CallName& call) {
    // Any object is a pair {hdl, ft}.
    const void* pair[2];
    std::memcpy(pair, handle, sizeof pair);
    const auto* const table = static_cast<const typename ObjectTraits<Edt>::Table*>(pair[1]);
    const Tables<Edt>& tables = tablesOf<Edt>();
    if (!tables.isLive(table) && table != &tables.retired) return std::nullopt;
    return ObjectFacts{kindName<Edt>, render(fromHandle(static_cast<const Edt*>(handle), call))};
}

template <class... Edts>
ObjectFacts asAnyOf(const void* handle, const CallName& call) {
    for (const auto look : {&asKind<Edts>...}) {
        if (const auto found = look(handle, call)) return *found;
    }
    refuseForeign(call, "object");
}

/// Null, retired and foreign pointers are violations and throw Failure.
ObjectFacts factsOf(const void* handle, const CallName& call) {
    if (handle == nullptr) refuseNull(call, "object");
    return asAnyOf<CMPIString, CMPIObjectPath, CMPIInstance, CMPIArray, CMPIArgs, CMPIContext,
                   CMPIDateTime, CMPIEnumeration, CMPIResult>(handle, call);
}

CMPIString* objectText(BrokerCore& core, const CallName& call, const void* object, CMPIStatus*) {
    return makeString(core, factsOf(object, call).text);
}

CMPIBoolean isOfType(BrokerCore& core, const CallName& call, const void* object, const char* name,
                     CMPIStatus*) {
    return factsOf(object, call).kind == required(core, name, call, "type name");
}

CMPIString* getType(BrokerCore& core, const CallName& call, const void* object, CMPIStatus*) {
    return makeString(core, factsOf(object, call).kind);
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

/// There are no message files: texts come from the provider's defaults.
CMPIStatus openMessageFile(BrokerCore&, const char*, CMPIMsgFileHandle* handle) {
    if (handle != nullptr) *handle = nullptr;
    return statusOf(CMPI_RC_ERR_NOT_SUPPORTED);
}

std::string textOrNull(const char* text) {
    return text == nullptr ? "NULL" : text;
}

/// Small integers come widened to int, as C passes them.
std::string messageArgument(CMPIType type, std::va_list& arguments, const CallName& call) {
    switch (type) {
        case CMPI_sint8:
        case CMPI_sint16:
        case CMPI_sint32:
            return std::to_string(va_arg(arguments, int));
        case CMPI_uint8:
        case CMPI_uint16:
        case CMPI_uint32:
        case CMPI_char16:
            return std::to_string(va_arg(arguments, unsigned int));
        case CMPI_sint64:
            return std::to_string(va_arg(arguments, CMPISint64));
        case CMPI_uint64:
            return std::to_string(va_arg(arguments, CMPIUint64));
        case CMPI_real32:
        case CMPI_real64:
            return Value::fromReal(va_arg(arguments, double)).toText();
        case CMPI_boolean:
            return va_arg(arguments, int) != 0 ? "true" : "false";
        case CMPI_chars:
            return textOrNull(va_arg(arguments, const char*));
        case CMPI_string: {
            const auto* const string = va_arg(arguments, const CMPIString*);
            return string == nullptr ? "NULL" : textOrNull(fromHandle(string, call).body.get());
        }
        default:
            throw Failure{CMPI_RC_ERR_INVALID_DATA_TYPE};
    }
}

/// The arguments $0 to $9 of a text, from pairs of type and value.
std::vector<std::string> messageArguments(CMPICount count, std::va_list& arguments,
                                          const CallName& call) {
    if (count > 10) throw Failure{CMPI_RC_ERR_INVALID_PARAMETER};
    std::vector<std::string> result;
    for (CMPICount i = 0; i < count; ++i) {
        const auto type = static_cast<CMPIType>(va_arg(arguments, int));
        result.push_back(messageArgument(type, arguments, call));
    }
    return result;
}

/// The text with every $n replaced by argument n, where there is one.
std::string expandMessage(const char* text, const std::vector<std::string>& arguments) {
    std::string result;
    for (const char* at = text; *at != '\0'; ++at) {
        const auto index = static_cast<std::size_t>(at[0] == '$' ? at[1] - '0' : -1);
        if (index < arguments.size()) {
            result += arguments[index];
            ++at;
        } else {
            result += *at;
        }
    }
    return result;
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

FT completeTable() {
    using Text = const char*;
    FT table{};
    table.ftVersion = CMPICurrentVersion;
    bind<&FT::newInstance, &newInstance>(table, "newInstance");
    bind<&FT::newObjectPath, &newObjectPath>(table, "newObjectPath");
    bind<&FT::newArgs, &newArgs>(table, "newArgs");
    bind<&FT::newString, &newString>(table, "newString");
    bind<&FT::newArray, &newArray>(table, "newArray");
    bind<&FT::newDateTime, &newDateTime>(table, "newDateTime");
    bind<&FT::newDateTimeFromBinary, &newDateTimeFromBinary>(table, "newDateTimeFromBinary");
    bind<&FT::newDateTimeFromChars, &newDateTimeFromChars>(table, "newDateTimeFromChars");
    bind<&FT::newSelectExp, &newSelectExp>(table, "newSelectExp");
    bind<&FT::classPathIsA, &classPathIsA>(table, "classPathIsA");
    bind<&FT::toString, &objectText>(table, "toString");
    bind<&FT::isOfType, &isOfType>(table, "isOfType");
    bind<&FT::getType, &getType>(table, "getType");
    bind<&FT::logMessage, &record<LogRecord::Channel::Log>>(table, "logMessage");
    bind<&FT::trace, &record<LogRecord::Channel::Trace>>(table, "trace");
    table.getMessage = &getMessage;
    bind<&FT::newCMPIError,
         &notSupported<CMPIError*, BrokerCore, Text, Text, Text, CMPIErrorSeverity,
                       CMPIErrorProbableCause, CMPIrc, CMPIStatus*>>(table, "newCMPIError");
    bind<&FT::openMessageFile, &openMessageFile>(table, "openMessageFile");
    bind<&FT::closeMessageFile, &notSupported<CMPIStatus, BrokerCore, CMPIMsgFileHandle>>(
        table, "closeMessageFile");
    table.getMessage2 = &getMessage2;
    return table;
}

}  // namespace

CMPIBrokerEncFT factoryTable(bool sparse) {
    static const FT complete = completeTable();
    FT table = complete;
    if (sparse) {
        table.ftVersion = 1;
        table.newCMPIError = nullptr;
        table.openMessageFile = nullptr;
        table.closeMessageFile = nullptr;
        table.getMessage2 = nullptr;
    }
    return table;
}

}  // namespace cmpihost
