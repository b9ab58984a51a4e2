#pragma once

#include "host/broker/Value.h"

namespace cmpihost {

/// The ways in which a value is written: types that are written alike are of one kind.
enum class ValueKind {
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

/// Null for a null of any type; the accessor of Value that belongs to the kind never throws.
ValueKind kindOf(const Value& value);

}  // namespace cmpihost
