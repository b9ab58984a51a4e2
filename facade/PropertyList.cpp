#include "PropertyList.h"

#include <cmpi/cmpift.h>

#include <algorithm>
#include <vector>

#include "Names.h"
#include "ObjectPath.h"
#include "Refusal.h"

namespace VA::OSStatusFacade {

namespace {

bool contains(const std::vector<const char*>& names, const std::string& name) {
    return std::any_of(names.begin(), names.end(), [&name](const char* each) {
        return each != nullptr && equalNames(each, name);
    });
}

// Of characters, brokers take the pointer itself, not the address of one.
const CMPIValue* argument(const CMPIData& data) {
    return data.type == CMPI_chars ? reinterpret_cast<const CMPIValue*>(data.value.chars)
                                   : &data.value;
}

void copyProperties(const CMPIInstance* from, const std::vector<const char*>& names,
                    const CMPIInstance* to) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPICount count = from->ft->getPropertyCount(from, &status);
    if (status.rc != CMPI_RC_OK)
        throw Refusal(CMPI_RC_ERR_FAILED, "the object manager does not count properties");
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* name = nullptr;
        const CMPIData data = from->ft->getPropertyAt(from, index, &name, &status);
        if (status.rc != CMPI_RC_OK)
            throw Refusal(CMPI_RC_ERR_FAILED, "the object manager does not tell a property");
        if ((data.state & CMPI_nullValue) != 0) continue;
        const std::string property = charactersOf(name);
        if (!contains(names, property)) continue;
        status = to->ft->setProperty(to, property.c_str(), argument(data), data.type);
        if (status.rc != CMPI_RC_OK)
            throw Refusal(CMPI_RC_ERR_FAILED, "the object manager does not take a property");
    }
}

}  // namespace

const CMPIInstance* narrowed(const CMPIBroker* broker, const CMPIInstance* instance,
                             const char** properties) {
    if (properties == nullptr) return instance;
    const CMPIObjectPath* const path = pathOf(instance);
    CMPIInstance* const result = broker->eft->newInstance(broker, path, nullptr);
    if (result == nullptr)
        throw Refusal(CMPI_RC_ERR_FAILED, "the object manager makes no instance");

    const std::vector<KeyBinding> keys = keysOf(path);
    std::vector<const char*> names;
    for (const KeyBinding& key : keys) names.push_back(key.name.c_str());
    names.push_back(nullptr);
    std::vector<const char*> keyNames = names;
    names.pop_back();
    for (const char** property = properties; *property != nullptr; ++property)
        names.push_back(*property);
    names.push_back(nullptr);
    // An object manager may have filled the new instance with all properties of its class: the
    // filter takes those out.
    result->ft->setPropertyFilter(result, names.data(), keyNames.data());
    copyProperties(instance, names, result);
    return result;
}

}  // namespace VA::OSStatusFacade
