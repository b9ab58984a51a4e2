#include "host/broker/ClassCatalogue.h"

#include "host/broker/Value.h"

#include <algorithm>

namespace cmpihost {

const PropertyDeclaration* ClassDeclaration::property(
    std::string_view propertyName) const noexcept {
    const auto found = std::find_if(properties.begin(), properties.end(),
                                    [propertyName](const PropertyDeclaration& candidate) {
                                        return equalNames(candidate.name, propertyName);
                                    });
    return found == properties.end() ? nullptr : &*found;
}

Kinship kinship(const ClassCatalogue* catalogue, std::string_view className,
                std::string_view ancestor) {
    if (equalNames(className, ancestor)) return Kinship::Same;
    if (catalogue == nullptr) return Kinship::Unknown;

    const ClassDeclaration* declaration = catalogue->find(className);
    while (declaration != nullptr) {
        if (declaration->superclass.empty()) return Kinship::Unrelated;
        if (equalNames(declaration->superclass, ancestor)) return Kinship::Below;
        declaration = catalogue->find(declaration->superclass);
    }
    return Kinship::Unknown;
}

}  // namespace cmpihost
