#ifndef HOST_CLI_VALUE_TEXT_H
#define HOST_CLI_VALUE_TEXT_H

#include <cstdint>
#include <optional>
#include <string>

#include "host/broker/Value.h"
#include "host/mof/Schema.h"

namespace cmpihost {

/// The ways in which a value is written: types that are written alike are of one category.
enum class TypeCategory {
    Null,
    Boolean,
    Unsigned,
    Signed,
    Real,
    Text,
    DateTime,
    Character,
    Reference,
    Instance,
    Array,
    /// Bytes that only their provider understands.
    Opaque
};

/// Null for a null of any type; the accessor of Value that belongs to the category never throws.
TypeCategory categoryOf(const Value& value);

/// What a property that holds a size counts, as CIM counts: each is 1024 of the one before.
enum class SizeUnit { Bytes, Kibibytes, Mebibytes };

/// Absent for a unit, as unitsOf() gives it, that is none of a size.
std::optional<SizeUnit> sizeUnit(const std::string& units);

/// A size in the largest binary unit that leaves at least one: 8123456 KiB give "7.7 GiB", 512 give
/// "512 KiB". One digit after the point, rounded half up.
std::string humanReadableSize(std::uint64_t count, SizeUnit counted);

/// A CIM datetime for people: an instant in the time zone of this process ("2024-01-02 04:04:05
/// +01:00"), an interval as "3 days 04:05:06". Empty for a text that is neither, and for one that
/// leaves digits open with '*'.
std::string humanReadableDateTime(const std::string& cimText);

/// A CIM datetime by ISO 8601: an instant in UTC ("2024-01-02T03:04:05Z"), an interval as a
/// duration
/// ("P3DT4H5M6S"), microseconds only where there are any ("PT0.500000S"). Empty for a text that is
/// neither, and for one that leaves digits open with '*'.
std::string isoDateTime(const std::string& cimText);

/// The name of an integer, or null: it has none, or the value is something else.
const std::string* nameOf(const Value& value, const ValueMap& names);

/// A unit of the qualifier PUnit in words, with a prefix in place of the usual powers: "kibibyte"
/// for "byte * 2^10". Any other one as it is.
std::string unitWords(const std::string& programmatic);

/// The unit in which a property counts, in words: its qualifier Units as written ("KiloBytes"),
/// else the words of its PUnit. Empty for none.
std::string unitsOf(const Schema& schema, const std::string& className,
                    const std::string& propertyName);

/// The text of a CMPI_char16 in UTF-8.
std::string characterText(std::uint64_t code);

}  // namespace cmpihost

#endif
