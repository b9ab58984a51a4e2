// Brokers differ: some hand out null strings, keys without a value, or objects together with an
// error, and low table versions lack functions. Here they are met once, so that the provider need
// not know: a broker that fails leaves a key, a property or an object out.
#include "ProviderUtilities.h"

#include <cstdio>
#include <optional>
#include <utility>

#include "base/Ascii.h"
#include "base/CimDateTime.h"
#include "base/CmpiText.h"

namespace VA {
namespace {

struct ClassId {
    const char* className;
    unsigned short id;
};

constexpr ClassId catalogue[] = {
    {"KORVA_ComputerSystem", 1},
    {"KORVA_OperatingSystem", 55},
    {"KORVA_OperatingSystemCapabilities", 56},
    {"KORVA_InstalledOS", 57},
    {"KORVA_RunningOS", 64},
    {"KORVA_OSElementCapabilities", 65},
};

constexpr unsigned short unknownClass = 0;

// The characters of a broker's string, null when there are none: brokers hand out null strings, and
// strings without characters, where a value is absent. They live as long as the string.
const char* charactersOf(const CMPIString* string) {
    if (string == nullptr || string->hdl == nullptr) return nullptr;
    return string->ft->getCharPtr(string, nullptr);
}

bool hasValue(const CMPIStatus& status, const CMPIData& key) {
    constexpr CMPIValueState absent = CMPI_nullValue | CMPI_notFound | CMPI_badValue;
    return status.rc == CMPI_RC_OK && (key.state & absent) == 0;
}

// Reads the key binding of a name. False when there is none, or none with a value: brokers show
// that by their status, any but OK, or by the state of the value. `key` is then not to be used.
bool readKey(const CMPIObjectPath* path, const char* name, CMPIData& key) {
    if (path == nullptr || name == nullptr) return false;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    key = path->ft->getKey(path, name, &status);
    return hasValue(status, key);
}

// The same for the binding at an index, with its name, which lives as long as the path.
bool readKeyAt(const CMPIObjectPath* path, CMPICount index, const char*& name, CMPIData& key) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIString* text = nullptr;
    key = path->ft->getKeyAt(path, index, &text, &status);
    name = charactersOf(text);
    return name != nullptr && hasValue(status, key);
}

bool assign(const char* characters, std::string& text) {
    if (characters == nullptr) return false;
    text = characters;
    return true;
}

// Enough digits that the text names the same number again.
bool real(double number, int digits, std::string& text) {
    char characters[40];
    std::snprintf(characters, sizeof characters, "%.*g", digits, number);
    return assign(characters, text);
}

bool dateTime(const CMPIDateTime* moment, std::string& text) {
    if (moment == nullptr) return false;
    return assign(charactersOf(moment->ft->getStringFormat(moment, nullptr)), text);
}

// Writes the value of a key that was read as text: strings as they are, numbers in decimal,
// booleans as "true" or "false", datetimes in their CIM form. False, and `text` is left alone, for
// what is no text: references, arrays and the like.
bool keyText(const CMPIData& key, std::string& text) {
    const CMPIValue& value = key.value;
    switch (key.type) {
        case CMPI_string:
            return assign(charactersOf(value.string), text);
        case CMPI_chars:
            return assign(value.chars, text);
        case CMPI_real32:
            return real(value.real32, 9, text);
        case CMPI_real64:
            return real(value.real64, 17, text);
        case CMPI_dateTime:
            return dateTime(value.dateTime, text);
        default:
            break;
    }
    std::optional<std::string> scalar = base::scalarText(key);
    if (!scalar) return false;
    text = std::move(*scalar);
    return true;
}

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
    instance->ft->setProperty(instance, name, base::charsArgument(characters), CMPI_chars);
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
        if (key.type == CMPI_chars) {
            setCharacters(instance, name, key.value.chars);
        } else {
            set(instance, name, key.value, key.type);
        }
    }
}

// Any that the grammar has, but those whose asterisks stand for an interval's ":000": an interval
// has no zone that could be left open.
bool isCimDateTime(std::string_view text) noexcept {
    const auto parsed = base::parseCimDateTime(text);
    return parsed && (!parsed->isInterval || parsed->utcOffset);
}

}  // namespace

unsigned short ProviderUtilities::getClassId(const CMPIObjectPath* path) {
    if (path == nullptr) return unknownClass;
    return getClassId(charactersOf(path->ft->getClassName(path, nullptr)));
}

unsigned short ProviderUtilities::getClassId(const char* className) {
    if (className == nullptr) return unknownClass;
    for (const ClassId& entry : catalogue) {
        if (base::equalsIgnoreCase(entry.className, className)) return entry.id;
    }
    return unknownClass;
}

unsigned int ProviderUtilities::getKeyCount(const CMPIObjectPath* path) {
    return path == nullptr ? 0 : path->ft->getKeyCount(path, nullptr);
}

std::string ProviderUtilities::getNamespace(const CMPIObjectPath* path) {
    if (path == nullptr) return "";
    const char* nameSpace = charactersOf(path->ft->getNameSpace(path, nullptr));
    return nameSpace == nullptr ? "" : nameSpace;
}

CMPIObjectPath* ProviderUtilities::createObjectPath(
    const CMPIBroker* broker, const char* className,
    std::string nameSpace) {  // NOLINT(performance-unnecessary-value-param): the contract's type
    if (broker == nullptr) return nullptr;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIObjectPath* path =
        broker->eft->newObjectPath(broker, nameSpace.c_str(), className, &status);
    return status.rc == CMPI_RC_OK ? path : nullptr;
}

void ProviderUtilities::setKeyProperty(CMPIObjectPath* path, const char* name, const char* value) {
    if (path == nullptr || value == nullptr) return;
    path->ft->addKey(path, name, base::charsArgument(value), CMPI_chars);
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
    if (moment != nullptr && status.rc == CMPI_RC_OK) {
        set(instance, name, &CMPIValue::dateTime, moment, CMPI_dateTime);
    }
}

void ProviderUtilities::transformObjectPathToMoniker(const CMPIObjectPath* path, Moniker& moniker) {
    const unsigned int count = getKeyCount(path);
    const char* name = nullptr;
    CMPIData key = {};
    std::string value;
    for (unsigned int index = 0; index < count; ++index) {
        if (readKeyAt(path, index, name, key) && keyText(key, value)) moniker.addKey(name, value);
    }
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
