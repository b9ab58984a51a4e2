// A schema may begin in the middle of a model: that a class has a superclass which nobody declares
// is common, so that "unrelated" and "not known" are different answers.
#include "host/broker/ClassCatalogue.h"

#include "base/Ascii.h"

namespace cmpihost {

const PropertyDeclaration* ClassDeclaration::property(std::string_view propertyName) const {
    for (const PropertyDeclaration& declared : properties) {
        if (base::equalsIgnoreCase(declared.name, propertyName)) return &declared;
    }
    return nullptr;
}

ClassRelation classRelation(const ClassCatalogue* catalogue, std::string_view className,
                            std::string_view ancestor) {
    if (base::equalsIgnoreCase(className, ancestor)) return ClassRelation::Same;
    if (catalogue == nullptr) return ClassRelation::Unknown;

    const ClassDeclaration* declaration = catalogue->find(className);
    while (declaration != nullptr) {
        if (declaration->superclass.empty()) return ClassRelation::Unrelated;
        if (base::equalsIgnoreCase(declaration->superclass, ancestor)) {
            return ClassRelation::Subclass;
        }
        declaration = catalogue->find(declaration->superclass);
    }
    return ClassRelation::Unknown;
}

}  // namespace cmpihost
