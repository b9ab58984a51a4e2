#include <utility>

#include "Keys.h"
#include "ProviderUtilities.h"
#include "Strings.h"

namespace VA {
unsigned int ProviderUtilities::getKeyCount(const CMPIObjectPath* path) {
    return path == nullptr ? 0 : path->ft->getKeyCount(path, nullptr);
}

std::string ProviderUtilities::getNamespace(const CMPIObjectPath* path) {
    if (path == nullptr) return "";
    const char* nameSpace = charactersOf(path->ft->getNameSpace(path, nullptr));
    return nameSpace == nullptr ? "" : nameSpace;
}

CMPIObjectPath* ProviderUtilities::createObjectPath(const CMPIBroker* broker, const char* className,
                                                    std::string nameSpace) {
    if (broker == nullptr) return nullptr;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIObjectPath* path =
        broker->eft->newObjectPath(broker, nameSpace.c_str(), className, &status);
    return status.rc == CMPI_RC_OK ? path : nullptr;
}

void ProviderUtilities::setKeyProperty(CMPIObjectPath* path, const char* name, const char* value) {
    if (path == nullptr || value == nullptr) return;
    // Of characters, brokers take the pointer itself, not the address of one.
    path->ft->addKey(path, name, reinterpret_cast<const CMPIValue*>(value), CMPI_chars);
}

void ProviderUtilities::setKeyProperty(CMPIObjectPath* path, const char* name,
                                       const std::string& value) {
    setKeyProperty(path, name, value.c_str());
}

void ProviderUtilities::setKeyProperty(CMPIObjectPath* path, const char* name,
                                       CMPIObjectPath* value) {
    if (path == nullptr || value == nullptr) return;
    CMPIValue reference = {};
    reference.ref = value;
    path->ft->addKey(path, name, &reference, CMPI_ref);
}

bool ProviderUtilities::getKeyProperty(const CMPIObjectPath* path, const char* name,
                                       std::string& value) {
    CMPIData key = {};
    return readKey(path, name, key) && keyText(key, value);
}

bool ProviderUtilities::getKeyProperty(const CMPIObjectPath* path, const char* name,
                                       const CMPIObjectPath** value) {
    CMPIData key = {};
    if (!readKey(path, name, key) || key.type != CMPI_ref || key.value.ref == nullptr) return false;
    *value = key.value.ref;
    return true;
}

void ProviderUtilities::transformObjectPathToMoniker(const CMPIObjectPath* path, Moniker& moniker) {
    const unsigned int count = getKeyCount(path);
    const char* name = nullptr;
    CMPIData key = {};
    std::string value;
    for (unsigned int index = 0; index < count; ++index)
        if (readKeyAt(path, index, name, key) && keyText(key, value)) moniker.addKey(name, value);
}

void ProviderUtilities::transformMonikerToObjectPath(Moniker& moniker, CMPIObjectPath** path) {
    if (path == nullptr) return;
    const unsigned int count = moniker.getKeyCount();
    for (unsigned int index = 0; index < count; ++index) {
        moniker.selectKey(index);
        std::string name;
        std::string value;
        moniker.getName(name);
        moniker.getValue(value);
        setKeyProperty(*path, name.c_str(), value);
    }
}

}  // namespace VA
