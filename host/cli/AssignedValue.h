#pragma once

#include <string>

#include "host/broker/ClassCatalogue.h"
#include "host/broker/Value.h"
#include "host/mof/MofSyntax.h"

namespace cmpihost {

/// The value that a user gives to a property as text, in the type that the class declares. Texts
/// and datetimes are taken as they stand, a reference is a path, every other value and the list of
/// an array (in braces) is a constant as MOF writes it, NULL included. A single constant given to
/// an array is a list of one. Throws UsageError or, for a path, PathError.
Value assignedValue(const std::string& text, const mof::Feature& property,
                    const ClassCatalogue* catalogue);

}  // namespace cmpihost
