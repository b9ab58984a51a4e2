#ifndef HOST_SERVER_ASSOCIATIONS_H
#define HOST_SERVER_ASSOCIATIONS_H

#include <optional>
#include <string>
#include <vector>

#include "host/broker/ClassCatalogue.h"
#include "host/server/ObjectManager.h"

/// The association classes that tie objects to others, by what registrations and schema say.
namespace cmpihost::server {

/// Which associations a client asks for; what is absent restricts nothing. Names compare without
/// case, a class stands for those below it too.
struct AssociationFilter {
    std::optional<std::string> association{};
    /// The reference that points to the source.
    std::optional<std::string> role{};
    /// The reference that points to the far end, and the class of what is there.
    std::optional<std::string> farRole{};
    std::optional<std::string> farClass{};
};

/// From one end of an association to another. Both belong to the catalogue.
struct AssociationWay {
    const PropertyDeclaration* near = nullptr;
    const PropertyDeclaration* far = nullptr;
};

/// An association class that may tie objects of a class to others.
struct Tie {
    std::string association{};
    /// The ways that start from the class and pass the filter; none: the schema does not declare
    /// the association.
    std::vector<AssociationWay> ways{};
    /// The schema says that objects of the class stand at its near ends. Else it lacks a class that
    /// would tell.
    bool certain = false;
};

/// The association classes that are served in the namespace and that may tie objects of
/// `className` to others, each once. `filter.farClass` plays no part: a far end may hold classes
/// below the one that is declared. Any thread may call it.
std::vector<Tie> tiesOf(const ObjectManager& manager, const std::string& nameSpace,
                        const std::string& className, const AssociationFilter& filter);

/// The classes of the schema that associations tie the class `className` to, in alphabetical order.
std::vector<std::string> associatedClasses(const ObjectManager& manager,
                                           const std::string& nameSpace,
                                           const std::string& className,
                                           const AssociationFilter& filter);

/// The association classes of the schema that refer to the class `className`.
std::vector<std::string> referringClasses(const ObjectManager& manager,
                                          const std::string& nameSpace,
                                          const std::string& className,
                                          const AssociationFilter& filter);

}  // namespace cmpihost::server

#endif
