#ifndef HOST_CLI_DESCRIBE_H
#define HOST_CLI_DESCRIBE_H

#include <cstdint>
#include <optional>
#include <ostream>
#include <string>
#include <variant>
#include <vector>

#include "host/cli/Terminal.h"
#include "host/mof/Schema.h"

/// What the schema says about classes, as plain data that a printer writes in any form. Every text
/// is as the MOF has it: a printer for a terminal escapes it.
namespace cmpihost {

/// A class in a list of all.
struct ClassSummary {
    std::string name;
    /// Empty for a root class; need not be in the schema itself.
    std::string superclass;
    /// "class", "association" or "indication".
    std::string kind;
    bool isAbstract = false;
};

/// An entry of a value map: a number, a range ("11..32767", "..") or a text, and what it means.
struct ValueMeaning {
    std::string value;
    /// Empty where the class tells the values but not what they mean.
    std::string meaning;
};

/// A property, a reference, a parameter or what a method returns, inherited qualifiers included.
struct FeatureDescription {
    std::string name;
    /// "uint16"; for a reference "ref".
    std::string type;
    /// The class that a reference points to; else empty.
    std::string referenceClass;
    bool array = false;
    std::string description;
    /// In the order of the MOF; empty for none.
    std::vector<ValueMeaning> values;
    /// Units, else PUnit, as written; empty for none.
    std::string units;
    std::optional<std::uint64_t> maxLength;
    /// As MOF writes it ("5", "\"text\"", "{1, 2}"); absent for none and for NULL.
    std::optional<std::string> defaultValue;
    /// What takes its place where it is deprecated, perhaps nothing; absent where it is not.
    std::optional<std::vector<std::string>> deprecated;
};

struct PropertyDescription : FeatureDescription {
    bool key = false;
    bool required = false;
    bool writable = false;
    /// The class whose property it is.
    std::string className;
    /// The uppermost class of the schema that declares it.
    std::string origin;
    /// The superclass that it comes from as far as the schema tells: set where `origin` overrides
    /// the property of a class that the schema does not have.
    std::string inheritedFrom;
    /// Where its value comes from, as MappingStrings tells it: "/proc/meminfo: MemTotal" for
    /// "File.Linux|/proc/meminfo|MemTotal", other forms with their name: "Call.Linux: uname".
    std::vector<std::string> sources;
};

struct ParameterDescription : FeatureDescription {
    bool in = false;
    bool out = false;
    bool required = false;
};

struct MethodDescription {
    /// What it returns; its name, description and values are those of the method.
    FeatureDescription result;
    std::vector<ParameterDescription> parameters;
    bool isStatic = false;
    std::string className;
    std::string origin;
};

struct ClassDescription {
    ClassSummary summary;
    std::string description;
    std::string version;
    /// From the nearest to the root, the last one perhaps not in the schema.
    std::vector<std::string> superclasses;
    /// Those that descend from it directly, in alphabetical order.
    std::vector<std::string> subclasses;
    /// Keys first, then the class's own before inherited ones.
    std::vector<PropertyDescription> properties;
    std::vector<MethodDescription> methods;
};

using Description = std::variant<ClassDescription, PropertyDescription, MethodDescription>;

/// All classes of the schema in alphabetical order.
std::vector<ClassSummary> classSummaries(const Schema& schema);

/// What `subject` names, without case: a class, or a property or method of it behind a dot. Throws
/// UsageError, with the names that are near, when the schema has no such class or the class no such
/// member.
Description describe(const Schema& schema, const std::string& subject);

/// For people: what a description says, wrapped at the terminal's width; of a class a line for each
/// property and method with the first sentence of its description.
void print(const Description& description, const Terminal& terminal, std::ostream& stream);

/// A line for each class: its name, its superclass ('-' for none) and its kind.
void print(const std::vector<ClassSummary>& classes, const Terminal& terminal,
           std::ostream& stream);

}  // namespace cmpihost

#endif
