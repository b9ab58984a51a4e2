#include "CimDateTime.h"
#include "Keys.h"
#include "ProviderUtilities.h"

namespace VA {
namespace {

void set(CMPIInstance* instance, const char* name, const CMPIValue& value, CMPIType type) {
    if (instance != nullptr) instance->ft->setProperty(instance, name, &value, type);
}

template <class Member>
void set(CMPIInstance* instance, const char* name, Member CMPIValue::*member, Member content,
         CMPIType type) {
    CMPIValue value = {};
    value.*member = content;
    set(instance, name, value, type);
}

void setCharacters(CMPIInstance* instance, const char* name, const char* characters) {
    if (instance == nullptr || characters == nullptr) return;
    // Of characters, brokers take the pointer itself, not the address of one.
    instance->ft->setProperty(instance, name, reinterpret_cast<const CMPIValue*>(characters),
                              CMPI_chars);
}

// Sets an array property from `count` elements, each supplied by `element(index, value)`; a broker
// that fails on the way leaves the property out. Elements are handed over as whole values: some
// brokers copy that much whatever the type.
template <class Element>
void setArray(const CMPIBroker* broker, CMPIInstance* instance, const char* name, std::size_t count,
              CMPIType type, Element element) {
    if (broker == nullptr || instance == nullptr) return;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIArray* array = broker->eft->newArray(broker, static_cast<CMPICount>(count), type, &status);
    if (array == nullptr || status.rc != CMPI_RC_OK) return;
    for (std::size_t index = 0; index < count; ++index) {
        CMPIValue value = {};
        if (!element(index, value)) return;
        status = array->ft->setElementAt(array, static_cast<CMPICount>(index), &value, type);
        if (status.rc != CMPI_RC_OK) return;
    }
    set(instance, name, &CMPIValue::array, array, static_cast<CMPIType>(type | CMPI_ARRAY));
}

// A property for each key of the path, of the key's own type.
void setKeys(CMPIInstance* instance, const CMPIObjectPath* path) {
    const unsigned int count = ProviderUtilities::getKeyCount(path);
    const char* name = nullptr;
    CMPIData key = {};
    for (unsigned int index = 0; index < count; ++index) {
        if (!readKeyAt(path, index, name, key)) continue;
        if (key.type == CMPI_chars)
            setCharacters(instance, name, key.value.chars);
        else
            set(instance, name, key.value, key.type);
    }
}

}  // namespace

CMPIInstance* ProviderUtilities::createInstance(const CMPIBroker* broker, CMPIObjectPath* path) {
    if (broker == nullptr || path == nullptr) return nullptr;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIInstance* instance = broker->eft->newInstance(broker, path, &status);
    if (instance == nullptr || status.rc != CMPI_RC_OK) return nullptr;
    setKeys(instance, path);
    return instance;
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, bool value) {
    set(instance, name, &CMPIValue::boolean, CMPIBoolean{value}, CMPI_boolean);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name,
                                    unsigned short value) {
    set(instance, name, &CMPIValue::uint16, value, CMPI_uint16);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, short value) {
    set(instance, name, &CMPIValue::sint16, value, CMPI_sint16);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, unsigned int value) {
    set(instance, name, &CMPIValue::uint32, value, CMPI_uint32);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name,
                                    unsigned long long value) {
    set(instance, name, &CMPIValue::uint64, value, CMPI_uint64);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, unsigned long value) {
    setProperty(instance, name, static_cast<unsigned long long>(value));
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, std::string& value) {
    setProperty(instance, name, value.c_str());
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name, const char* value) {
    setCharacters(instance, name, value);
}

void ProviderUtilities::setProperty(CMPIInstance* instance, const char* name,
                                    CMPIObjectPath* value) {
    if (value != nullptr) set(instance, name, &CMPIValue::ref, value, CMPI_ref);
}

void ProviderUtilities::setProperty(const CMPIBroker* broker, CMPIInstance* instance,
                                    const char* name, std::vector<unsigned short>& value) {
    setArray(broker, instance, name, value.size(), CMPI_uint16,
             [&value](std::size_t index, CMPIValue& element) {
                 element.uint16 = value[index];
                 return true;
             });
}

void ProviderUtilities::setProperty(const CMPIBroker* broker, CMPIInstance* instance,
                                    const char* name, std::vector<std::string>& value) {
    setArray(broker, instance, name, value.size(), CMPI_string,
             [&value, broker](std::size_t index, CMPIValue& element) {
                 element.string = broker->eft->newString(broker, value[index].c_str(), nullptr);
                 return element.string != nullptr;
             });
}

void ProviderUtilities::setProperty(const CMPIBroker* broker, CMPIInstance* instance,
                                    const char* name, std::string& text, bool isDateTime) {
    if (!isDateTime) return setProperty(instance, name, text);
    // Brokers differ in what they make of a text that is no datetime; none may get the chance.
    if (broker == nullptr || instance == nullptr || !isCimDateTime(text)) return;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIDateTime* moment = broker->eft->newDateTimeFromChars(broker, text.c_str(), &status);
    if (moment != nullptr && status.rc == CMPI_RC_OK)
        set(instance, name, &CMPIValue::dateTime, moment, CMPI_dateTime);
}

}  // namespace VA
