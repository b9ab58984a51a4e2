// Object paths and instances. Their contents are shared with the values, results and clones made of
// them, and copied when somebody changes one that is shared.
#include "host/broker/Conversion.h"
#include "host/broker/SchemaCheck.h"

namespace cmpihost {

namespace {

using Path = const Object<CMPIObjectPath>;

/// The content for a change: a copy if somebody else shares it.
ObjectPathValue& mutableContent(Path& path) {
    if (path.body.use_count() != 1) path.body = std::make_shared<ObjectPathValue>(*path.body);
    return *path.body;
}

template <std::string ObjectPathValue::*Member>
CMPIStatus setText(Path& path, const CallName& call, const char* text) {
    mutableContent(path).*Member = required(path.core(), text, call, "text");
    return statusOf(CMPI_RC_OK);
}

template <std::string ObjectPathValue::*Member>
CMPIString* getText(Path& path, CMPIStatus*) {
    return makeString(path.core(), (*path.body).*Member);
}

/// A path without host has a string without characters, as real object managers hand out.
CMPIString* getHostname(Path& path, CMPIStatus*) {
    const std::string& host = path.body->hostName;
    return path.core().make<CMPIString>(host.empty() ? Characters() : Characters(host));
}

bool mayBeKey(const Value& value) noexcept {
    return !value.isArray() && value.type() != CMPI_instance && value.type() != CMPI_ptr;
}

CMPIStatus addKey(Path& path, const CallName& call, const char* name, const CMPIValue* value,
                  CMPIType type) {
    BrokerCore& core = path.core();
    const std::string key = required(core, name, call, "name");
    Value read = readValue(value, type, call);
    // Object managers compare keys to find an instance: a null would match none or any.
    if (read.isNull()) {
        core.report("key " + path.body->className + '.' + key + " without a value");
        return statusOf(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    if (!mayBeKey(read)) {
        core.report("key " + path.body->className + '.' + key + " of type " + cimTypeName(type));
        return statusOf(CMPI_RC_ERR_TYPE_MISMATCH);
    }
    putNamed(mutableContent(path).keys, key, std::move(read));
    return statusOf(CMPI_RC_OK);
}

/// The state of a key differs between object managers; providers must not rely on one.
CMPIData asKey(const BrokerCore& core, CMPIData data) noexcept {
    const bool found = (data.state & (CMPI_notFound | CMPI_badValue)) == 0;
    if (found && !core.isSparse()) {
        data.state = static_cast<CMPIValueState>(data.state | CMPI_keyValue);
    }
    return data;
}

CMPIData getKey(Path& path, const CallName& call, const char* name, CMPIStatus* status) {
    BrokerCore& core = path.core();
    const char* const key = required(core, name, call, "name");
    return asKey(core, getNamed(core, path.body->keys, key, status));
}

CMPIData getKeyAt(Path& path, CMPICount index, CMPIString** outName, CMPIStatus* status) {
    BrokerCore& core = path.core();
    return asKey(core, getNamedAt(core, path.body->keys, index, outName, status));
}

CMPICount getKeyCount(Path& path, CMPIStatus*) {
    return static_cast<CMPICount>(path.body->keys.size());
}

/// Despite its name the call takes over the class, too; the keys stay.
CMPIStatus setNameSpaceFrom(Path& path, const CallName& call, const CMPIObjectPath* source) {
    const std::shared_ptr<ObjectPathValue> from = fromHandle(source, call).body;
    ObjectPathValue& to = mutableContent(path);
    to.nameSpace = from->nameSpace;
    to.className = from->className;
    return statusOf(CMPI_RC_OK);
}

CMPIStatus setHostFrom(Path& path, const CallName& call, const CMPIObjectPath* source) {
    const std::shared_ptr<ObjectPathValue> from = fromHandle(source, call).body;
    mutableContent(path).hostName = from->hostName;
    return setNameSpaceFrom(path, call, source);
}

CMPIString* pathText(Path& path, CMPIStatus*) {
    return makeString(path.core(), toString(*path.body));
}

using Instance = const Object<CMPIInstance>;

/// The content for a change: a copy if somebody else shares it.
InstanceValue& mutableContent(Instance& instance) {
    auto& value = instance.body.value;
    if (value.use_count() != 1) value = std::make_shared<InstanceValue>(*value);
    return *value;
}

bool passes(const InstanceBody& body, std::string_view name) {
    if (!body.filter) return true;
    return std::any_of(body.filter->begin(), body.filter->end(), [name](const std::string& wanted) {
        return base::equalsIgnoreCase(wanted, name);
    });
}

CMPIData getProperty(Instance& instance, const CallName& call, const char* name,
                     CMPIStatus* status) {
    BrokerCore& core = instance.core();
    const char* const property = required(core, name, call, "name");
    return getNamed(core, instance.body.value->properties, property, status);
}

CMPIData getPropertyAt(Instance& instance, CMPICount index, CMPIString** outName,
                       CMPIStatus* status) {
    return getNamedAt(instance.core(), instance.body.value->properties, index, outName, status);
}

CMPICount getPropertyCount(Instance& instance, CMPIStatus*) {
    return static_cast<CMPICount>(instance.body.value->properties.size());
}

CMPIStatus set(Instance& instance, const CallName& call, const char* name, Value value,
               const char* origin) {
    BrokerCore& core = instance.core();
    const std::string_view property = required(core, name, call, "name");
    // Before the filter: a misspelt property is to be found whatever the client asked for.
    if (instance.body.declaration != nullptr) {
        const CMPIrc rc = checkProperty(core, *instance.body.declaration, property, value);
        if (rc != CMPI_RC_OK) return statusOf(rc);
    }
    if (!passes(instance.body, property)) return statusOf(CMPI_RC_OK);

    auto& properties = mutableContent(instance).properties;
    putNamed(properties, property, std::move(value));
    if (origin != nullptr) findNamed(properties, property)->origin = origin;
    return statusOf(CMPI_RC_OK);
}

CMPIStatus setProperty(Instance& instance, const CallName& call, const char* name,
                       const CMPIValue* value, CMPIType type) {
    return set(instance, call, name, readValue(value, type, call), nullptr);
}

CMPIStatus setPropertyWithOrigin(Instance& instance, const CallName& call, const char* name,
                                 const CMPIValue* value, CMPIType type, const char* origin) {
    return set(instance, call, name, readValue(value, type, call), origin);
}

/// Keys that the provider set as properties only are added, as object managers do it.
CMPIObjectPath* getObjectPath(Instance& instance, CMPIStatus*) {
    const InstanceValue& value = *instance.body.value;
    auto path = std::make_shared<ObjectPathValue>(value.path);
    completeKeys(instance.body.declaration, value.properties, *path);
    return instance.core().make<CMPIObjectPath>(std::move(path));
}

/// Drops what is set already, too, as a client would otherwise see it. Key names are not needed:
/// keys stand in the path, which no filter touches.
CMPIStatus setPropertyFilter(Instance& instance, const char** properties, const char**) {
    instance.body.filter = readNames(properties);
    if (!instance.body.filter) return statusOf(CMPI_RC_OK);
    auto& kept = mutableContent(instance).properties;
    const auto dropped = std::remove_if(kept.begin(), kept.end(), [&](const auto& item) {
        return !passes(instance.body, item.name);
    });
    kept.erase(dropped, kept.end());
    return statusOf(CMPI_RC_OK);
}

CMPIStatus setObjectPath(Instance& instance, const CallName& call, const CMPIObjectPath* path) {
    mutableContent(instance).path = *fromHandle(path, call).body;
    return statusOf(CMPI_RC_OK);
}

/// Qualifiers are an optional service that this broker does not offer.
template <class... Names>
CMPIData noQualifier(Path& path, Names... names) {
    return notSupported<CMPIData>(path, names...);
}

void bindQualifiers(Tables<CMPIObjectPath>& tables) {
    using FT = CMPIObjectPathFT;
    using Text = const char*;
    bind<&FT::getClassQualifier, &noQualifier<Text, CMPIStatus*>>(tables, "getClassQualifier");
    bind<&FT::getPropertyQualifier, &noQualifier<Text, Text, CMPIStatus*>>(tables,
                                                                           "getPropertyQualifier");
    bind<&FT::getMethodQualifier, &noQualifier<Text, Text, CMPIStatus*>>(tables,
                                                                         "getMethodQualifier");
    bind<&FT::getParameterQualifier, &noQualifier<Text, Text, Text, CMPIStatus*>>(
        tables, "getParameterQualifier");
    tables.sparse.getClassQualifier = nullptr;
    tables.sparse.getPropertyQualifier = nullptr;
    tables.sparse.getMethodQualifier = nullptr;
    tables.sparse.getParameterQualifier = nullptr;
}

}  // namespace

void bindSlots(Tables<CMPIObjectPath>& tables) {
    using FT = CMPIObjectPathFT;
    using Content = ObjectPathValue;
    bindCommon(tables);
    bind<&FT::setNameSpace, &setText<&Content::nameSpace>>(tables, "setNameSpace");
    bind<&FT::getNameSpace, &getText<&Content::nameSpace>>(tables, "getNameSpace");
    bind<&FT::setHostname, &setText<&Content::hostName>>(tables, "setHostname");
    bind<&FT::getHostname, &getHostname>(tables, "getHostname");
    bind<&FT::setClassName, &setText<&Content::className>>(tables, "setClassName");
    bind<&FT::getClassName, &getText<&Content::className>>(tables, "getClassName");
    bind<&FT::addKey, &addKey>(tables, "addKey");
    bind<&FT::getKey, &getKey>(tables, "getKey");
    bind<&FT::getKeyAt, &getKeyAt>(tables, "getKeyAt");
    bind<&FT::getKeyCount, &getKeyCount>(tables, "getKeyCount");
    bind<&FT::setNameSpaceFromObjectPath, &setNameSpaceFrom>(tables, "setNameSpaceFromObjectPath");
    bind<&FT::setHostAndNameSpaceFromObjectPath, &setHostFrom>(tables,
                                                               "setHostAndNameSpaceFromObjectPath");
    bind<&FT::toString, &pathText>(tables, "toString");
    bindQualifiers(tables);
}

void bindSlots(Tables<CMPIInstance>& tables) {
    using FT = CMPIInstanceFT;
    bindCommon(tables);
    bind<&FT::getProperty, &getProperty>(tables, "getProperty");
    bind<&FT::getPropertyAt, &getPropertyAt>(tables, "getPropertyAt");
    bind<&FT::getPropertyCount, &getPropertyCount>(tables, "getPropertyCount");
    bind<&FT::setProperty, &setProperty>(tables, "setProperty");
    bind<&FT::getObjectPath, &getObjectPath>(tables, "getObjectPath");
    bind<&FT::setPropertyFilter, &setPropertyFilter>(tables, "setPropertyFilter");
    bind<&FT::setObjectPath, &setObjectPath>(tables, "setObjectPath");
    bind<&FT::setPropertyWithOrigin, &setPropertyWithOrigin>(tables, "setPropertyWithOrigin");
    tables.sparse.setPropertyWithOrigin = nullptr;
}

}  // namespace cmpihost
