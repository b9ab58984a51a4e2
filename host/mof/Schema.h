#ifndef HOST_MOF_SCHEMA_H
#define HOST_MOF_SCHEMA_H

#include <filesystem>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "host/broker/ClassCatalogue.h"
#include "host/mof/MofAst.h"
#include "host/mof/ValueMap.h"

namespace cmpihost {

/// The classes that the host knows, read from MOF files. Names compare without case. A superclass
/// that no file declares (those of the CIM schema) is known by its name alone. Immutable once
/// loaded, so any thread may read it.
class Schema {
  public:
    /// Moves, but does not copy: value maps are found by the addresses of their properties.
    Schema() = default;
    Schema(Schema&&) = default;
    Schema& operator=(Schema&&) = default;

    /// Reads every *.mof file of the folder, in the order of their names. An include pragma adds
    /// nothing, for all files of the folder are read anyway. Throws mof::MofError for a file that
    /// is no MOF, std::runtime_error when the folder or a file in it cannot be read, a *.mof is
    /// no regular file, or there is no class.
    static Schema load(const std::filesystem::path& folder);

    /// Adds the classes of one text. Throws mof::MofError, also for a class that is there already,
    /// one that descends from itself, and ValueMap and Values that do not match.
    void add(const mof::Document& document);

    /// The class, or null.
    const mof::Class* find(const std::string& className) const;

    /// The property of the class as its nearest declaration in the line of superclasses has it,
    /// or null.
    const mof::Feature* findProperty(const std::string& className,
                                     const std::string& propertyName) const;

    /// All properties of the class: its own in the order of their declaration, then those that
    /// only a superclass declares. Empty for an unknown class.
    std::vector<const mof::Feature*> properties(const std::string& className) const;

    /// Whether the class is the other one or descends from it.
    bool isA(const std::string& className, const std::string& ancestor) const;

    /// Whether the property is a key, by its own declaration or one that it overrides.
    bool isKey(const std::string& className, const std::string& propertyName) const;

    /// Whether the class or one that it descends from is declared as an association.
    bool isAssociation(const std::string& className) const;

    /// The names of the numbers of a property; empty for one that has none or is unknown.
    const ValueMap& valueMap(const std::string& className, const std::string& propertyName) const;

    /// The names of all classes as declared, in alphabetical order.
    std::vector<std::string> classNames() const;

  private:
    void check(const mof::Class& added) const;
    void keepValueMaps(const mof::Class& added);

    std::map<std::string, mof::Class> classes_;
    /// Read once, when their class is added: a wrong one is an error in the file, not at its use.
    std::map<const mof::Feature*, ValueMap> valueMaps_;
};

/// A schema as the broker asks for it. Takes what it needs when it is made, so the schema may go.
class SchemaCatalogue final : public ClassCatalogue {
  public:
    explicit SchemaCatalogue(const Schema& schema);

    const ClassDeclaration* find(std::string_view className) const override;

  private:
    std::map<std::string, ClassDeclaration> declarations_;
};

/// The CMPI type of a declared property, with CMPI_ARRAY for an array.
CMPIType cmpiType(const mof::Feature& property);

}  // namespace cmpihost

#endif
