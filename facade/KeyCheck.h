#ifndef OSSTATUS_FACADE_KEY_CHECK_H
#define OSSTATUS_FACADE_KEY_CHECK_H

#include <string>
#include <vector>

#include "Classes.h"
#include "ObjectPath.h"

namespace VA::OSStatusFacade {

/// Why these keys of a path of that class can name no instance, as a sentence that names the key:
/// one is missing, there twice, not of the class or of the wrong type; of references, the same for
/// the paths they refer to. Empty when all is well.
std::string keyProblem(const Class& itsClass, const std::vector<KeyBinding>& bindings);

}  // namespace VA::OSStatusFacade

#endif
