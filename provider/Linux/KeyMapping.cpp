// Far ends are named by a single key, since the near end knows no other: object managers and the
// adapters take it as a filter.
#include "KeyMapping.h"

#include <algorithm>

#include "FrameworkException.h"

namespace VA::OSStatusProvider {

std::string valueOfFirst(VA::Moniker& moniker, std::initializer_list<const char*> names,
                         const char* missing) {
    const unsigned int count = moniker.getKeyCount();
    std::string name;
    for (unsigned int index = 0; index < count; ++index) {
        if (!moniker.selectKey(index)) continue;
        moniker.getName(name);
        if (std::find(names.begin(), names.end(), name) == names.end()) continue;
        std::string value;
        moniker.getValue(value);
        return value;
    }
    throw VA::FrameworkException(missing);
}

VA::Moniker monikerOf(const char* name, const std::string& value) {
    VA::Moniker moniker;
    moniker.addKey(name, value);
    return moniker;
}

VA::Moniker computerSystemMonikerOf(VA::Moniker& monikerOS) {
    return monikerOf("Name", valueOfFirst(monikerOS, {"CSName", "Name"},
                                          "Could not find 'CSName' or 'Name' Key in Moniker"));
}

VA::Moniker operatingSystemMonikerOf(VA::Moniker& monikerComputer) {
    return monikerOf(
        "CSName", valueOfFirst(monikerComputer, {"Name"}, "Could not find 'Name' Key in Moniker"));
}

}  // namespace VA::OSStatusProvider
