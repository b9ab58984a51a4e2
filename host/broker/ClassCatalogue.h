#ifndef HOST_BROKER_CLASS_CATALOGUE_H
#define HOST_BROKER_CLASS_CATALOGUE_H

#include <cmpi/cmpidt.h>

#include <optional>
#include <string>
#include <string_view>
#include <vector>

/// The schema as the broker needs it: which classes there are and what they declare.
namespace cmpihost {

struct PropertyDeclaration {
    std::string name;
    /// Element type, with CMPI_ARRAY for an array; CMPI_ref for a reference, CMPI_string for text.
    CMPIType type = CMPI_null;
    bool key = false;
    /// For a reference the class that it may point to, else empty.
    std::string referenceClass{};
};

struct ClassDeclaration {
    std::string name;
    /// Empty for a root class. It need not be declared itself.
    std::string superclass{};
    bool association = false;
    /// Inherited ones included.
    std::vector<PropertyDeclaration> properties{};

    /// The declaration of a property (name without case), null if there is none.
    const PropertyDeclaration* property(std::string_view propertyName) const;
};

/// Finds class declarations. Any thread may call it, several at once.
class ClassCatalogue {
  public:
    virtual ~ClassCatalogue() = default;

    /// The class of that name (without case), null if it is not declared. Lives as long as the
    /// catalogue.
    virtual const ClassDeclaration* find(std::string_view className) const = 0;

    /// The superclass of a class (name without case), empty for a root class; none where it is not
    /// known. More classes may be known by it than are declared.
    virtual std::optional<std::string_view> superclassOf(std::string_view className) const;

  protected:
    ClassCatalogue() = default;
    ClassCatalogue(const ClassCatalogue&) = default;
    ClassCatalogue& operator=(const ClassCatalogue&) = default;
};

/// How a class stands to another one. Unknown: the chain of superclasses leaves what the catalogue
/// knows before the ancestor is met.
enum class ClassRelation { Same, Subclass, Unrelated, Unknown };

/// The relation of `className` to `ancestor`. A null catalogue knows only equal names.
ClassRelation classRelation(const ClassCatalogue* catalogue, std::string_view className,
                            std::string_view ancestor);

}  // namespace cmpihost

#endif
