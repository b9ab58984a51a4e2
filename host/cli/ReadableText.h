#pragma once

#include <cstdint>
#include <string>

#include "host/broker/Value.h"

namespace cmpihost {

/// A size in the largest binary unit that leaves at least one: 8123456 gives "7.7 GiB", 512 gives
/// "512 KiB". One digit after the point, rounded half up.
std::string readableSize(std::uint64_t kibibytes);

/// A CIM datetime for people: an instant in the time zone of this process ("2024-01-02 04:04:05
/// +01:00"), an interval as "3 days 04:05:06". Empty for a text that is neither, and for one that
/// leaves digits open with '*'.
std::string readableDateTime(const std::string& cimText);

/// The shortest decimal that gives the real back, in the precision of its type.
std::string realText(double real, CMPIType type);

/// The text of a CMPI_char16 in UTF-8.
std::string characterText(std::uint64_t code);

}  // namespace cmpihost
