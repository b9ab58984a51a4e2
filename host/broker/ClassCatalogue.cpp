// A schema may begin in the middle of a model: that a class has a superclass which nobody declares
// is common, so that "unrelated" and "not known" are different answers.
#include "host/broker/ClassCatalogue.h"

#include "base/Ascii.h"

namespace cmpihost {

std::optional<std::string_view> ClassCatalogue::superclassOf(std::string_view className) const {
    const ClassDeclaration* const declared = find(className);
    if (declared == nullptr) return std::nullopt;
    return declared->superclass;
}

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

    std::optional<std::string_view> superclass = catalogue->superclassOf(className);
    while (superclass) {
        if (superclass->empty()) return ClassRelation::Unrelated;
        if (base::equalsIgnoreCase(*superclass, ancestor)) return ClassRelation::Subclass;
        superclass = catalogue->superclassOf(*superclass);
    }
    return ClassRelation::Unknown;
}

}  // namespace cmpihost
