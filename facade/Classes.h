#ifndef FACADE_CLASSES_H
#define FACADE_CLASSES_H

#include <string>
#include <string_view>
#include <vector>

#include "ObjectPath.h"
#include "base/Span.h"

namespace VA::OSStatusFacade {

/// A key of a class.
struct ClassKey {
    const char* name;
    bool isReference;
};

/// A class, as the schema spells it. Nobody is asked about ancestors.
struct Class {
    const char* name;
    base::Span<const char* const> ancestors;
    base::Span<const ClassKey> keys;  ///< in the schema's order
    bool servedByProvider;            ///< the provider behind the facade serves its instances

    /// Whether `other` is the class itself or one of its ancestors.
    bool isA(std::string_view other) const;

    bool isAssociation() const { return keys.begin()->isReference; }

    /// The key of the wanted name, null if there is none.
    const ClassKey* key(std::string_view wanted) const;
};

/// An end of an association: the reference that points to it, and the class of its elements.
struct AssociationEnd {
    const char* role;
    const Class& elements;
};

struct Association {
    const Class& associationClass;
    AssociationEnd ends[2];
};

/// The class of that name, null if it is none that is known here.
const Class* findClass(std::string_view name);

base::Span<const Association> associations();

/// Why these keys of a path of that class can name no instance, as a sentence that names the key:
/// one is missing, there twice, not of the class or of the wrong type; of references, the same for
/// the paths they refer to. Empty when all is well.
std::string keyProblem(const Class& cimClass, const std::vector<KeyBinding>& bindings);

}  // namespace VA::OSStatusFacade

#endif
