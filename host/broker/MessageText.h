// Texts with arguments $0 to $9. Internal.
#pragma once

#include "host/broker/Call.h"

#include <cstdarg>
#include <string>
#include <vector>

namespace cmpihost {

/// Reads `count` pairs of type and value. Throws Failure for more than ten or a type that cannot be
/// passed so.
std::vector<std::string> messageArguments(CMPICount count, std::va_list& arguments,
                                          const CallName& call);

/// The text with every $n replaced by argument n, where there is one.
std::string expandMessage(const char* text, const std::vector<std::string>& arguments);

}  // namespace cmpihost
