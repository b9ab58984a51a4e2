#include <utility>

#include "KeyText.h"
#include "ProviderUtilities.h"
#include "Strings.h"

namespace VA {
namespace {

// Reads one key binding; false when the broker has none of that name. Brokers differ in the status
// they give then: any but OK counts.
bool readKey(const CMPIObjectPath* path, const char* name, CMPIData& data) {
    if (path == nullptr || name == nullptr) return false;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    data = path->ft->getKey(path, name, &status);
    return status.rc == CMPI_RC_OK;
}

}  // namespace

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
    CMPIData data = {};
    return readKey(path, name, data) && keyText(data, value);
}

bool ProviderUtilities::getKeyProperty(const CMPIObjectPath* path, const char* name,
                                       const CMPIObjectPath** value) {
    CMPIData data = {};
    if (!readKey(path, name, data) || data.type != CMPI_ref || data.value.ref == nullptr ||
        (data.state & CMPI_nullValue) != 0)
        return false;
    *value = data.value.ref;
    return true;
}

void ProviderUtilities::transformObjectPathToMoniker(const CMPIObjectPath* path, Moniker& moniker) {
    const unsigned int count = getKeyCount(path);
    std::string value;
    for (unsigned int index = 0; index < count; ++index) {
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        CMPIString* name = nullptr;
        const CMPIData data = path->ft->getKeyAt(path, index, &name, &status);
        const char* characters = charactersOf(name);
        if (status.rc == CMPI_RC_OK && characters != nullptr && keyText(data, value))
            moniker.addKey(characters, value);
    }
}

void ProviderUtilities::transformMonikerToObjectPath(Moniker& moniker, CMPIObjectPath** path) {
    if (path == nullptr) return;
    const unsigned int count = moniker.getKeyCount();
    for (unsigned int index = 0; index < count; ++index) {
        if (!moniker.selectKey(index)) continue;
        std::string name;
        std::string value;
        moniker.getName(name);
        moniker.getValue(value);
        setKeyProperty(*path, name.c_str(), value);
    }
}

}  // namespace VA
