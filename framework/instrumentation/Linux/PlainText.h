#ifndef VA_LINUX_PLAIN_TEXT_H
#define VA_LINUX_PLAIN_TEXT_H

#include <string_view>

namespace VA::Linux {

/// True for text that can be shown and used as a key: 1 to 256 characters of valid UTF-8, none of
/// them a control character, not all of them blanks.
bool isPlainText(std::string_view text);

}  // namespace VA::Linux

#endif
