#include "host/broker/AnyObject.h"

#include <cstring>
#include <optional>

namespace cmpihost {

namespace {

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

template <class Edt>
std::string render(const Object<Edt>& object) {
    return object.describe();
}
template <>
std::string render(const Object<CMPIString>& object) {
    return object.body.get() == nullptr ? "" : object.body.get();
}
template <>
std::string render(const Object<CMPIObjectPath>& object) {
    return toString(*object.body);
}
template <>
std::string render(const Object<CMPIInstance>& object) {
    const InstanceValue& value = *object.body.value;
    return toString(value.path) + ' ' + renderItems(value.properties);
}
template <>
std::string render(const Object<CMPIArray>& object) {
    return Value::fromArray(object.body.elementType, object.body.elements).toText();
}
template <>
std::string render(const Object<CMPIArgs>& object) {
    return renderItems(object.body);
}
template <>
std::string render(const Object<CMPIContext>& object) {
    return renderItems(object.body);
}
template <>
std::string render(const Object<CMPIDateTime>& object) {
    return object.body;
}
template <>
std::string render(const Object<CMPISelectExp>& object) {
    return object.body.query;
}

/// The function table that any {hdl, ft} pair names.
const void* tableOf(const void* handle) noexcept {
    const void* pair[2];
    std::memcpy(pair, handle, sizeof pair);
    return pair[1];
}

/// Looks at the handle as one of that kind; none if its table is that of another kind.
template <class Edt>
std::optional<AnyObject> asKind(const void* handle, const CallName& call) {
    using Table = typename Kind<Edt>::Table;
    const auto* const table = static_cast<const Table*>(tableOf(handle));
    const Tables<Edt>& tables = tablesOf<Edt>();
    if (!tables.isLive(table) && table != &tables.dead) return std::nullopt;
    const auto& object = fromHandle(static_cast<const Edt*>(handle), call);
    return AnyObject{object, Kind<Edt>::name, render(object)};
}

template <class... Edts>
AnyObject asAnyOf(const void* handle, const CallName& call) {
    using Look = std::optional<AnyObject> (*)(const void*, const CallName&);
    for (const Look look : {Look{&asKind<Edts>}...}) {
        if (const auto found = look(handle, call)) return *found;
    }
    refuseForeign(call, "object");
}

}  // namespace

AnyObject anyObject(const void* handle, const CallName& call) {
    if (handle == nullptr) refuseNull(call, "object");
    return asAnyOf<CMPIString, CMPIObjectPath, CMPIInstance, CMPIArray, CMPIArgs, CMPIContext,
                   CMPIDateTime, CMPIEnumeration, CMPISelectExp, CMPIError, CMPIResult>(handle,
                                                                                        call);
}

}  // namespace cmpihost
