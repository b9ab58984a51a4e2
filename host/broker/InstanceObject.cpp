#include "host/broker/Entry.h"
#include "host/broker/NamedItems.h"
#include "host/broker/SchemaCheck.h"

namespace cmpihost {

namespace {

using Instance = const Object<CMPIInstance>;

/// The content for a change: a copy if somebody else shares it.
InstanceValue& altered(Instance& instance) {
    auto& value = instance.body.value;
    if (value.use_count() != 1) value = std::make_shared<InstanceValue>(*value);
    return *value;
}

bool passes(const InstanceBody& body, std::string_view name) noexcept {
    if (!body.filter) return true;
    return std::any_of(body.filter->begin(), body.filter->end(),
                       [name](const std::string& wanted) { return equalNames(wanted, name); });
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
    if (instance.body.declaration != nullptr) {
        const CMPIrc rc = checkProperty(core, *instance.body.declaration, property, value);
        if (rc != CMPI_RC_OK) return statusOf(rc);
    }
    if (!passes(instance.body, property)) return statusOf(CMPI_RC_OK);

    auto& properties = altered(instance).properties;
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

CMPIObjectPath* getObjectPath(Instance& instance, CMPIStatus*) {
    const InstanceValue& value = *instance.body.value;
    auto path = std::make_shared<ObjectPathValue>(value.path);
    completeKeys(instance.body.declaration, value.properties, *path);
    return instance.core().make<CMPIObjectPath>(std::move(path));
}

CMPIStatus setPropertyFilter(Instance& instance, const char** properties, const char**) {
    instance.body.filter = readNames(properties);
    if (!instance.body.filter) return statusOf(CMPI_RC_OK);
    auto& kept = altered(instance).properties;
    const auto dropped = std::remove_if(kept.begin(), kept.end(), [&](const auto& item) {
        return !passes(instance.body, item.name);
    });
    kept.erase(dropped, kept.end());
    return statusOf(CMPI_RC_OK);
}

CMPIStatus setObjectPath(Instance& instance, const CallName& call, const CMPIObjectPath* path) {
    altered(instance).path = *fromHandle(path, call).body;
    return statusOf(CMPI_RC_OK);
}

}  // namespace

template <>
Tables<CMPIInstance>& tablesOf() {
    static Tables<CMPIInstance> tables = [] {
        using FT = CMPIInstanceFT;
        Tables<CMPIInstance> made;
        bindCommon(made);
        bind<&FT::getProperty, &getProperty>(made, "getProperty");
        bind<&FT::getPropertyAt, &getPropertyAt>(made, "getPropertyAt");
        bind<&FT::getPropertyCount, &getPropertyCount>(made, "getPropertyCount");
        bind<&FT::setProperty, &setProperty>(made, "setProperty");
        bind<&FT::getObjectPath, &getObjectPath>(made, "getObjectPath");
        bind<&FT::setPropertyFilter, &setPropertyFilter>(made, "setPropertyFilter");
        bind<&FT::setObjectPath, &setObjectPath>(made, "setObjectPath");
        bind<&FT::setPropertyWithOrigin, &setPropertyWithOrigin>(made, "setPropertyWithOrigin",
                                                                 Since::Level200);
        return made;
    }();
    return tables;
}

}  // namespace cmpihost
