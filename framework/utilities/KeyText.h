#ifndef VA_KEY_TEXT_H
#define VA_KEY_TEXT_H

#include <cmpi/cmpidt.h>

#include <string>

namespace VA {

/// Writes a key value as text: strings as they are, numbers in decimal, booleans as "true" or
/// "false", datetimes in their CIM form. False, and `text` is left alone, for a null value and for
/// what is no text: references, arrays and the like.
bool keyText(const CMPIData& data, std::string& text);

}  // namespace VA

#endif
