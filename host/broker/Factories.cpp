// CMPIBrokerEncFT: makes objects and answers questions about objects of any kind. A table names the
// kind of an object, as no other part of a handle can be trusted before it is known.
#include "host/broker/ClassCatalogue.h"
#include "host/broker/Conversion.h"
#include "host/broker/DateTimeText.h"

#include <chrono>
#include <cstring>

namespace cmpihost {

namespace {

/// More elements than any array of a provider has; beyond it lies a mistake, not memory.
/// A size beyond this is a mistake of the provider; to allocate it would end the process.
constexpr CMPICount mostElements = 1u << 24;

CMPIInstance* newInstance(BrokerCore& core, const CallName& call, const CMPIObjectPath* path,
                          CMPIStatus* status) {
    const ObjectPathValue& given = *fromHandle(path, call).body;
    InstanceBody body;
    body.declaration = core.declaration(given.className);
    if (core.catalogue() != nullptr && body.declaration == nullptr) {
        core.report("newInstance of " + given.className + ", a class that is not declared");
        return failWith(status, CMPI_RC_ERR_INVALID_CLASS);
    }
    body.value = std::make_shared<InstanceValue>();
    body.value->path = given;
    // Some object managers do this by themselves; who sets the keys again must not double them.
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

/// All elements start as null. There are no arrays of arrays in CIM.
CMPIArray* newArray(BrokerCore& core, CMPICount size, CMPIType type, CMPIStatus* status) {
    if (size > mostElements || (type & CMPI_ARRAY) != 0 || type == CMPI_null) {
        return failWith(status, CMPI_RC_ERR_INVALID_PARAMETER);
    }
    const CMPIType stored = storedType(type);
    return makeArray(core, stored, std::vector<Value>(size, Value::null(stored)));
}

/// Kept as text, which is what clients see; an instant without a text is refused here and now.
CMPIDateTime* dateTime(BrokerCore& core, CMPIUint64 microseconds, bool interval,
                       CMPIStatus* status) {
    auto text = formatDateTime(microseconds, interval);
    if (!text) return failWith(status, CMPI_RC_ERR_INVALID_PARAMETER);
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
    if (!parseDateTime(given)) return failWith(status, CMPI_RC_ERR_INVALID_PARAMETER);
    return core.make<CMPIDateTime>(std::string(given));
}

/// Queries go to providers as text; the broker itself understands none.
CMPISelectExp* newSelectExp(BrokerCore& core, const CallName& call, const char* query,
                            const char* language, CMPIArray** projection, CMPIStatus* status) {
    required(core, language, call, "language");
    required(core, query, call, "query");
    if (projection != nullptr) *projection = nullptr;
    return failWith(status, CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIBoolean classPathIsA(BrokerCore& core, const CallName& call, const CMPIObjectPath* path,
                         const char* className, CMPIStatus*) {
    const ObjectPathValue& given = *fromHandle(path, call).body;
    const ClassRelation relation = classRelation(core.catalogue(), given.className,
                                                 required(core, className, call, "class name"));
    // Unknown is no: the provider must not rely on what no catalogue confirms.
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

/// Null, retired and foreign pointers are violations and throw Failure.
ObjectFacts factsOf(const void* handle, const CallName& call) {
    if (handle == nullptr) refuseNull(call, "object");
    // A handle has no tag, so each kind looks whether the table is its own.
    for (const auto look : {&asKind<CMPIString>, &asKind<CMPIObjectPath>, &asKind<CMPIInstance>,
                            &asKind<CMPIArray>, &asKind<CMPIArgs>, &asKind<CMPIContext>,
                            &asKind<CMPIDateTime>, &asKind<CMPIEnumeration>, &asKind<CMPIResult>}) {
        if (const auto found = look(handle, call)) return *found;
    }
    refuseForeign(call, "object");
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

CMPIBrokerEncFT completeFactories() {
    using FT = CMPIBrokerEncFT;
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
    bind<&FT::newCMPIError,
         &notSupported<CMPIError*, BrokerCore, Text, Text, Text, CMPIErrorSeverity,
                       CMPIErrorProbableCause, CMPIrc, CMPIStatus*>>(table, "newCMPIError");
    bindMessages(table);
    return table;
}

}  // namespace

CMPIBrokerEncFT factoryTable(bool sparse) {
    static const CMPIBrokerEncFT complete = completeFactories();
    CMPIBrokerEncFT table = complete;
    if (sparse) {
        // As version 1 of CMPI has it, without what came later.
        table.ftVersion = 1;
        table.newCMPIError = nullptr;
        table.openMessageFile = nullptr;
        table.closeMessageFile = nullptr;
        table.getMessage2 = nullptr;
    }
    return table;
}

}  // namespace cmpihost
