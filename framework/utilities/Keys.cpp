#include "Keys.h"

#include <cmpi/cmpift.h>

#include <cstdio>

#include "Strings.h"

namespace VA {
namespace {

bool hasValue(const CMPIStatus& status, const CMPIData& key) {
    constexpr CMPIValueState absent = CMPI_nullValue | CMPI_notFound | CMPI_badValue;
    return status.rc == CMPI_RC_OK && (key.state & absent) == 0;
}

bool assign(const char* characters, std::string& text) {
    if (characters == nullptr) return false;
    text = characters;
    return true;
}

template <class Integer>
bool decimal(Integer number, std::string& text) {
    text = std::to_string(number);
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

}  // namespace

bool readKey(const CMPIObjectPath* path, const char* name, CMPIData& key) {
    if (path == nullptr || name == nullptr) return false;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    key = path->ft->getKey(path, name, &status);
    return hasValue(status, key);
}

bool readKeyAt(const CMPIObjectPath* path, CMPICount index, const char*& name, CMPIData& key) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIString* text = nullptr;
    key = path->ft->getKeyAt(path, index, &text, &status);
    name = charactersOf(text);
    return name != nullptr && hasValue(status, key);
}

bool keyText(const CMPIData& key, std::string& text) {
    const CMPIValue& value = key.value;
    switch (key.type) {
        case CMPI_string:
            return assign(charactersOf(value.string), text);
        case CMPI_chars:
            return assign(value.chars, text);
        case CMPI_boolean:
            return assign(value.boolean != 0 ? "true" : "false", text);
        case CMPI_uint8:
            return decimal(value.uint8, text);
        case CMPI_uint16:
            return decimal(value.uint16, text);
        case CMPI_uint32:
            return decimal(value.uint32, text);
        case CMPI_uint64:
            return decimal(value.uint64, text);
        case CMPI_sint8:
            return decimal(value.sint8, text);
        case CMPI_sint16:
            return decimal(value.sint16, text);
        case CMPI_sint32:
            return decimal(value.sint32, text);
        case CMPI_sint64:
            return decimal(value.sint64, text);
        case CMPI_char16:
            return decimal(value.char16, text);
        case CMPI_real32:
            return real(value.real32, 9, text);
        case CMPI_real64:
            return real(value.real64, 17, text);
        case CMPI_dateTime:
            return dateTime(value.dateTime, text);
        default:
            return false;
    }
}

}  // namespace VA
