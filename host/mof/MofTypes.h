#pragma once

#include <optional>
#include <string>

#include "host/mof/MofSyntax.h"

namespace cmpihost::mof {

/// The type of that name (without case); absent for a name that is no intrinsic type.
std::optional<Type> typeNamed(const std::string& name);

/// The name as MOF writes it; "ref" for a reference.
const char* nameOf(Type type);

/// Whether a constant can stand for a value of the type: its kind is right and it is in range.
/// NULL fits every type.
bool fits(const Scalar& scalar, Type type);

}  // namespace cmpihost::mof
