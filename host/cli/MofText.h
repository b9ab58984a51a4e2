#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace cmpihost {

/// The text as a string constant of MOF, quotes included. Control characters become escapes; bytes
/// that are no UTF-8 become U+FFFD.
std::string mofString(std::string_view text);

/// The code point as a character constant of MOF, with its quotes; one that is no printable ASCII
/// character as an escape.
std::string mofCharacter(std::uint32_t code);

}  // namespace cmpihost
