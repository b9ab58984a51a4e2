// Access by name and by index, the same for keys, properties, arguments and context entries.
// Internal.
#pragma once

#include "host/broker/Conversion.h"

#include <algorithm>

namespace cmpihost {

/// The item of that name (without case), null if there is none.
template <class Items>
auto* findNamed(Items& items, std::string_view name) noexcept {
    const auto found = std::find_if(items.begin(), items.end(), [name](const auto& item) {
        return equalNames(item.name, name);
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

inline CMPIData missingItem(BrokerCore& core, CMPIStatus* status) noexcept {
    setStatus(status, core.options().missingItem);
    return noData(CMPI_notFound);
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
