#ifndef HOST_BROKER_CONVERSION_H
#define HOST_BROKER_CONVERSION_H

#include "host/broker/SlotThunk.h"

#include "base/Ascii.h"

#include <algorithm>

/// Between the values of CMPI and the value model, and access to named values. Internal.
namespace cmpihost {

/// What a provider passed as (value, type); a null pointer gives null of the type. Throws Failure
/// for a type that cannot be stored, and for handles that are not alive (a violation).
Value readValue(const CMPIValue* value, CMPIType type, const CallName& call);

/// The value as CMPI hands it out. Objects in it are new and belong to the thread's request.
CMPIData writeValue(BrokerCore& core, const Value& value);

/// Objects of the thread's request.
CMPIString* makeString(BrokerCore& core, std::string_view text);
CMPIInstance* makeInstance(BrokerCore& core, std::shared_ptr<InstanceValue> value);
CMPIArray* makeArray(BrokerCore& core, CMPIType elementType, std::vector<Value> elements);

/// CMPI_chars and CMPI_charsptr are only other ways to pass a string.
CMPIType storedType(CMPIType type) noexcept;

/// None for null.
std::optional<std::string> optionalText(const char* text);

/// The content of a null-terminated list of names; none for a null list.
std::optional<std::vector<std::string>> readNames(const char** names);

/// Text that must not be null: null is a violation and throws Failure.
const char* required(BrokerCore& core, const char* text, const CallName& call, const char* what);

/// The status of an item (key, property, argument, element, context entry) that is not there.
inline CMPIrc missingItemStatus(const BrokerCore& core) noexcept {
    return core.isSparse() ? CMPI_RC_ERR_NOT_FOUND : CMPI_RC_ERR_NO_SUCH_PROPERTY;
}
inline CMPIData missingItem(const BrokerCore& core, CMPIStatus* status) noexcept {
    setStatus(status, missingItemStatus(core));
    return noData(CMPI_notFound);
}

/// The item of that name (without case), null if there is none.
template <class Items>
auto* findNamed(Items& items, std::string_view name) {
    const auto found = std::find_if(items.begin(), items.end(), [name](const auto& item) {
        return base::equalsIgnoreCase(item.name, name);
    });
    return found == items.end() ? nullptr : &*found;
}

/// Adds the item or replaces the value of the one that has its name.
template <class Items>
void putNamed(Items& items, std::string_view name, Value value) {
    if (auto* const known = findNamed(items, name)) {
        known->value = std::move(value);
    } else {
        items.push_back({std::string(name), std::move(value)});
    }
}

template <class Items>
CMPIData getNamed(BrokerCore& core, const Items& items, std::string_view name, CMPIStatus* status) {
    const auto* const item = findNamed(items, name);
    return item == nullptr ? missingItem(core, status) : writeValue(core, item->value);
}

template <class Items>
CMPIData getNamedAt(BrokerCore& core, const Items& items, CMPICount index, CMPIString** outName,
                    CMPIStatus* status) {
    if (index >= items.size()) return missingItem(core, status);
    const auto& item = items[index];
    if (outName != nullptr) *outName = makeString(core, item.name);
    return writeValue(core, item.value);
}

}  // namespace cmpihost

#endif
