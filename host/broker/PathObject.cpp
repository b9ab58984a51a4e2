#include "host/broker/Entry.h"
#include "host/broker/NamedItems.h"

namespace cmpihost {

namespace {

using Path = const Object<CMPIObjectPath>;

/// The content for a change: a copy if somebody else shares it.
ObjectPathValue& altered(Path& path) {
    if (path.body.use_count() != 1) path.body = std::make_shared<ObjectPathValue>(*path.body);
    return *path.body;
}

template <std::string ObjectPathValue::*Member>
CMPIStatus setText(Path& path, const CallName& call, const char* text) {
    altered(path).*Member = required(path.core(), text, call, "text");
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
    if (read.isNull()) {
        core.report("key " + path.body->className + '.' + key + " without a value");
        return statusOf(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    if (!mayBeKey(read)) {
        core.report("key " + path.body->className + '.' + key + " of type " + cimTypeName(type));
        return statusOf(CMPI_RC_ERR_TYPE_MISMATCH);
    }
    putNamed(altered(path).keys, key, std::move(read));
    return statusOf(CMPI_RC_OK);
}

CMPIData asKey(const BrokerCore& core, CMPIData data) noexcept {
    const bool found = (data.state & (CMPI_notFound | CMPI_badValue)) == 0;
    if (found && core.options().keyState) {
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

CMPIStatus setNameSpaceFrom(Path& path, const CallName& call, const CMPIObjectPath* source) {
    const std::shared_ptr<ObjectPathValue> from = fromHandle(source, call).body;
    ObjectPathValue& to = altered(path);
    to.nameSpace = from->nameSpace;
    to.className = from->className;
    return statusOf(CMPI_RC_OK);
}

CMPIStatus setHostFrom(Path& path, const CallName& call, const CMPIObjectPath* source) {
    const std::shared_ptr<ObjectPathValue> from = fromHandle(source, call).body;
    altered(path).hostName = from->hostName;
    return setNameSpaceFrom(path, call, source);
}

/// Qualifiers are an optional service that this broker does not offer.
template <class... Names>
CMPIData noQualifier(Path&, Names... arguments) {
    setStatus(statusArgument(arguments...), CMPI_RC_ERR_NOT_SUPPORTED);
    return noData(CMPI_notFound);
}

CMPIString* pathText(Path& path, CMPIStatus*) {
    return makeString(path.core(), toString(*path.body));
}

void bindQualifiers(Tables<CMPIObjectPath>& tables) {
    using FT = CMPIObjectPathFT;
    using Text = const char*;
    bind<&FT::getClassQualifier, &noQualifier<Text, CMPIStatus*>>(tables, "getClassQualifier",
                                                                  Since::Qualifiers);
    bind<&FT::getPropertyQualifier, &noQualifier<Text, Text, CMPIStatus*>>(
        tables, "getPropertyQualifier", Since::Qualifiers);
    bind<&FT::getMethodQualifier, &noQualifier<Text, Text, CMPIStatus*>>(
        tables, "getMethodQualifier", Since::Qualifiers);
    bind<&FT::getParameterQualifier, &noQualifier<Text, Text, Text, CMPIStatus*>>(
        tables, "getParameterQualifier", Since::Qualifiers);
}

}  // namespace

template <>
Tables<CMPIObjectPath>& tablesOf() {
    static Tables<CMPIObjectPath> tables = [] {
        using FT = CMPIObjectPathFT;
        using Content = ObjectPathValue;
        Tables<CMPIObjectPath> made;
        bindCommon(made);
        bind<&FT::setNameSpace, &setText<&Content::nameSpace>>(made, "setNameSpace");
        bind<&FT::getNameSpace, &getText<&Content::nameSpace>>(made, "getNameSpace");
        bind<&FT::setHostname, &setText<&Content::hostName>>(made, "setHostname");
        bind<&FT::getHostname, &getHostname>(made, "getHostname");
        bind<&FT::setClassName, &setText<&Content::className>>(made, "setClassName");
        bind<&FT::getClassName, &getText<&Content::className>>(made, "getClassName");
        bind<&FT::addKey, &addKey>(made, "addKey");
        bind<&FT::getKey, &getKey>(made, "getKey");
        bind<&FT::getKeyAt, &getKeyAt>(made, "getKeyAt");
        bind<&FT::getKeyCount, &getKeyCount>(made, "getKeyCount");
        bind<&FT::setNameSpaceFromObjectPath, &setNameSpaceFrom>(made,
                                                                 "setNameSpaceFromObjectPath");
        bind<&FT::setHostAndNameSpaceFromObjectPath, &setHostFrom>(
            made, "setHostAndNameSpaceFromObjectPath");
        bind<&FT::toString, &pathText>(made, "toString");
        bindQualifiers(made);
        return made;
    }();
    return tables;
}

}  // namespace cmpihost
