#ifndef VA_KEYS_H
#define VA_KEYS_H

#include <cmpi/cmpidt.h>

#include <string>

namespace VA {

/// Read the key binding of a name, or the one at an index, and then its name too, which lives as
/// long as the path. False when there is none, or none with a value: brokers tell so by their
/// status, any but OK, or by the state of the value. The outputs are then not to be used.
bool readKey(const CMPIObjectPath* path, const char* name, CMPIData& key);
bool readKeyAt(const CMPIObjectPath* path, CMPICount index, const char*& name, CMPIData& key);

/// Writes the value of a key that was read as text: strings as they are, numbers in decimal,
/// booleans as "true" or "false", datetimes in their CIM form. False, and `text` is left alone, for
/// what is no text: references, arrays and the like.
bool keyText(const CMPIData& key, std::string& text);

}  // namespace VA

#endif
