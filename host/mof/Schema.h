#ifndef HOST_MOF_SCHEMA_H
#define HOST_MOF_SCHEMA_H

#include <filesystem>
#include <map>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include "host/broker/ClassCatalogue.h"
#include "host/mof/MofAst.h"
#include "host/mof/QualifierTypes.h"
#include "host/mof/ValueMap.h"

namespace cmpihost {

/// The classes that the host knows, read from MOF files. Names compare without case. A superclass
/// that no file declares (those of the CIM schema, for the shipped classes) is known by its name
/// alone. Immutable once loaded, so any thread may read it; what it hands out lives as long as it.
/// host/mof/ResolvedClass.h lists a class with all that it inherits.
class Schema {
  public:
    /// Moves, but does not copy: value maps are found by the addresses of their properties.
    Schema() = default;
    Schema(Schema&&) = default;
    Schema& operator=(Schema&&) = default;

    /// Reads folders and files as readSchemaFiles does; the order of classes does not matter.
    /// Throws what that throws, what add throws, and std::runtime_error when there is no class.
    static Schema load(const std::vector<std::filesystem::path>& paths);
    static Schema load(const std::filesystem::path& path) {
        return load(std::vector<std::filesystem::path>{path});
    }

    /// Adds the classes and the qualifier declarations of one text. Throws mof::MofError, also for
    /// a class that is there already, one that descends from itself, a qualifier that is declared
    /// in two ways, and ValueMap and Values that do not match.
    void add(mof::Document document);

    /// The class, or null.
    const mof::Class* find(std::string_view className) const;

    /// The property of the class as its nearest declaration in the line of superclasses has it,
    /// or null. A qualifier that it does not repeat is found by propertyQualifier.
    const mof::Feature* findProperty(std::string_view className,
                                     std::string_view propertyName) const;

    /// All properties of the class: its own in the order of their declaration, then those that
    /// only a superclass declares. Empty for an unknown class.
    std::vector<const mof::Feature*> properties(const std::string& className) const;

    /// The method of the class as its nearest declaration has it, or null.
    const mof::Method* findMethod(std::string_view className, std::string_view methodName) const;

    /// The qualifier of a property, its own or inherited; null for none.
    const mof::Qualifier* propertyQualifier(std::string_view className,
                                            std::string_view propertyName,
                                            std::string_view qualifierName) const;

    /// Whether the class is the other one or descends from it.
    bool isA(std::string_view className, std::string_view ancestor) const;

    /// Whether the property is a key, by its own declaration or one that it overrides.
    bool isKey(std::string_view className, std::string_view propertyName) const;

    /// Whether the class or one that it descends from is declared as an association.
    bool isAssociation(std::string_view className) const;

    /// The names of the numbers of a property, its own or those of the property that it overrides:
    /// Values and ValueMap may come from different declarations. Empty for one that has none or is
    /// unknown.
    const ValueMap& valueMap(std::string_view className, std::string_view propertyName) const;

    /// The names of all classes as declared, in alphabetical order.
    std::vector<std::string> classNames() const;

    /// The names of the classes that descend from a class directly, or in any degree, in
    /// alphabetical order. The class itself need not be declared; an empty name gives the roots.
    std::vector<std::string> subclasses(std::string_view className, bool anyDegree = false) const;

    /// The qualifiers that the MOF declares, and how qualifiers pass to subclasses.
    const QualifierTypes& qualifierTypes() const { return qualifierTypes_; }

  private:
    void check(const mof::Class& added) const;
    void addClasses(mof::Document document);
    void keepValueMaps(const mof::Class& added);
    void keepValueMap(const mof::Class& owner, const mof::Feature& property,
                      const mof::Qualifier* values, const mof::Qualifier* valueMap);
    void pairInheritedLists();

    std::map<std::string, mof::Class> classes_;
    /// The names of direct subclasses by the name of their superclass in lower case.
    std::unordered_map<std::string, std::vector<std::string>> subclasses_;
    QualifierTypes qualifierTypes_;
    /// Read once, when their class is added: a wrong one is an error in the file, not at its use.
    std::unordered_map<const mof::Feature*, ValueMap> valueMaps_;
    /// Properties with one of the two lists only, which may go with an inherited one.
    std::vector<std::pair<const mof::Class*, const mof::Feature*>> withOneList_;
};

/// A schema as the broker asks for it. What a class declares and inherits is put together when the
/// class is first asked for. The superclasses of the few CIM classes that the shipped ones descend
/// from are known in any schema.
class SchemaCatalogue final : public ClassCatalogue {
  public:
    /// Of a schema that outlives the catalogue, or of one that it keeps.
    explicit SchemaCatalogue(const Schema& schema) : schema_(schema) {}
    explicit SchemaCatalogue(Schema&& schema) : kept_(std::move(schema)), schema_(*kept_) {}

    const ClassDeclaration* find(std::string_view className) const override;
    std::optional<std::string_view> superclassOf(std::string_view className) const override;

  private:
    const std::optional<Schema> kept_{};
    const Schema& schema_;
    mutable std::mutex mutex_;
    /// By the declared class. Under mutex_; the declarations themselves do not change.
    mutable std::unordered_map<const mof::Class*, ClassDeclaration> declarations_;
};

/// The CMPI type of a declared property, with CMPI_ARRAY for an array.
CMPIType cmpiType(const mof::Feature& property);

}  // namespace cmpihost

#endif
