#include "host/server/Associations.h"

#include "base/Ascii.h"

#include <algorithm>

namespace cmpihost::server {

namespace {

bool passesRole(const std::optional<std::string>& role, const PropertyDeclaration& reference) {
    return !role || base::equalsIgnoreCase(*role, reference.name);
}

void addOnce(std::vector<std::string>& names, const std::string& name) {
    const auto isSame = [&](const std::string& each) { return base::equalsIgnoreCase(each, name); };
    if (std::none_of(names.begin(), names.end(), isSame)) names.push_back(name);
}

/// The association classes that somebody serves in the namespace, each once, as the schema spells
/// them.
std::vector<std::string> servedAssociations(const ObjectManager& manager,
                                            const std::string& nameSpace) {
    std::vector<std::string> names;
    for (const Registration& each : manager.registrations().all())
        if (each.serves(Interface::Association, nameSpace))
            addOnce(names, manager.spelling(nameSpace, each.className));
    return names;
}

/// The ways of a declared association from objects of a class.
Tie declaredTie(const ClassCatalogue& catalogue, const ClassDeclaration& association,
                const std::string& className, const AssociationFilter& filter) {
    Tie tie;
    tie.association = association.name;
    for (const PropertyDeclaration& near : association.properties) {
        if (near.type != CMPI_ref || !passesRole(filter.role, near)) continue;
        const ClassRelation relation = classRelation(&catalogue, className, near.referenceClass);
        if (relation == ClassRelation::Unrelated) continue;
        for (const PropertyDeclaration& far : association.properties) {
            if (far.type != CMPI_ref || &far == &near || !passesRole(filter.farRole, far)) continue;
            tie.ways.push_back({&near, &far});
            tie.certain = tie.certain || relation != ClassRelation::Unknown;
        }
    }
    return tie;
}

/// Of the declared associations those that refer to the class for certain.
std::vector<Tie> certainTies(const ObjectManager& manager, const std::string& nameSpace,
                             const std::string& className, const AssociationFilter& filter) {
    std::vector<Tie> ties = tiesOf(manager, nameSpace, className, filter);
    ties.erase(
        std::remove_if(ties.begin(), ties.end(), [](const Tie& tie) { return !tie.certain; }),
        ties.end());
    return ties;
}

}  // namespace

std::vector<Tie> tiesOf(const ObjectManager& manager, const std::string& nameSpace,
                        const std::string& className, const AssociationFilter& filter) {
    const ClassCatalogue& catalogue = manager.catalogue(nameSpace);
    std::vector<Tie> ties;
    for (const std::string& name : servedAssociations(manager, nameSpace)) {
        if (filter.association && !manager.isA(nameSpace, name, *filter.association)) continue;
        const ClassDeclaration* const declared = catalogue.find(name);
        if (declared == nullptr) {
            ties.push_back({name});
            continue;
        }
        Tie tie = declaredTie(catalogue, *declared, className, filter);
        if (!tie.ways.empty()) ties.push_back(std::move(tie));
    }
    return ties;
}

std::vector<std::string> associatedClasses(const ObjectManager& manager,
                                           const std::string& nameSpace,
                                           const std::string& className,
                                           const AssociationFilter& filter) {
    std::vector<std::string> ends;
    for (const Tie& tie : certainTies(manager, nameSpace, className, filter))
        for (const AssociationWay& way : tie.ways) addOnce(ends, way.far->referenceClass);
    if (ends.empty()) return ends;

    std::vector<std::string> classes;
    for (const std::string& name : manager.schema(nameSpace).classNames()) {
        const auto isBelow = [&](const std::string& ancestor) {
            return manager.isA(nameSpace, name, ancestor);
        };
        if (filter.farClass && !isBelow(*filter.farClass)) continue;
        if (std::any_of(ends.begin(), ends.end(), isBelow)) classes.push_back(name);
    }
    return classes;
}

std::vector<std::string> referringClasses(const ObjectManager& manager,
                                          const std::string& nameSpace,
                                          const std::string& className,
                                          const AssociationFilter& filter) {
    std::vector<std::string> classes;
    for (const Tie& tie : certainTies(manager, nameSpace, className, filter))
        classes.push_back(tie.association);
    return classes;
}

}  // namespace cmpihost::server
