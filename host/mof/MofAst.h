#ifndef HOST_MOF_MOF_AST_H
#define HOST_MOF_MOF_AST_H

#include <cstddef>
#include <cstdint>
#include <optional>
#include <stdexcept>
#include <string>
#include <variant>
#include <vector>

/// What a MOF text says, piece by piece and unjudged: plain data, copied freely.
namespace cmpihost::mof {

/// A place in a text; both count from 1, columns in characters (not bytes) of UTF-8.
struct Position {
    std::size_t line = 1;
    std::size_t column = 1;
};

/// A MOF text that cannot be read. what() is "FILE:LINE:COLUMN: what was expected".
class MofError : public std::runtime_error {
  public:
    MofError(const std::string& file, Position position, const std::string& complaint);

    /// What was expected, without the place.
    const std::string& complaint() const { return complaint_; }
    Position position() const { return position_; }

  private:
    std::string complaint_;
    Position position_;
};

enum class Type {
    Boolean,
    String,
    Char16,
    DateTime,
    UInt8,
    SInt8,
    UInt16,
    SInt16,
    UInt32,
    SInt32,
    UInt64,
    SInt64,
    Real32,
    Real64,
    Reference
};

/// A character constant, as the number of its code point.
struct Character {
    std::uint32_t code = 0;

    bool operator==(const Character& other) const { return code == other.code; }
};

/// One constant. monostate is NULL; a number without '-' is unsigned, one with '-' signed.
using Scalar =
    std::variant<std::monostate, bool, std::uint64_t, std::int64_t, double, Character, std::string>;

/// A constant or a list of constants in braces; without braces there is exactly one item.
struct Initializer {
    bool array = false;
    std::vector<Scalar> items;
};

/// How a qualifier passes from a class to its subclasses. What is absent is not told.
struct Flavor {
    /// ToSubclass; false: Restricted.
    std::optional<bool> toSubclass{};
    /// EnableOverride; false: DisableOverride.
    std::optional<bool> overridable{};
    bool translatable = false;

    bool operator==(const Flavor& other) const {
        return toSubclass == other.toSubclass && overridable == other.overridable &&
               translatable == other.translatable;
    }
};

struct Qualifier {
    std::string name;
    Position position;
    /// Absent where the qualifier stands alone, which says "true".
    std::optional<Initializer> value{};
    Flavor flavor{};
};

/// The declaration of a qualifier: "Qualifier Key : boolean = false, Scope(property), ...".
struct QualifierType {
    std::string name;
    std::string file;
    Position position;
    Type type = Type::String;
    bool array = false;
    std::optional<Initializer> defaultValue{};
    /// What it may stand on, as written: "class", "any".
    std::vector<std::string> scopes{};
    Flavor flavor{};
};

/// A property, a reference or the parameter of a method.
struct Feature {
    std::string name;
    Position position;
    Type type = Type::String;
    /// The class that a reference points to; empty for every other type.
    std::string referenceClass;
    bool array = false;
    std::optional<Initializer> defaultValue;
    std::vector<Qualifier> qualifiers;
};

struct Method {
    Feature result;
    std::vector<Feature> parameters;
};

struct Class {
    std::string name;
    std::string superclass;
    std::string file;
    Position position;
    std::vector<Qualifier> qualifiers;
    std::vector<Feature> properties;
    std::vector<Method> methods;
};

/// A file that an include pragma names.
struct Include {
    std::string file;
    Position position;
};

/// What one text holds, each in its order.
struct Document {
    std::string file;
    std::vector<QualifierType> qualifierTypes;
    std::vector<Class> classes;
    std::vector<Include> includes;
};

/// The type of that name (without case); absent for a name that is no intrinsic type.
std::optional<Type> typeNamed(const std::string& name);

/// The name as MOF writes it; "ref" for a reference.
const char* nameOf(Type type);

/// Whether a constant can stand for a value of the type: its kind is right and it is in range.
/// NULL fits every type.
bool fits(const Scalar& scalar, Type type);

/// The qualifier of that name (without case), or null.
const Qualifier* findQualifier(const std::vector<Qualifier>& qualifiers, const std::string& name);

/// Whether a boolean qualifier is there (not null) and true.
bool isSet(const Qualifier* qualifier);
bool isSet(const std::vector<Qualifier>& qualifiers, const std::string& name);

/// The texts of a qualifier: one for a string, many for a list; empty when absent (null) or no
/// strings.
std::vector<std::string> texts(const Qualifier* qualifier);
std::vector<std::string> texts(const std::vector<Qualifier>& qualifiers, const std::string& name);

/// The text of a string qualifier; empty when absent.
std::string text(const Qualifier* qualifier);
std::string text(const std::vector<Qualifier>& qualifiers, const std::string& name);

}  // namespace cmpihost::mof

#endif
