#ifndef VA_STRINGS_H
#define VA_STRINGS_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

namespace VA {

/// The characters of a broker's string, null when there are none: brokers hand out null strings,
/// and strings without characters, where a value is absent. They live as long as the string.
inline const char* charactersOf(const CMPIString* string) {
    if (string == nullptr || string->hdl == nullptr) return nullptr;
    return string->ft->getCharPtr(string, nullptr);
}

}  // namespace VA

#endif
