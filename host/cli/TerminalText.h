#pragma once

#include <string>
#include <string_view>

namespace cmpihost {

/// The text with everything that could steer a terminal written out: control characters as \n, \t,
/// \r or \x1b, characters that turn the direction of writing as \u202e, bytes that are no UTF-8 as
/// \xff. Backslashes stay as they are: the result is to be read by people, not taken apart again.
std::string terminalText(std::string_view text);

}  // namespace cmpihost
